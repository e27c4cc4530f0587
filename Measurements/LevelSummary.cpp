// SPDX-License-Identifier: MIT
#include "Measurements/LevelSummary.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace kestro {
namespace {

constexpr double kFirstStep = 0.25;

}  // namespace

double LevelSummary::binOf(double value) const noexcept {
  // Steps double, so what shared a bin shares the next one, too.
  return _step == 0 ? value : std::floor(value / _step) * _step;
}

void LevelSummary::add(double value) {
  _least = _count == 0 ? value : std::min(_least, value);
  _greatest = _count == 0 ? value : std::max(_greatest, value);
  _last = value;
  ++_count;
  count(value);
}

void LevelSummary::count(double value) {
  const double bin = binOf(value);
  auto place = std::ranges::lower_bound(_bins, bin, {}, &Bin::value);
  if (place != _bins.end() && place->value == bin) {
    ++place->count;
    return;
  }
  _bins.insert(place, {bin, 1});
  while (_bins.size() > kMaximumDistinct) coarsen();
}

void LevelSummary::coarsen() {
  _step = _step == 0 ? kFirstStep : 2 * _step;
  std::vector<Bin> merged;
  for (const Bin& bin : std::exchange(_bins, {})) {
    const double value = binOf(bin.value);
    if (!merged.empty() && merged.back().value == value) {
      merged.back().count += bin.count;
    } else {
      merged.push_back({value, bin.count});
    }
  }
  _bins = std::move(merged);
}

double LevelSummary::median() const noexcept {
  std::uint64_t left = (_count + 1) / 2;
  for (const Bin& bin : _bins) {
    if (bin.count >= left) return std::clamp(bin.value + _step / 2, _least, _greatest);
    left -= bin.count;
  }
  return 0;
}

}  // namespace kestro
