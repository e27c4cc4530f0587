// SPDX-License-Identifier: MIT
// The column that content stands in: as wide as the window, but no wider than a line that the eye
// can follow easily.
#pragma once

#include <algorithm>

namespace kestro {

inline constexpr int kMaximumColumnWidth = 760;

struct Column {
  int left;
  int width;
};

/// The column in the middle of a window of this width, in device-independent pixels.
[[nodiscard]] constexpr Column columnIn(int width) noexcept {
  const int columnWidth = std::min(width, kMaximumColumnWidth);
  return {(width - columnWidth) / 2, columnWidth};
}

}  // namespace kestro
