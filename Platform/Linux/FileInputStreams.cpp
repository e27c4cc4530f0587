// SPDX-License-Identifier: MIT
#include "Platform/Linux/FileInputStreams.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <QSocketNotifier>
#include <array>
#include <string>
#include <utility>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/SystemError.h"

namespace kestro {
namespace {

constexpr std::size_t kPieceSize = std::size_t{64} * 1024;

class FileInputStream final : public InputStream {
 public:
  using Received = std::function<void(ByteView)>;
  using Ended = std::function<void(std::string_view)>;

  FileInputStream(FileDescriptor file, Received received, Ended ended)
      : _file(std::move(file)),
        _received(std::make_shared<Received>(std::move(received))),
        _ended(std::move(ended)),
        _notifier(_file.get(), QSocketNotifier::Read) {
    QObject::connect(&_notifier, &QSocketNotifier::activated, &_notifier, [this] { readPiece(); });
  }

 private:
  // The handlers may destroy this stream, so nothing of it is touched after they were called; an
  // exception in one ends the process instead of unwinding through Qt.
  void readPiece() noexcept {
    std::array<std::uint8_t, kPieceSize> piece;  // NOLINT(*-member-init): read fills it
    const ssize_t count = ::read(_file.get(), piece.data(), piece.size());
    if (count > 0) {
      const auto received = _received;
      (*received)(ByteView(piece.data(), static_cast<std::size_t>(count)));
    } else if (count == 0) {
      end("");
    } else if (errno != EAGAIN && errno != EINTR) {
      end(std::generic_category().message(errno));
    }
  }

  void end(const std::string& reason) {
    _notifier.setEnabled(false);
    const Ended ended = std::exchange(_ended, nullptr);
    ended(reason);
  }

  FileDescriptor _file;
  std::shared_ptr<const Received> _received;
  Ended _ended;
  QSocketNotifier _notifier;
};

/// Standard input is shared with other processes, so it is left in its mode and only read when the
/// system says that it can be; of the others no read blocks, nor does opening a pipe.
FileDescriptor openForReading(const std::string& path) {
  if (path == "-") return FileDescriptor(::fcntl(STDIN_FILENO, F_DUPFD_CLOEXEC, 0));
  return FileDescriptor(::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
}

}  // namespace

Result<std::unique_ptr<InputStream>> FileInputStreams::open(
    std::string_view path, std::function<void(ByteView)> received,
    std::function<void(std::string_view reason)> ended) {
  const std::string name(path);
  FileDescriptor file = openForReading(name);
  struct stat status = {};
  if (!file.isOpen() || ::fstat(file.get(), &status) != 0) {
    return systemFailure("cannot open", name);
  }
  if (S_ISDIR(status.st_mode)) {
    errno = EISDIR;
    return systemFailure("cannot open", name);
  }
  return std::make_unique<FileInputStream>(std::move(file), std::move(received), std::move(ended));
}

}  // namespace kestro
