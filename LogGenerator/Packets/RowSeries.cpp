// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/RowSeries.h"

#include <string>
#include <utility>

#include "LogGenerator/Packets/Texts.h"

namespace kestro {

RowSeries::RowSeries(std::span<const Field> identity, std::span<const SeriesGroup* const> groups,
                     SeriesTable& table)
    : _fields(identity), _groups(groups), _table(table), _none(groups.size()) {
  for (const Field& field : identity) _identity.emplace_back(field);
}

std::size_t RowSeries::Hash::operator()(const RowIdentity& identity) const noexcept {
  constexpr std::uint64_t kMultiplier = 0x9E3779B97F4A7C15U;
  std::uint64_t hash = (identity.first ^ identity.present) * kMultiplier;
  hash = (hash ^ hash >> 32 ^ identity.second) * kMultiplier;
  return hash ^ hash >> 32;
}

RowIdentity RowSeries::identityOf(std::size_t row, PacketView packet,
                                  const RecordPosition& position,
                                  const NumberSupplier* supplier) const {
  RowIdentity identity;
  std::size_t count = 0;
  for (std::size_t i = 0; i < _identity.size() && count < RecordTable::kMaximumIdentity; ++i) {
    std::int64_t number = 0;
    if (!_identity[i].raw(number, packet, position, supplier)) continue;
    identity.set(count++, static_cast<std::uint32_t>(number));
    identity.present |= 1U << i;
  }
  if (count == 0) identity.set(0, static_cast<std::uint32_t>(row));
  return identity;
}

std::span<const Series* const> RowSeries::of(std::size_t row, const RowIdentity& identity) {
  Known* found = known(row, identity);
  if (found == nullptr) return _none;
  if (std::exchange(found->packet, _packet) != _packet) {
    found->count = 1;
    return found->series;
  }
  const std::size_t other = found->count++ - 1;
  if (other == found->others.size()) {
    const Item* item = _table.item(itemOf(identity, found->count));
    if (item == nullptr) return _none;
    found->others.push_back(seriesOf(*item));
  }
  return found->others[other];
}

RowSeries::Known* RowSeries::known(std::size_t row, const RowIdentity& identity) {
  if (row < _last.size() && _last[row].identity == identity) return _last[row].known;
  auto found = _known.find(identity);
  if (found == _known.end()) {
    const Item* item = _table.item(itemOf(identity, 1));
    if (item == nullptr) return nullptr;
    found = _known.emplace(identity, Known{.series = seriesOf(*item)}).first;
  }
  if (row == _last.size()) _last.emplace_back();
  if (row < _last.size()) _last[row] = {identity, &found->second};
  return &found->second;
}

Item RowSeries::itemOf(const RowIdentity& identity, std::size_t occurrence) const {
  Item item;
  for (std::size_t i = 0; i < _fields.size(); ++i) {
    if ((identity.present >> i & 1) == 0) continue;
    const std::uint32_t bits = identity.number(item.parts.size());
    const std::int64_t number =
        _identity[i].isSigned() ? std::int64_t{static_cast<std::int32_t>(bits)} : bits;
    TextBuffer text;
    writeText(_fields[i].text, number, text);
    if (!item.text.empty()) item.text += '/';
    item.text += text.text();
    item.parts.push_back(
        {.key = std::string(_fields[i].key), .number = number, .text = std::string(text.text())});
  }
  if (item.parts.empty()) item.text = "#" + std::to_string(identity.number(0));
  if (occurrence > 1) item.text += " #" + std::to_string(occurrence);
  return item;
}

RowSeries::SeriesList RowSeries::seriesOf(const Item& item) const {
  SeriesList series;
  for (const SeriesGroup* group : _groups) {
    series.push_back(group == nullptr ? nullptr : _table.series(*group, &item));
  }
  return series;
}

}  // namespace kestro
