// SPDX-License-Identifier: MIT
// The system log, as the program sees it.
#pragma once

#include <fmt/format.h>

#include <iterator>
#include <string>
#include <string_view>
#include <utility>

namespace kestro {

/// Priorities with syslog's numbers; the smaller, the graver.
enum class LogPriority : int { Error = 3, Warning = 4, Notice = 5, Info = 6, Debug = 7 };

/// A sink for diagnostic lines. Lines are written whole: leading blanks, asterisks and trailing
/// newlines reach the sink as given. Main thread only.
class SystemLog {
 public:
  virtual ~SystemLog() = default;
  SystemLog(const SystemLog&) = delete;
  SystemLog& operator=(const SystemLog&) = delete;

  /// The least grave priority that is still written; greater numbers are dropped unformatted.
  [[nodiscard]] LogPriority threshold() const noexcept { return _threshold; }
  void setThreshold(LogPriority threshold) noexcept { _threshold = threshold; }

  /// Whether a line of this priority would be written. Ask before composing a costly line.
  [[nodiscard]] bool accepts(LogPriority priority) const noexcept { return priority <= _threshold; }

  /// Writes a ready line.
  void write(LogPriority priority, std::string_view line) {
    if (accepts(priority)) writeLine(priority, line);
  }

  /// Formats (fmt syntax) and writes a line; formats nothing when the priority is not accepted.
  template <class... Arguments>
  void log(LogPriority priority, fmt::format_string<Arguments...> format,
           Arguments&&... arguments) {
    if (!accepts(priority)) return;
    fmt::memory_buffer line;
    fmt::format_to(std::back_inserter(line), format, std::forward<Arguments>(arguments)...);
    writeLine(priority, {line.data(), line.size()});
  }

 protected:
  explicit SystemLog(LogPriority threshold) noexcept : _threshold(threshold) {}

  /// Takes one accepted line. Must not throw and must not block for long.
  virtual void writeLine(LogPriority priority, std::string_view line) = 0;

 private:
  LogPriority _threshold;
};

/// An object's address as C's printf writes it on this platform: "0x…", or "(nil)" for null.
[[nodiscard]] std::string addressText(const void* object);

}  // namespace kestro
