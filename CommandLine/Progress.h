// SPDX-License-Identifier: MIT
// How far a command has come, for who waits at a terminal.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace kestro {

/// "42 %, 1:05 left": what is said of a part from 0 to 1 after so long.
[[nodiscard]] std::string progressText(double fraction, std::chrono::duration<double> elapsed);

/// A line on standard error that comes when a command takes longer than a second, and goes when it
/// ends. There is none where standard error is no terminal.
class Progress {
 public:
  using Clock = std::chrono::steady_clock;

  /// What a terminal's line is written with; a test's own.
  struct Terminal {
    std::function<void(std::string_view)> write;
    std::function<Clock::time_point()> now = &Clock::now;
  };

  /// `printsResults` says that results come on standard output while the command runs: where this
  /// is a terminal, too, they say enough.
  explicit Progress(bool printsResults);
  /// Shows it there; without a terminal nowhere.
  explicit Progress(std::optional<Terminal> terminal);
  Progress(Progress&& other) noexcept;
  Progress& operator=(Progress&&) = delete;
  ~Progress() { erase(); }

  /// Says that a message more has been read. `fraction` is asked seldom.
  template <class Fraction>
  void step(const Fraction& fraction) {
    if (_terminal && ++_steps % kStepsALook == 0) look(fraction);
  }

  /// Takes the line away, for another line that is to be read.
  void erase();

 private:
  /// Asking for the time costs more than reading a message.
  static constexpr std::uint64_t kStepsALook = 64;

  void look(const std::function<std::optional<double>()>& fraction);

  std::optional<Terminal> _terminal;
  Clock::time_point _begin;
  Clock::time_point _due;
  std::uint64_t _steps = 0;
  bool _isShown = false;
};

}  // namespace kestro
