// SPDX-License-Identifier: MIT
// What is said when a failure that nothing catches ends the process.
#pragma once

#include <functional>
#include <string_view>

namespace kestro {

/// While it exists, std::terminate calls the handler with one line that names the failure, and
/// aborts. At most one exists at a time.
class LastWords {
 public:
  /// `handler` runs once, in whatever state the process is: it should say the line first, and do no
  /// more after it than save and remove what would be lost or left behind. A failure in it aborts.
  explicit LastWords(std::function<void(std::string_view line)> handler);
  ~LastWords();
  LastWords(const LastWords&) = delete;
  LastWords& operator=(const LastWords&) = delete;
};

}  // namespace kestro
