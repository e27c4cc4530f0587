// SPDX-License-Identifier: MIT
// What a generator throws when its channel sends what it never should.
#pragma once

#include <stdexcept>
#include <string>

namespace kestro {

/// Raised instead of showing data that cannot be what the channel promises. The application lets it
/// end the process; offline commands report the message it came from and go on. `what()` is one
/// line: the message, then the source and line as the channel's diagnostics name them.
class InternalConsistencyFailure : public std::runtime_error {
 public:
  /// `source` and `line` are texts of the diagnostic, not places in today's files.
  InternalConsistencyFailure(const std::string& message, const std::string& source, int line)
      : std::runtime_error(message + " (" + source + ", line " + std::to_string(line) + ")"),
        _message(message),
        _source(source),
        _line(line) {}

  [[nodiscard]] const std::string& message() const noexcept { return _message; }
  [[nodiscard]] const std::string& source() const noexcept { return _source; }
  [[nodiscard]] int line() const noexcept { return _line; }

 private:
  std::string _message;
  std::string _source;
  int _line;
};

}  // namespace kestro
