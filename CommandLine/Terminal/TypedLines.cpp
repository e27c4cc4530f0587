// SPDX-License-Identifier: MIT
#include "CommandLine/Terminal/TypedLines.h"

#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <csignal>
#include <utility>

namespace kestro {
namespace {

// A notifier would wake the process for lines that are typed for another one in the foreground.
constexpr std::chrono::milliseconds kLookInterval{200};
constexpr std::size_t kPieceSize = 4096;
constexpr int kMostPieces = 16;  ///< at one look
constexpr std::size_t kLongestLine = std::size_t{64} * 1024;

bool isInForeground() { return ::tcgetpgrp(STDIN_FILENO) == ::getpgrp(); }

bool hasInput() {
  pollfd input = {.fd = STDIN_FILENO, .events = POLLIN, .revents = 0};
  return ::poll(&input, 1, 0) == 1;
}

}  // namespace

TypedLines::TypedLines(MainQueue& queue, std::function<void(std::string_view line)> typed)
    : _typed(std::move(typed)) {
  if (::isatty(STDIN_FILENO) != 1) return;
  // Who is put into the background between the look and the read gets an error, and goes on.
  std::signal(SIGTTIN, SIG_IGN);
  _timer = queue.scheduleRepeating(kLookInterval, [this] { look(); });
}

void TypedLines::look() {
  for (int i = 0; i < kMostPieces && isInForeground() && hasInput(); ++i) {
    std::array<char, kPieceSize> piece;  // NOLINT(*-member-init): read fills it
    const ssize_t size = ::read(STDIN_FILENO, piece.data(), piece.size());
    if (size <= 0) return;  // also the end of input that a key makes; there may be more later
    take({piece.data(), static_cast<std::size_t>(size)});
  }
}

void TypedLines::take(std::string_view piece) {
  while (!piece.empty()) {
    const std::size_t end = std::min(piece.find('\n'), piece.size());
    _line.append(piece.substr(0, std::min(end, kLongestLine - _line.size())));
    if (end == piece.size()) return;
    piece.remove_prefix(end + 1);
    _typed(std::exchange(_line, {}));
  }
}

}  // namespace kestro
