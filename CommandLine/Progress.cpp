// SPDX-License-Identifier: MIT
#include "CommandLine/Progress.h"

#include <fmt/format.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <utility>

namespace kestro {
namespace {

using Seconds = std::chrono::duration<double>;

constexpr std::chrono::seconds kQuietTime{1};
constexpr std::chrono::milliseconds kInterval{200};
/// Below this nobody can say how long the rest takes.
constexpr double kLeastFraction = 0.001;

/// Leaves the cursor at the line's beginning, so that any other line takes its place.
constexpr const char* kLine = "\r\033[K{}\r";
constexpr const char* kNoLine = "\r\033[K";

std::optional<Progress::Terminal> terminalOf(bool printsResults) {
  if (::isatty(STDERR_FILENO) == 0) return std::nullopt;
  if (printsResults && ::isatty(STDOUT_FILENO) != 0) return std::nullopt;
  return Progress::Terminal{.write = [](std::string_view text) {
    // A line that cannot be shown is none that anybody misses.
    [[maybe_unused]] const auto written = ::write(STDERR_FILENO, text.data(), text.size());
  }};
}

std::string clockText(std::int64_t seconds) {
  const auto minutes = seconds / 60 % 60;
  if (seconds >= 3600) {
    return fmt::format("{}:{:02}:{:02}", seconds / 3600, minutes, seconds % 60);
  }
  return fmt::format("{}:{:02}", minutes, seconds % 60);
}

}  // namespace

std::string progressText(double fraction, Seconds elapsed) {
  const double part = std::clamp(fraction, 0.0, 1.0);
  std::string text = fmt::format("{:.0f} %", std::floor(part * 100));
  if (part < kLeastFraction) return text;
  const double left = elapsed.count() * (1 - part) / part;
  return text + fmt::format(", {} left", clockText(std::llround(std::ceil(left))));
}

Progress::Progress(bool printsResults) : Progress(terminalOf(printsResults)) {}

Progress::Progress(std::optional<Terminal> terminal) : _terminal(std::move(terminal)) {
  if (!_terminal) return;
  _begin = _terminal->now();
  _due = _begin + kQuietTime;
}

Progress::Progress(Progress&& other) noexcept
    : _terminal(std::exchange(other._terminal, std::nullopt)),
      _begin(other._begin),
      _due(other._due),
      _steps(other._steps),
      _isShown(std::exchange(other._isShown, false)) {}

void Progress::look(const std::function<std::optional<double>()>& fraction) {
  const auto now = _terminal->now();
  if (now < _due) return;
  _due = now + kInterval;
  const Seconds elapsed = now - _begin;
  const auto part = fraction();
  const std::string text =
      part ? progressText(*part, elapsed) : clockText(std::llround(std::floor(elapsed.count())));
  _terminal->write(fmt::format(kLine, text));
  _isShown = true;
}

void Progress::erase() {
  if (!std::exchange(_isShown, false)) return;
  _terminal->write(kNoLine);
}

}  // namespace kestro
