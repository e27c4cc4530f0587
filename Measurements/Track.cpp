// SPDX-License-Identifier: MIT
#include "Measurements/Track.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace kestro {
namespace {

/// A part of the way from one longitude to another, across the date line where that is shorter.
double longitudeBetween(double from, double to, double part) {
  constexpr double kHalfTurn = 180;
  constexpr double kTurn = 360;
  const double way = std::remainder(to - from, kTurn);
  const double longitude = from + part * way;
  if (longitude > kHalfTurn) return longitude - kTurn;
  return longitude < -kHalfTurn ? longitude + kTurn : longitude;
}

}  // namespace

Track::Track(std::vector<Fix> fixes) : _fixes(std::move(fixes)) {
  std::ranges::stable_sort(_fixes, {}, &Fix::time);
  const auto isSameTime = [](const Fix& one, const Fix& other) { return one.time == other.time; };
  _fixes.erase(std::unique(_fixes.begin(), _fixes.end(), isSameTime), _fixes.end());
}

std::optional<Coordinates> Track::at(Moment time) const {
  const auto next = std::ranges::lower_bound(_fixes, time, {}, &Fix::time);
  if (next == _fixes.end()) return std::nullopt;
  if (next->time == time) return next->position;
  if (next == _fixes.begin()) return std::nullopt;
  const Fix& before = *std::prev(next);
  const auto apart = next->time - before.time;
  if (apart >= kGap) return std::nullopt;
  const double part =
      static_cast<double>((time - before.time).count()) / static_cast<double>(apart.count());
  const Coordinates& from = before.position;
  const Coordinates& to = next->position;
  return Coordinates{.latitude = std::lerp(from.latitude, to.latitude, part),
                     .longitude = longitudeBetween(from.longitude, to.longitude, part)};
}

}  // namespace kestro
