// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KLogGenerator.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <utility>
#include <variant>

#include "LogGenerator/C2K/C2KState.h"
#include "LogGenerator/C2K/EVDOPilots.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/EVDOThroughput.h"
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXSystemParameters.h"
#include "LogGenerator/DisplayKeys.h"
#include "LogGenerator/DisplayTemplate.h"
#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

std::vector<std::unique_ptr<C2KParser>> makeParsers() {
  std::vector<std::unique_ptr<C2KParser>> parsers;
  parsers.push_back(std::make_unique<EVDOFingers>());
  parsers.push_back(std::make_unique<EVDOStatus>());
  parsers.push_back(std::make_unique<EVDOThroughput>(kForwardThroughput));
  parsers.push_back(std::make_unique<EVDOActiveSet>());
  parsers.push_back(std::make_unique<OneXStatus>());
  parsers.push_back(std::make_unique<TrafficFrame>());
  parsers.push_back(std::make_unique<EVDOThroughput>(kReverseThroughput));
  parsers.push_back(std::make_unique<OneXSystemParameters>());
  return parsers;
}

/// The value as the display shows it: once for each place of its name, or of its row's list.
void visitAtPlaces(const TemplatePlaces& places, ExplainedValue value,
                   const ExplainVisitor& visit) {
  const std::span<const DisplayPlace> shownAt =
      places.of(value.list.empty() ? value.key : value.list);
  for (const DisplayPlace& place : shownAt) {
    value.section = place.section;
    (value.list.empty() ? value.key : value.list) = place.key;
    visit(value);
  }
  if (shownAt.empty()) visit(value);
}

std::string_view& lookupNameOf(OutlinedValue& value) { return value.key; }
std::string_view& lookupNameOf(OutlinedTable& table) { return table.list; }
std::string_view& lookupNameOf(OutlinedSizedRecords& records) { return records.list; }

/// The part as the display shows it: once for each place of its name.
void appendAtPlaces(const TemplatePlaces& places, const OutlinedPart& part,
                    std::vector<OutlinedPart>& parts) {
  const auto append = [&](auto known) {
    const std::span<const DisplayPlace> shownAt = places.of(lookupNameOf(known));
    for (const DisplayPlace& place : shownAt) {
      known.section = place.section;
      lookupNameOf(known) = place.key;
      parts.emplace_back(known);
    }
    if (shownAt.empty()) parts.emplace_back(known);
  };
  std::visit(append, part);
}

/// What the catalogue knows of a lookup name that the display shows as `key`: the rows of the list
/// that it names, or the fields that write it.
std::vector<CatalogueKey> keysOf(const PacketReading& reading, std::string_view lookupName,
                                 std::string_view key) {
  const auto list = std::ranges::find(reading.lists, lookupName, &ListReading::key);
  if (list != reading.lists.end()) return catalogueFields(list->table.fields, key, &list->table);
  CatalogueKey found = catalogueKey(lookupName, reading.fields);
  found.key = key;
  return {found};
}

/// What the display takes from one code, section by section in the order of the names.
class CodeEntries {
 public:
  explicit CodeEntries(const C2KParser& parser, const TemplatePlaces& places)
      : _reading(parser.reading()), _requirements(parser.rules().requirements) {
    for (const std::string_view name : parser.lookupNames()) {
      const std::span<const DisplayPlace> shownAt = places.of(name);
      for (const DisplayPlace& place : shownAt) {
        const std::string_view section = place.section;
        add(name, place.key, section).group = section.substr(0, section.find('/'));
      }
      if (shownAt.empty()) add(name, name, _reading.packet.name);
    }
  }

  [[nodiscard]] const std::vector<CatalogueEntry>& entries() const noexcept { return _entries; }

 private:
  CatalogueEntry& add(std::string_view lookupName, std::string_view key, std::string_view section) {
    auto entry = std::ranges::find(_entries, section, &CatalogueEntry::section);
    if (entry == _entries.end()) {
      entry = _entries.insert(entry, {.code = _reading.packet.code,
                                      .packetName = _reading.packet.name,
                                      .minimumLength = _reading.packet.minimumLength,
                                      .requirements = _requirements,
                                      .section = section});
    }
    std::ranges::copy(keysOf(_reading, lookupName, key), std::back_inserter(entry->keys));
    return *entry;
  }

  const PacketReading& _reading;
  std::span<const Requirement> _requirements;
  std::vector<CatalogueEntry> _entries;
};

}  // namespace

std::unique_ptr<C2KLogGenerator> C2KLogGenerator::generator(const GeneratorServices& services) {
  return std::make_unique<C2KLogGenerator>(services);
}

C2KLogGenerator::C2KLogGenerator(const GeneratorServices& services)
    : OndrelLogGenerator(services), _parsers(makeParsers()) {
  init();
}

Dictionary C2KLogGenerator::getStartCommand() const {
  Array codes;
  for (const auto& parser : _parsers) codes.append(Value::integer(parser->reading().packet.code));
  return {{kTelephonySetState, kTelephonyStreaming}, {kTelephonySetOndrelLogCodes, codes}};
}

std::span<const std::string_view> C2KLogGenerator::stateKeys() const {
  static constexpr std::array kKeys = {kStateDisplay,    kStateExtraInfo,    kStateTemplate,
                                       kStateLookup,     kStateTrafficFER,   kStateFLDataSeqNum,
                                       kStateFLDataSent, kStateRLDataSeqNum, kStateRLDataSent};
  return kKeys;
}

// --- Packets -------------------------------------------------------------------------------------

C2KParser* C2KLogGenerator::parserOf(LogCode code) const noexcept {
  const auto parser = std::ranges::find(
      _parsers, code, [](const auto& candidate) { return candidate->reading().packet.code; });
  return parser == _parsers.end() ? nullptr : parser->get();
}

void C2KLogGenerator::updateStateWithData(Dictionary& state, ByteView data) {
  if (_displayKey.in(state).isNull()) getDisplayFromState(state);
  updateFromLogUsingLookupUsingState(data, _lookupKey.in(state).dictionary(), state);
}

void C2KLogGenerator::updateFromLogUsingLookupUsingState(ByteView message, const Dictionary& lookup,
                                                         Dictionary& state) {
  if (message.size() < kPacketHeaderSize) return;
  const PacketView packet(packetOfMessage(message));
  if (logTypeOf(packet) != kBasebandLogType) {
    // The packet is not dropped, whatever the line says.
    services().systemLog.log(LogPriority::Error, "Invalid log type: {:x}. Dropping.",
                             logTypeOf(packet));
  }
  C2KParser* parser = parserOf(logCodeOf(packet));
  if (parser == nullptr) return;
  C2KOutput output{state, LookupTable(lookup), services().systemLog};
  parser->parse(packet, output);
  collect(packet.bytes());
}

void C2KLogGenerator::explainMessage(ByteView message, const ExplainVisitor& visit) const {
  if (message.size() < kPacketHeaderSize) return;
  const PacketView packet(packetOfMessage(message));
  const C2KParser* parser = parserOf(logCodeOf(packet));
  if (parser == nullptr) return;
  parser->explain(packet,
                  [&](const ExplainedValue& value) { visitAtPlaces(places(), value, visit); });
}

void C2KLogGenerator::catalogue(const CatalogueVisitor& visit) const {
  for (const auto& parser : _parsers) {
    const CodeEntries found(*parser, places());
    for (const CatalogueEntry& entry : found.entries()) visit(entry);
  }
}

void C2KLogGenerator::outline(const OutlineVisitor& visit) const {
  for (const auto& parser : _parsers) {
    OutlinedReading reading = parser->outline();
    std::vector<OutlinedPart> parts;
    for (const OutlinedPart& part : reading.parts) appendAtPlaces(places(), part, parts);
    reading.parts = std::move(parts);
    visit({.code = parser->reading().packet.code, .readings = {std::move(reading)}});
  }
}

// --- Display -------------------------------------------------------------------------------------

Value C2KLogGenerator::generateLogUsingState(Dictionary& state) {
  Value display = getDisplayFromState(state);
  handOverCollected(state);
  updateHistoryInState(state, services().clock);
  return display;
}

Value C2KLogGenerator::getDisplayFromState(Dictionary& state) {
  const Value& known = _displayKey.in(state);
  if (!known.isNull()) return known;
  const Value displayTemplate = templateOfState(services(), kC2KTemplate, state);
  if (displayTemplate.isNull()) {
    services().systemLog.write(LogPriority::Error, "Cannot load C2K template for display");
    return {};
  }
  Dictionary display;
  Dictionary lookup;
  processTemplateStoreDisplayIntoDictStoreLookupIntoDict(displayTemplate.dictionary(), display,
                                                         lookup);
  state.set(kStateDisplay, display);
  state.set(kStateLookup, lookup);
  state.set(kStateExtraInfo, Dictionary());
  return display;
}

void C2KLogGenerator::processTemplateStoreDisplayIntoDictStoreLookupIntoDict(
    const Dictionary& displayTemplate, Dictionary& display, Dictionary& lookup) const {
  LookupTable table(lookup);
  for (const auto& [key, value] : displayTemplate) {
    if (value.isDictionary()) {
      Dictionary section;
      processTemplateStoreDisplayIntoDictStoreLookupIntoDict(value.dictionary(), section, lookup);
      display.set(key, section);
    } else if (value.isText() && value.text() == kSortedMarker) {
      display.set(key, value);
    } else if (value.isText()) {
      display.set(key, "");
      table.addTarget(value, key, display);
    }
  }
  services().systemLog.write(LogPriority::Warning, "Processing the template");
}

const TemplatePlaces& C2KLogGenerator::places() const {
  if (!_places) _places.emplace(loadTemplate(services(), kC2KTemplate).dictionary());
  return *_places;
}

}  // namespace kestro
