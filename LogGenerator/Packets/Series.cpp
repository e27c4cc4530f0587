// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Series.h"

#include <fmt/format.h>

#include <utility>

namespace kestro {
namespace {

/// All that tells one group from another; no name holds a NUL.
std::string identityOf(const SeriesGroup& group) {
  return fmt::format("{}{}{}{}{}{}{}{}{}", group.technology, '\0', group.section, '\0', group.key,
                     '\0', group.unit, '\0', static_cast<int>(group.kind));
}

/// The same text may be of another kind of cell.
std::string identityOf(const Item& item) {
  std::string identity = item.text;
  for (const ItemPart& part : item.parts) identity.append(1, '\0').append(part.key);
  return identity;
}

}  // namespace

const SeriesGroup* SeriesTable::group(SeriesGroup wanted) {
  if (wanted.section.size() > kLongestName || wanted.key.size() > kLongestName) return nullptr;
  std::string identity = identityOf(wanted);
  const auto known = _groups.find(identity);
  if (known != _groups.end()) return &known->second;
  if (_groups.size() == kMaximumGroups) return nullptr;
  return &_groups.emplace(std::move(identity), std::move(wanted)).first->second;
}

const Item* SeriesTable::item(Item wanted) {
  if (wanted.text.size() > kLongestName) return nullptr;
  std::string identity = identityOf(wanted);
  const auto known = _items.find(identity);
  if (known != _items.end()) return &known->second;
  if (_items.size() == kMaximumSeries) return nullptr;
  return &_items.emplace(std::move(identity), std::move(wanted)).first->second;
}

const Series* SeriesTable::series(const SeriesGroup& group, const Item* item) {
  const SeriesKey key{&group, item};
  const auto known = _known.find(key);
  if (known != _known.end()) return known->second;
  if (_series.size() == kMaximumSeries) return nullptr;
  _series.push_back(
      {.id = static_cast<std::uint32_t>(_series.size()), .group = &group, .item = item});
  return _known.emplace(key, &_series.back()).first->second;
}

}  // namespace kestro
