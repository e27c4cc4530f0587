// SPDX-License-Identifier: MIT
// Where the phone was, as the comment of a message: "position: 51.88763, -8.460065; 12 km/h".
#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace kestro {

/// Degrees north and east; the speed in km/h where it is known.
struct Position {
  double latitude = 0;
  double longitude = 0;
  std::optional<double> speed = std::nullopt;
  friend bool operator==(const Position&, const Position&) = default;
};

/// The comment of a position whose numbers are these texts; an empty speed is left out.
[[nodiscard]] std::string positionComment(std::string_view latitude, std::string_view longitude,
                                          std::string_view speed);

/// The position that the comment names; absent when it is no such comment, or names no place on
/// earth (degrees beyond ±90 and ±180).
[[nodiscard]] std::optional<Position> positionOfComment(std::string_view comment);

/// The first position among a message's comments.
[[nodiscard]] std::optional<Position> positionAmong(std::span<const std::string> comments);

}  // namespace kestro
