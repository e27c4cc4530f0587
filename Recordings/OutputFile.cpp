// SPDX-License-Identifier: MIT
#include "Recordings/OutputFile.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

#include "Recordings/OutputPath.h"

namespace kestro {

Result<OutputFile> OutputFile::create(const std::string& path) {
  if (path == kStandardOutputPath) return OutputFile(outputName(path), STDOUT_FILENO, false);
  constexpr mode_t kMode = 0666;  // the person's mask takes away from it
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-vararg): the system's interface
  const int descriptor = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, kMode);
  if (descriptor < 0) {
    return failure(fmt::format("{}: cannot create: {}", path, std::strerror(errno)));
  }
  return OutputFile(path, descriptor, true);
}

OutputFile::OutputFile(std::string name, int descriptor, bool isOwned)
    : _name(std::move(name)), _descriptor(descriptor), _isOwned(isOwned) {}

OutputFile::OutputFile(OutputFile&& other) noexcept
    : _name(std::move(other._name)),
      _descriptor(std::exchange(other._descriptor, -1)),
      _isOwned(other._isOwned),
      _error(std::move(other._error)) {}

OutputFile& OutputFile::operator=(OutputFile&& other) noexcept {
  if (this == &other) return *this;
  close();
  _name = std::move(other._name);
  _descriptor = std::exchange(other._descriptor, -1);
  _isOwned = other._isOwned;
  _error = std::move(other._error);
  return *this;
}

OutputFile::~OutputFile() { close(); }

void OutputFile::close() noexcept {
  if (_descriptor >= 0 && _isOwned) ::close(_descriptor);
}

Result<void> OutputFile::write(ByteView bytes) {
  if (_error) return tl::unexpected(*_error);
  while (!bytes.empty()) {
    const ssize_t size = ::write(_descriptor, bytes.data(), bytes.size());
    if (size >= 0) {
      bytes = bytes.subspan(static_cast<std::size_t>(size));
    } else {  // also when it was interrupted: a program that is to end waits for no reader
      _error = Error{fmt::format("{}: cannot write: {}", _name, std::strerror(errno))};
      return tl::unexpected(*_error);
    }
  }
  return {};
}

}  // namespace kestro
