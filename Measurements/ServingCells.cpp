// SPDX-License-Identifier: MIT
#include "Measurements/ServingCells.h"

#include <algorithm>

#include "Measurements/PacketText.h"

namespace kestro {
namespace {

constexpr Radio kEveryRadio[] = {Radio::LTE,     Radio::UMTS, Radio::GSM,
                                 Radio::UTRATDD, Radio::EVDO, Radio::OneX};
static_assert(std::size(kEveryRadio) == kRadioCount);

std::size_t placeOfRadio(Radio radio) { return static_cast<std::size_t>(radio); }

bool isMark(const ConnectedMark& mark, const SeriesGroup& group, LogCode code) {
  return (mark.code == 0 || mark.code == code) && mark.key == group.key &&
         mark.section == group.section && mark.technology == group.technology;
}

/// The same cell, or one of which less was known before.
bool isSameCell(const ServingCell& before, const ServingCell& now) {
  if (before.name == now.name) return true;
  const bool wasSure = before.name.identity && !before.isAssumed;
  const bool isSure = now.name.identity && !now.isAssumed;
  if (before.name.radio != now.name.radio || (wasSure && isSure)) return false;
  return before.channel && before.physical && before.channel == now.channel &&
         before.physical == now.physical;
}

}  // namespace

bool ServingCell::isPair(std::optional<std::uint32_t> otherChannel,
                         std::optional<std::uint32_t> otherPhysical) const noexcept {
  if (!physical || physical != otherPhysical) return false;
  return !channel || !otherChannel || channel == otherChannel;
}

void ServingCells::noteConnectedMode(const MeasuredMessage& message) {
  for (const MeasuredValue& value : message.measured.values) {
    const SeriesGroup& group = *value.series->group;
    for (const ConnectedMark& mark : connectedMarks()) {
      if (!isMark(mark, group, message.measured.code)) continue;
      const auto says = [&](int number) { return value.number == number; };
      const bool isConnected = mark.numbers.empty() || std::ranges::any_of(mark.numbers, says);
      auto& known = _connected[placeOfRadio(mark.radio)];
      known = isConnected ? std::optional(Connected{message.time, message.measured.code})
                          : std::nullopt;
    }
  }
}

std::optional<ServingCells::Previous> ServingCells::previousOf(Radio radio) const {
  const auto& own = of(radio);
  if (own) return Previous{radio, *own};
  for (const Radio other : kEveryRadio) {
    const auto& serving = of(other);
    if (!serving) continue;
    // The two radios of CDMA2000 serve beside each other.
    if (familyOfRadio(other) == familyOfRadio(radio)) return std::nullopt;
    return Previous{other, *serving};
  }
  return std::nullopt;
}

void ServingCells::decide(Radio radio, const ServingCell& cell, const MeasuredMessage& message) {
  const auto previous = previousOf(radio);
  takePlace(radio, cell);
  if (!previous || (previous->radio == radio && isSameCell(previous->cell, cell))) return;
  tellChange(*previous, radio, cell, message);
}

void ServingCells::takePlace(Radio radio, const ServingCell& cell) {
  for (const Radio other : kEveryRadio) {
    if (familyOfRadio(other) != familyOfRadio(radio)) of(other).reset();
  }
  of(radio) = cell;
}

std::optional<double> ServingCells::levelOf(const ServingCell& cell, Moment time) const {
  // A cell that has just become known was measured as a neighbour, by its pair.
  const CellName pair{.radio = cell.name.radio, .channel = cell.channel, .physical = cell.physical};
  const Cell* latest = nullptr;
  for (const Cell* row : {_cells.find(cell.name), _cells.find(pair)}) {
    if (row == nullptr || row->level.count() == 0 || time - row->lastLevel > kLevelFor) continue;
    if (latest == nullptr || row->lastLevel > latest->lastLevel) latest = row;
  }
  return latest == nullptr ? std::nullopt : std::optional(latest->level.last());
}

void ServingCells::tellChange(const Previous& previous, Radio radio, const ServingCell& cell,
                              const MeasuredMessage& message) const {
  Event event{.time = message.time,
              .message = message.number,
              .technology = std::string(nameOfRadio(radio)),
              .toldBy = packetText(message.measured.code)};
  const std::string_view family = familyOfRadio(radio);
  const std::string_view familyBefore = familyOfRadio(previous.radio);
  if (family != familyBefore) {
    Event change = event;
    change.kind = EventKind::Technology;
    change.from = familyBefore;
    change.to = family;
    _sink(change);
  }
  const auto& connected = _connected[placeOfRadio(previous.radio)];
  const bool isHandover = connected && message.time >= connected->time &&
                          message.time - connected->time <= kConnectedFor;
  event.kind = isHandover ? EventKind::Handover : EventKind::Reselection;
  if (isHandover) event.connectedBy = packetText(connected->code);
  event.from = textOf(previous.cell.name);
  event.to = textOf(cell.name);
  event.fromLevel = levelOf(previous.cell, message.time);
  event.toLevel = levelOf(cell, message.time);
  event.fromCell = previous.cell.cell;
  event.toCell = cell.cell;
  _sink(event);
}

}  // namespace kestro
