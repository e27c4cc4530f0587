// SPDX-License-Identifier: MIT
// What is said when a failure that nothing catches ends the process.
#pragma once

#include <functional>
#include <string_view>

namespace kestro {

/// While it exists, std::terminate gives the terminal back, writes one line that names the failure
/// to standard error, calls the handler with that line, and aborts. At most one exists at a time.
class LastWords {
 public:
  /// `handler` runs once, in whatever state the process is: it should do no more than log the line
  /// and remove what would be left behind.
  explicit LastWords(std::function<void(std::string_view line)> handler);
  ~LastWords();
  LastWords(const LastWords&) = delete;
  LastWords& operator=(const LastWords&) = delete;
};

}  // namespace kestro
