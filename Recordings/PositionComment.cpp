// SPDX-License-Identifier: MIT
#include "Recordings/PositionComment.h"

#include <fmt/format.h>

#include <charconv>
#include <cmath>

namespace kestro {
namespace {

constexpr std::string_view kMark = "position: ";
constexpr std::string_view kBetweenDegrees = ", ";
constexpr std::string_view kBeforeSpeed = "; ";
constexpr std::string_view kSpeedUnit = " km/h";

/// Takes a finite number from the front of the text; absent, and the text as it was, when there is
/// none.
std::optional<double> takeNumber(std::string_view& text) {
  double number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || !std::isfinite(number)) return std::nullopt;
  text.remove_prefix(static_cast<std::size_t>(end - text.data()));
  return number;
}

bool take(std::string_view& text, std::string_view expected) {
  if (!text.starts_with(expected)) return false;
  text.remove_prefix(expected.size());
  return true;
}

}  // namespace

std::string positionComment(std::string_view latitude, std::string_view longitude,
                            std::string_view speed) {
  auto comment = fmt::format("{}{}{}{}", kMark, latitude, kBetweenDegrees, longitude);
  if (!speed.empty()) comment += fmt::format("{}{}{}", kBeforeSpeed, speed, kSpeedUnit);
  return comment;
}

std::optional<Position> positionOfComment(std::string_view comment) {
  if (!take(comment, kMark)) return std::nullopt;
  const auto latitude = takeNumber(comment);
  if (!latitude || !take(comment, kBetweenDegrees)) return std::nullopt;
  const auto longitude = takeNumber(comment);
  if (!longitude || std::abs(*latitude) > 90 || std::abs(*longitude) > 180) return std::nullopt;
  Position position{.latitude = *latitude, .longitude = *longitude};
  if (take(comment, kBeforeSpeed)) {
    position.speed = takeNumber(comment);
    if (!position.speed || !take(comment, kSpeedUnit)) return std::nullopt;
  }
  if (!comment.empty()) return std::nullopt;
  return position;
}

std::optional<Position> positionAmong(std::span<const std::string> comments) {
  for (const std::string& comment : comments) {
    if (const auto position = positionOfComment(comment)) return position;
  }
  return std::nullopt;
}

}  // namespace kestro
