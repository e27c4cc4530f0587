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
  /// Creates the file, or empties an existing one; "-" is standard output, which is not closed.
  [[nodiscard]] static Result<OutputFile> create(const std::string& path);

  OutputFile(OutputFile&& other) noexcept;
  OutputFile& operator=(OutputFile&& other) noexcept;
  ~OutputFile();

  /// What messages call the file.
  [[nodiscard]] const std::string& name() const noexcept { return _name; }

  /// Appends all bytes. When the system refuses them (a full disk), some may have been written, and
  /// every later call yields the same error.
  [[nodiscard]] Result<void> write(ByteView bytes);

 private:
  OutputFile(std::string name, int descriptor, bool isOwned);
  void close() noexcept;

  std::string _name;
  int _descriptor;
  bool _isOwned;
  std::optional<Error> _error;
};

}  // namespace kestro
