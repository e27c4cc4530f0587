// SPDX-License-Identifier: MIT
// Where a command writes: standard output or a file for data, standard error for remarks.
#pragma once

#include <cstdio>
#include <memory>
#include <string>
#include <string_view>

#include "Platform/Result.h"

namespace kestro {

/// A buffered output. A failure to write is remembered; what is written after it is dropped.
class Output {
 public:
  [[nodiscard]] static Output standardOutput();
  /// Creates the file or empties an existing one.
  [[nodiscard]] static Result<Output> create(const std::string& path);

  void write(std::string_view text);
  /// Hands everything written so far to the system.
  void flush();
  /// What could not be written, and why; an empty text when nothing failed so far.
  [[nodiscard]] const std::string& failureMessage() const noexcept { return _failure; }
  /// Whether it failed because whoever read the other end has closed it.
  [[nodiscard]] bool readerIsGone() const noexcept { return _readerIsGone; }

 private:
  struct Closer {
    void operator()(std::FILE* file) const noexcept;
  };

  Output(std::string name, std::FILE* file) : _name(std::move(name)), _file(file) {}
  void checkSystemError(bool succeeded);

  std::string _name;
  std::unique_ptr<std::FILE, Closer> _file;
  std::string _failure;
  bool _readerIsGone = false;
};

/// Writes "kestro-cli: MESSAGE" as a line to standard error, with the name of the program that
/// runs; it is dropped when that cannot be written.
void complain(std::string_view message);

}  // namespace kestro
