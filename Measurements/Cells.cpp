// SPDX-License-Identifier: MIT
#include "Measurements/Cells.h"

#include <fmt/format.h>

namespace kestro {
namespace {

constexpr unsigned kSectorBits = 8;

/// One number after another into one hash.
std::size_t mixed(std::size_t hash, std::uint64_t number) {
  constexpr std::uint64_t kMultiplier = 0x9E3779B97F4A7C15;
  const std::uint64_t product = (hash ^ number) * kMultiplier;
  return product ^ (product >> 32U);
}
std::uint64_t orNone(const std::optional<std::uint32_t>& number) {
  return number ? *number : std::uint64_t{1} << 32U;
}
std::string orDash(const std::optional<std::uint32_t>& number) {
  return number ? fmt::format("{}", *number) : "-";
}

}  // namespace

std::string textOf(const CellName& name) {
  if (name.identity) return fmt::format("{}", *name.identity);
  if (name.logCode) return fmt::format("code {}", *name.logCode);
  return fmt::format("{}/{}", orDash(name.channel), orDash(name.physical));
}

ChannelBand Cell::band() const {
  if (!channel) return {};
  return bandOfChannel(systemOfRadio(name.radio), *channel, ownBand);
}

std::optional<std::uint32_t> Cell::baseStation() const {
  if (name.radio != Radio::LTE || !name.identity) return std::nullopt;
  return *name.identity >> kSectorBits;
}

std::optional<std::uint32_t> Cell::sector() const {
  if (name.radio != Radio::LTE || !name.identity) return std::nullopt;
  return *name.identity & ((1U << kSectorBits) - 1);
}

std::size_t Cells::NameHash::operator()(const CellName& name) const noexcept {
  std::size_t hash = mixed(0, static_cast<std::uint64_t>(name.radio));
  for (const auto& number : {name.identity, name.channel, name.physical, name.logCode}) {
    hash = mixed(hash, orNone(number));
  }
  return hash;
}

std::optional<CellId> Cells::see(const CellName& name, Moment time) {
  const auto known = _places.find(name);
  if (known != _places.end()) {
    Cell& cell = _cells[known->second];
    if (cell.lastSeen < time) cell.lastSeen = time;
    return known->second;
  }
  if (_cells.size() == kMaximumCells) {
    ++_notKept;
    return std::nullopt;
  }
  const auto id = static_cast<CellId>(_cells.size());
  _places.emplace(name, id);
  _cells.push_back({.name = name, .firstSeen = time, .lastSeen = time});
  return id;
}

const Cell* Cells::find(const CellName& name) const {
  const auto known = _places.find(name);
  return known == _places.end() ? nullptr : &_cells[known->second];
}

std::size_t KnownIdentities::PairHash::operator()(const Pair& pair) const noexcept {
  return mixed(mixed(mixed(0, static_cast<std::uint64_t>(pair.radio)), pair.channel),
               pair.physical);
}

void KnownIdentities::know(Radio radio, std::uint32_t channel, std::uint32_t physical,
                           std::uint32_t identity, Moment time) {
  const Pair pair{radio, channel, physical};
  if (_known.size() >= kMaximumPairs && !_known.contains(pair)) {
    std::erase_if(_known, [&](const auto& known) { return time - known.second.time > kLifetime; });
    // Pairs beyond the limit within ten minutes come from no drive: none of them is to be trusted.
    if (_known.size() >= kMaximumPairs) _known.clear();
  }
  _known.insert_or_assign(pair, Known{.identity = identity, .time = time});
}

std::optional<std::uint32_t> KnownIdentities::identityOf(Radio radio, std::uint32_t channel,
                                                         std::uint32_t physical,
                                                         Moment time) const {
  const auto known = _known.find({radio, channel, physical});
  if (known == _known.end()) return std::nullopt;
  const auto age = time - known->second.time;
  if (age > kLifetime || -age > kLifetime) return std::nullopt;
  return known->second.identity;
}

}  // namespace kestro
