// SPDX-License-Identifier: MIT
#include "Recordings/RecordedFile.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace kestro {
namespace {

constexpr std::size_t kPiece = std::size_t{128} * 1024;

Error systemError(const std::string& path) {
  return Error{fmt::format("{}: {}", path, std::strerror(errno))};
}

/// The size of what follows `start`; absent for what is no file on a disk.
std::optional<std::uint64_t> sizeOfFile(int descriptor, off_t start) {
  struct stat status = {};
  if (start < 0 || ::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode)) {
    return std::nullopt;
  }
  return static_cast<std::uint64_t>(std::max<off_t>(status.st_size - start, 0));
}

}  // namespace

Result<RecordedFile> RecordedFile::open(const std::string& path) {
  if (path == kStandardInput) return RecordedFile(path, STDIN_FILENO);
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-vararg): the system's interface
  const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) return tl::unexpected(systemError(path));
  return RecordedFile(path, descriptor);
}

RecordedFile::RecordedFile(std::string path, int descriptor)
    : _path(std::move(path)),
      _descriptor(descriptor),
      _start(::lseek(descriptor, 0, SEEK_CUR)),
      _size(sizeOfFile(descriptor, _start)) {}

RecordedFile::RecordedFile(RecordedFile&& other) noexcept
    : _path(std::move(other._path)),
      _descriptor(std::exchange(other._descriptor, -1)),
      _start(other._start),
      _size(other._size),
      _buffer(std::move(other._buffer)),
      _begin(std::exchange(other._begin, 0)),
      _end(std::exchange(other._end, 0)),
      _fetched(other._fetched),
      _hasEnded(other._hasEnded) {}

RecordedFile& RecordedFile::operator=(RecordedFile&& other) noexcept {
  if (this == &other) return *this;
  close();
  _path = std::move(other._path);
  _descriptor = std::exchange(other._descriptor, -1);
  _start = other._start;
  _size = other._size;
  _buffer = std::move(other._buffer);
  _begin = std::exchange(other._begin, 0);
  _end = std::exchange(other._end, 0);
  _fetched = other._fetched;
  _hasEnded = other._hasEnded;
  return *this;
}

RecordedFile::~RecordedFile() { close(); }

void RecordedFile::close() noexcept {
  if (_descriptor >= 0 && _path != kStandardInput) ::close(_descriptor);
}

Result<ByteView> RecordedFile::fillTo(std::size_t count) {
  if (_hasEnded) return buffered();
  std::copy(_buffer.begin() + static_cast<std::ptrdiff_t>(_begin),
            _buffer.begin() + static_cast<std::ptrdiff_t>(_end), _buffer.begin());
  _end -= std::exchange(_begin, 0);
  while (_end < count && !_hasEnded) {
    // A length in a file is no reason to take as much memory: the bytes must be there.
    if (_end == _buffer.size()) _buffer.resize(std::max(2 * _end, kPiece));
    const auto fetched = fetch(std::span(_buffer).subspan(_end));
    if (!fetched) return tl::unexpected(fetched.error());
    _end += *fetched;
  }
  return buffered();
}

Result<std::size_t> RecordedFile::fetch(std::span<std::uint8_t> target) {
  // One that is interrupted fails, too: a program that is to end waits for no writer.
  const ssize_t size = ::read(_descriptor, target.data(), target.size());
  if (size < 0) return tl::unexpected(systemError(_path));
  _hasEnded = size == 0;
  _fetched += static_cast<std::uint64_t>(size);
  return static_cast<std::size_t>(size);
}

Result<std::uint64_t> RecordedFile::passOver(std::uint64_t count) {
  std::uint64_t passed = 0;
  while (passed < count) {
    const auto bytes = ahead(1);
    if (!bytes) return tl::unexpected(bytes.error());
    if (bytes->empty()) break;
    const auto step = std::min<std::uint64_t>(count - passed, bytes->size());
    take(step);
    passed += step;
  }
  return passed;
}

Result<void> RecordedFile::rewind() {
  if (_fetched != _end) {
    if (!isOnDisk()) return failure(fmt::format("{}: cannot be read twice", _path));
    if (::lseek(_descriptor, _start, SEEK_SET) < 0) return tl::unexpected(systemError(_path));
    _fetched = 0;
    _end = 0;
    _hasEnded = false;
  }
  _begin = 0;
  return {};
}

Result<std::size_t> RecordedFile::read(std::span<std::uint8_t> target) {
  if (_begin == _end) return _hasEnded ? 0 : fetch(target);
  const std::size_t size = std::min(target.size(), _end - _begin);
  std::copy_n(buffered().begin(), size, target.begin());
  take(size);
  return size;
}

std::optional<double> RecordedFile::fractionRead() const noexcept {
  if (!_size) return std::nullopt;
  if (position() >= *_size) return 1;
  return static_cast<double>(position()) / static_cast<double>(*_size);
}

}  // namespace kestro
