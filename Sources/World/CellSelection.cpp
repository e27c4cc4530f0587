// SPDX-License-Identifier: MIT
#include "Sources/World/CellSelection.h"

#include <algorithm>

namespace kestro {

const CellLevel& levelOfCell(std::span<const CellLevel> levels, std::size_t cell) {
  return *std::ranges::find(levels, cell, &CellLevel::cell);
}

bool CellSelection::update(std::span<const CellLevel> levels, std::chrono::milliseconds elapsed) {
  const CellLevel& strongest = levels.front();
  if (!_serving) {
    _serving = strongest.cell;
    _candidate.reset();
    return true;
  }
  const bool isStronger = strongest.level > levelOfCell(levels, *_serving).level + _hysteresis;
  if (!isStronger) {
    _candidate.reset();
    return false;
  }
  if (_candidate != strongest.cell) {
    _candidate = strongest.cell;
    _stronger = {};
    return false;
  }
  _stronger += elapsed;
  if (_stronger < _timeToTrigger) return false;
  _serving = strongest.cell;
  _candidate.reset();
  return true;
}

void SoftHandoverSet::update(std::span<const CellLevel> levels) {
  const double strongest = levels.front().level;
  std::vector<std::size_t> cells;
  for (const auto& [cell, level, distance] : levels) {
    if (cells.size() == kMaximumSize) break;
    if (level > strongest - (contains(cell) ? kLeaveRange : kJoinRange)) cells.push_back(cell);
  }
  _cells = std::move(cells);
}

bool SoftHandoverSet::contains(std::size_t cell) const {
  return std::ranges::find(_cells, cell) != _cells.end();
}

}  // namespace kestro
