// SPDX-License-Identifier: MIT
// What a person types while a program works.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "Platform/MainQueue.h"

namespace kestro {

/// Reads lines from the terminal that standard input is, as long as the process is in its
/// foreground; in the background it leaves the terminal to others and is not stopped for it. Does
/// nothing where standard input is no terminal. Main thread only.
class TypedLines {
 public:
  /// `typed` gets each line without its end. The queue outlives this.
  TypedLines(MainQueue& queue, std::function<void(std::string_view line)> typed);

  [[nodiscard]] bool isReading() const noexcept { return _timer != nullptr; }

 private:
  void look();
  void take(std::string_view piece);

  std::function<void(std::string_view line)> _typed;
  std::string _line;  ///< its beginning, as far as it has come
  std::unique_ptr<Timer> _timer;
};

}  // namespace kestro
