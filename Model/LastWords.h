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
  /// `handler` runs once, in whatever state the process is. It should say the line first; after
  /// that it may save what would be lost and remove what would be left behind, and nothing more. A
  /// failure in it aborts.
  explicit LastWords(std::function<void(std::string_view line)> handler);
  ~LastWords();
  LastWords(const LastWords&) = delete;
  LastWords& operator=(const LastWords&) = delete;
};

}  // namespace kestro
