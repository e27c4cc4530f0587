// SPDX-License-Identifier: MIT
// A recorded file as a standard stream, for what reads text.
#pragma once

#include <istream>
#include <stdexcept>
#include <streambuf>
#include <utility>
#include <vector>

#include "Recordings/RecordedFile.h"

namespace kestro {

/// Reads a file that is unread still; `bad()` when the system could read no further.
class RecordedFileStream : public std::istream {
 public:
  explicit RecordedFileStream(RecordedFile file) : std::istream(nullptr), _buffer(std::move(file)) {
    rdbuf(&_buffer);
  }

  [[nodiscard]] const RecordedFile& file() const noexcept { return _buffer.file(); }

 private:
  class Buffer : public std::streambuf {
   public:
    explicit Buffer(RecordedFile file) : _file(std::move(file)) {}
    [[nodiscard]] const RecordedFile& file() const noexcept { return _file; }

   protected:
    int_type underflow() override {
      const auto size = _file.read(_piece);
      // How a stream learns that its buffer has failed.
      if (!size) throw std::runtime_error(size.error().message);
      if (*size == 0) return traits_type::eof();
      auto* begin = reinterpret_cast<char*>(_piece.data());
      setg(begin, begin, begin + *size);
      return traits_type::to_int_type(*gptr());
    }

   private:
    RecordedFile _file;
    Bytes _piece = Bytes(std::size_t{64} * 1024);
  };

  Buffer _buffer;
};

}  // namespace kestro
