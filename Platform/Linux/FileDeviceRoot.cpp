// SPDX-License-Identifier: MIT
#include "Platform/Linux/FileDeviceRoot.h"

#include <fcntl.h>
#include <fmt/format.h>

#include <array>
#include <cstdlib>
#include <optional>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/SystemError.h"
#include "Platform/Linux/XdgDirectories.h"

namespace kestro {
namespace {

/// What a fresh root holds: where snapshots are saved, and what makes the save button appear.
constexpr std::array kFirstFolders = {
    "/var/mobile/Library/Logs/CrashReporter",
    "/NorrowInternal/Library/PreferenceBundles/Carrier Settings.bundle",
};

std::optional<std::filesystem::path> chosenRoot() {
  const char* chosen = std::getenv("KESTRO_DEVICE_ROOT");
  if (chosen == nullptr || chosen[0] == '\0') return std::nullopt;
  return chosen;
}

std::filesystem::path defaultRoot() { return xdgDataHome() / "kestro" / "device"; }

/// Writes all of `contents`; false, with errno, when the system takes no more.
bool writeAll(int descriptor, ByteView contents) {
  while (!contents.empty()) {
    const ssize_t written = ::write(descriptor, contents.data(), contents.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    contents = contents.subspan(static_cast<std::size_t>(written));
  }
  return true;
}

}  // namespace

std::filesystem::path FileDeviceRoot::pathFromEnvironment() {
  return chosenRoot().value_or(defaultRoot());
}

std::filesystem::path FileDeviceRoot::pathOf(std::string_view devicePath) const {
  return _root / std::filesystem::path(devicePath).relative_path();
}

bool FileDeviceRoot::exists(std::string_view devicePath) const {
  std::error_code error;
  return std::filesystem::exists(pathOf(devicePath), error);
}

Result<void> FileDeviceRoot::write(std::string_view devicePath, ByteView contents) {
  const std::filesystem::path path = pathOf(devicePath);
  const auto failed = [&path] { return systemFailure("cannot write", path.native()); };
  constexpr mode_t kMode = 0644;
  FileDescriptor file(::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, kMode));
  if (!file.isOpen() || !writeAll(file.get(), contents)) return failed();
  // Some file systems tell only now that the disk is full.
  if (::close(file.release()) != 0) return failed();
  return {};
}

Result<void> FileDeviceRoot::createDefault() {
  std::error_code error;
  if (chosenRoot() || std::filesystem::exists(defaultRoot(), error)) return {};
  const FileDeviceRoot root(defaultRoot());
  for (const char* folder : kFirstFolders) {
    const std::filesystem::path path = root.pathOf(folder);
    std::filesystem::create_directories(path, error);
    if (error) return failure(fmt::format("cannot make {}: {}", path.native(), error.message()));
  }
  return {};
}

}  // namespace kestro
