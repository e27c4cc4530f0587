// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/NeighbourMeasurer.h"

#include <algorithm>

#include "LogGenerator/GsmUmts/Cells.h"

namespace kestro {

void NeighbourMeasurer::note(const PacketReading& reading, PacketView packet) {
  for (const ListReading& list : reading.lists) {
    if (list.use != RowsUse::Noted) continue;
    _cells.clear();
    forEachRecord(list.table, packet, [&](std::size_t, const RecordPosition& position) {
      _cells.push_back({.arfcn = readNumber(GSMBSICList::kARFCN, packet, position),
                        .bsic = readNumber(GSMBSICList::kBSIC, packet, position)});
    });
  }
}

std::optional<std::int64_t> NeighbourMeasurer::supply(const Field& /*field*/, PacketView packet,
                                                      const RecordPosition& position) const {
  const std::int64_t arfcn = readNumber(GSMMeasurements::kNeighbourARFCN, packet, position);
  // Of several entries for one frequency the last counts.
  const auto known = std::find_if(_cells.rbegin(), _cells.rend(),
                                  [arfcn](const NotedCell& cell) { return cell.arfcn == arfcn; });
  if (known == _cells.rend()) return std::nullopt;
  return known->bsic;
}

}  // namespace kestro
