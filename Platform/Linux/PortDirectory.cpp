// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortDirectory.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/socket.h>

#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <system_error>
#include <thread>
#include <utility>

#include "Platform/PortName.h"

namespace kestro {
namespace {

/// No port can have this name.
constexpr const char* kLockFile = "lock~";
constexpr std::chrono::milliseconds kLockTimeout{1000};
constexpr std::chrono::milliseconds kLockRetry{5};
constexpr int kBacklog = 128;

std::string reason(int error) { return std::generic_category().message(error); }

std::string environment(const char* name) {
  const char* value = std::getenv(name);
  return value == nullptr ? "" : value;
}

FileDescriptor newSocket() {
  return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
}

bool connectTo(int socket, const sockaddr_un& address) {
  return ::connect(socket, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) == 0;
}

bool bindTo(int socket, const sockaddr_un& address) {
  return ::bind(socket, reinterpret_cast<const sockaddr*>(&address), sizeof(address)) == 0;
}

/// The file `name` itself, not what a link leads to.
bool statIn(const FileDescriptor& directory, const std::string& name, struct stat& file) {
  return ::fstatat(directory.get(), name.c_str(), &file, AT_SYMLINK_NOFOLLOW) == 0;
}

Result<void> checkIsPrivate(int descriptor) {
  struct stat status {};
  if (::fstat(descriptor, &status) != 0) return failure(reason(errno));
  if (status.st_uid != ::geteuid()) {
    return failure(fmt::format("it belongs to user {}, not to {}", status.st_uid, ::geteuid()));
  }
  if ((status.st_mode & (S_IRWXG | S_IRWXO)) != 0) {
    return failure(fmt::format("its mode is {:04o}, group and others must have no access",
                               status.st_mode & 07777U));
  }
  return {};
}

tl::unexpected<Error> unusable(const std::string& path, const std::string& why) {
  return failure(fmt::format("port directory {}: {}", path, why));
}

}  // namespace

std::string portDirectoryPath(const std::optional<std::string>& given) {
  std::string path = given.value_or("");
  if (path.empty()) path = environment("KESTRO_PORT_DIR");
  if (const std::string runtime = environment("XDG_RUNTIME_DIR"); path.empty() && !runtime.empty())
    path = runtime + "/kestro";
  if (path.empty()) path = fmt::format("/tmp/kestro-{}", ::geteuid());
  std::error_code error;
  const std::filesystem::path absolute = std::filesystem::absolute(path, error);
  return error ? path : absolute.string();
}

// --- PortListener --------------------------------------------------------------------------------

PortListener::~PortListener() {
  // The file goes while the socket still listens, so that the name is never taken over in between.
  if (_socket.isOpen() && ownsName()) ::unlinkat(_directory.get(), _name.c_str(), 0);
}

bool PortListener::ownsName() const {
  struct stat file {};
  return statIn(_directory, _name, file) && file.st_dev == _device && file.st_ino == _inode;
}

// --- PortDirectory -------------------------------------------------------------------------------

Result<PortDirectory> PortDirectory::openOrMake(const std::string& path) {
  if (::mkdir(path.c_str(), S_IRWXU) != 0 && errno != EEXIST) return unusable(path, reason(errno));
  auto directory = openExisting(path);
  if (!directory) return tl::unexpected(std::move(directory.error()));
  if (!*directory) return unusable(path, reason(ENOENT));
  return std::move(**directory);
}

Result<std::optional<PortDirectory>> PortDirectory::openExisting(const std::string& path) {
  FileDescriptor descriptor(::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
  if (!descriptor.isOpen()) {
    const int error = errno;
    if (error == ENOENT) return std::nullopt;
    struct stat file {};
    const bool isLink = ::lstat(path.c_str(), &file) == 0 && S_ISLNK(file.st_mode);
    return unusable(path, isLink ? "it is a symbolic link" : reason(error));
  }
  if (const auto check = checkIsPrivate(descriptor.get()); !check) {
    return unusable(path, check.error().message);
  }
  return PortDirectory(std::move(descriptor), path);
}

sockaddr_un PortDirectory::address(const std::string& name) const {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  std::string path = _path + "/" + name;
  // Too long for an address, the directory still has a short way to it: its own descriptor.
  if (path.size() >= sizeof(address.sun_path)) {
    path = fmt::format("/proc/self/fd/{}/{}", _descriptor.get(), name);
  }
  std::memcpy(address.sun_path, path.c_str(), path.size() + 1);
  return address;
}

Result<FileDescriptor> PortDirectory::lock() const {
  FileDescriptor file(::openat(_descriptor.get(), kLockFile,
                               O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, S_IRUSR | S_IWUSR));
  if (!file.isOpen()) return failure(fmt::format("cannot open {}: {}", kLockFile, reason(errno)));
  const auto deadline = std::chrono::steady_clock::now() + kLockTimeout;
  while (::flock(file.get(), LOCK_EX | LOCK_NB) != 0) {
    if (errno != EWOULDBLOCK && errno != EINTR) return failure(reason(errno));
    if (std::chrono::steady_clock::now() >= deadline) {
      return failure(fmt::format("somebody holds {}", kLockFile));
    }
    std::this_thread::sleep_for(kLockRetry);
  }
  return file;
}

Result<void> PortDirectory::removeDeadOwner(const std::string& name) const {
  struct stat file {};
  if (!statIn(_descriptor, name, file)) {
    if (errno == ENOENT) return {};
    return failure(reason(errno));
  }
  if (!S_ISSOCK(file.st_mode)) return failure("a file of that name is in the way");
  const FileDescriptor probe = newSocket();
  if (!probe.isOpen()) return failure(reason(errno));
  if (connectTo(probe.get(), address(name)) || errno != ECONNREFUSED) {
    return failure("the name is in use");
  }
  if (::unlinkat(_descriptor.get(), name.c_str(), 0) != 0) return failure(reason(errno));
  return {};
}

Result<PortListener> PortDirectory::listen(const std::string& name) const {
  const auto held = lock();
  if (!held) return failure(held.error().message);
  if (const auto free = removeDeadOwner(name); !free) return failure(free.error().message);
  FileDescriptor socket = newSocket();
  FileDescriptor directory(::fcntl(_descriptor.get(), F_DUPFD_CLOEXEC, 0));
  struct stat file {};
  // The socket's own mode before it has a name is the mode of the file that it gets.
  if (!socket.isOpen() || !directory.isOpen() || ::fchmod(socket.get(), S_IRUSR | S_IWUSR) != 0 ||
      !bindTo(socket.get(), address(name)) || ::listen(socket.get(), kBacklog) != 0 ||
      !statIn(directory, name, file)) {
    return failure(reason(errno));
  }
  return PortListener(std::move(socket), std::move(directory), name, file);
}

void PortDirectory::removeDeadOwners() const {
  const auto held = lock();
  if (!held) return;
  std::error_code error;
  for (std::filesystem::directory_iterator entry(_path, error), end; !error && entry != end;
       entry.increment(error)) {
    const std::string name = entry->path().filename();
    if (isPortName(name)) static_cast<void>(removeDeadOwner(name));
  }
}

Result<std::optional<FileDescriptor>> PortDirectory::connect(const std::string& name) const {
  // A link put there after this look leads no further than its owner, whom the peer's credentials
  // name.
  struct stat file {};
  if (statIn(_descriptor, name, file) && S_ISLNK(file.st_mode)) {
    return failure("it is a symbolic link");
  }
  FileDescriptor socket = newSocket();
  if (!socket.isOpen()) return failure(reason(errno));
  if (connectTo(socket.get(), address(name))) return socket;
  if (errno == ENOENT || errno == ECONNREFUSED) return std::nullopt;
  return failure(errno == EAGAIN ? "its owner takes no connections" : reason(errno));
}

}  // namespace kestro
