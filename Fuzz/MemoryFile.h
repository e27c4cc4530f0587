// SPDX-License-Identifier: MIT
// An input as a file that the code under test opens by its path.
#pragma once

#include <sys/mman.h>
#include <unistd.h>

#include <string>

#include "Platform/Bytes.h"

namespace kestro::fuzz {

class MemoryFile {
 public:
  explicit MemoryFile(ByteView contents) : _file(::memfd_create("input", MFD_CLOEXEC)) {
    while (!contents.empty()) {
      const auto count = ::write(_file, contents.data(), contents.size());
      if (count <= 0) break;
      contents = contents.subspan(static_cast<std::size_t>(count));
    }
  }
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;
  ~MemoryFile() { ::close(_file); }

  [[nodiscard]] std::string path() const { return "/proc/self/fd/" + std::to_string(_file); }

 private:
  int _file;
};

}  // namespace kestro::fuzz
