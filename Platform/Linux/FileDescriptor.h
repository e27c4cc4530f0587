// SPDX-License-Identifier: MIT
// An owned file descriptor.
#pragma once

#include <unistd.h>

#include <utility>

namespace kestro {

/// Closes the descriptor that it holds, if any, when it is destroyed or given another.
class FileDescriptor {
 public:
  FileDescriptor() noexcept = default;
  /// Takes `descriptor` over; a negative one means none.
  explicit FileDescriptor(int descriptor) noexcept : _descriptor(descriptor) {}
  FileDescriptor(FileDescriptor&& other) noexcept : _descriptor(other.release()) {}
  FileDescriptor& operator=(FileDescriptor&& other) noexcept {
    reset(other.release());
    return *this;
  }
  ~FileDescriptor() { reset(); }

  [[nodiscard]] int get() const noexcept { return _descriptor; }
  [[nodiscard]] bool isOpen() const noexcept { return _descriptor >= 0; }
  /// Gives the descriptor away, unclosed.
  [[nodiscard]] int release() noexcept { return std::exchange(_descriptor, -1); }
  void reset(int descriptor = -1) noexcept {
    if (_descriptor >= 0) ::close(_descriptor);
    _descriptor = descriptor;
  }

 private:
  int _descriptor = -1;
};

}  // namespace kestro
