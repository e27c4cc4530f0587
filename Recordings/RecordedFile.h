// SPDX-License-Identifier: MIT
// The bytes of a recorded file or of standard input.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// A file that is read once from its beginning to its end, in large pieces. Whoever reads it can
/// look ahead, and so tell what it is before reading it; a pipe will do. Reading waits for a pipe.
/// Every error begins with the path.
class RecordedFile {
 public:
  /// The path of standard input, which is read, but not closed.
  static constexpr const char* kStandardInput = "-";

  /// Opens the file for reading.
  [[nodiscard]] static Result<RecordedFile> open(const std::string& path);

  RecordedFile(RecordedFile&& other) noexcept;
  RecordedFile& operator=(RecordedFile&& other) noexcept;
  ~RecordedFile();

  /// What messages call the file: the path that it was opened with.
  [[nodiscard]] const std::string& path() const noexcept { return _path; }

  /// The next `count` bytes or more, which stay unread; fewer where the file ends before. Valid
  /// until the next call of any operation that reads. Memory for `count` bytes is taken, but no
  /// more than twice what the file has.
  [[nodiscard]] Result<ByteView> ahead(std::size_t count) {
    if (_end - _begin >= count) [[likely]]
      return buffered();
    return fillTo(count);
  }

  /// Reads over bytes that `ahead` has yielded; `count` is no more than these.
  void take(std::size_t count) noexcept { _begin += count; }

  /// Reads over `count` bytes; how many there were, which are fewer at the end of the file.
  [[nodiscard]] Result<std::uint64_t> passOver(std::uint64_t count);

  /// Copies the next bytes to `target`, at least one unless the file has ended; how many.
  [[nodiscard]] Result<std::size_t> read(std::span<std::uint8_t> target);

  /// Goes back to where the file was opened. That is possible as long as everything read is still
  /// in memory, as it is when nothing was asked for but bytes ahead, and with a file on a disk.
  [[nodiscard]] Result<void> rewind();

  /// Whether `rewind` is possible however much is read.
  [[nodiscard]] bool isOnDisk() const noexcept { return _size.has_value(); }

  /// How many bytes have been read: the offset of the next one.
  [[nodiscard]] std::uint64_t position() const noexcept { return _fetched - (_end - _begin); }

  /// How much of the file has been read, 0 to 1; absent for what has no size, such as a pipe.
  [[nodiscard]] std::optional<double> fractionRead() const noexcept;

 private:
  RecordedFile(std::string path, int descriptor);

  [[nodiscard]] ByteView buffered() const noexcept {
    return {_buffer.data() + _begin, _end - _begin};
  }
  [[nodiscard]] Result<ByteView> fillTo(std::size_t count);
  [[nodiscard]] Result<std::size_t> fetch(std::span<std::uint8_t> target);
  void close() noexcept;

  std::string _path;
  int _descriptor;
  std::int64_t _start = 0;             ///< where the file was opened, if it is on a disk
  std::optional<std::uint64_t> _size;  ///< likewise, of what follows
  Bytes _buffer;
  std::size_t _begin = 0;  ///< of what is buffered and unread
  std::size_t _end = 0;
  std::uint64_t _fetched = 0;  ///< from the system so far
  bool _hasEnded = false;
};

}  // namespace kestro
