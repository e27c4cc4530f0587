// SPDX-License-Identifier: MIT
// A file that is written without a buffer.
#pragma once

#include <optional>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// Where a recording goes. What was written has reached the system when `write` returns.
class OutputFile {
 public:
  /// The path of standard output, which is written to, but not closed.
  static constexpr const char* kStandardOutput = "-";

  /// Creates the file, or empties an existing one.
  [[nodiscard]] static Result<OutputFile> create(const std::string& path);

  OutputFile(OutputFile&& other) noexcept;
  OutputFile& operator=(OutputFile&& other) noexcept;
  ~OutputFile();

  [[nodiscard]] const std::string& path() const noexcept { return _path; }

  /// Appends all bytes. When the system refuses them (a full disk), some may have been written, and
  /// every later call yields the same error.
  [[nodiscard]] Result<void> write(ByteView bytes);

 private:
  OutputFile(std::string path, int descriptor);
  void close() noexcept;

  std::string _path;
  int _descriptor;
  std::optional<Error> _error;
};

}  // namespace kestro
