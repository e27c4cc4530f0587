// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemCells.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <span>
#include <string>

#include "LogGenerator/Bands.h"

namespace kestro {
namespace {

/// How a value is read and shown.
enum class Form : std::uint8_t {
  Text,
  Network,  ///< a text: the operator's code, shown with its two parts
  Number,
  Hexadecimal,  ///< a text
  Colours,      ///< a text: network and base-station colour code
  RxLevel,      ///< a number from 0 to 63
  Channel,      ///< a number, shown with its band and frequency
  Level,        ///< dBm
  Ratio,        ///< dB
  Loss,         ///< a number of dB
};

struct CellValue {
  std::string_view key;
  std::string_view name;
  Form form;
  std::uint64_t greatest = 0xFFFF'FFFF;
};

constexpr std::uint64_t kLac = 0xFFFF;
constexpr std::uint64_t kTac = 0xFF'FFFF;
constexpr std::uint64_t kCell28 = 0xFFF'FFFF;
constexpr std::uint64_t kCell36 = 0xF'FFFF'FFFF;

constexpr CellValue kCDMACell[] = {
    {"sid", "SID", Form::Hexadecimal, 0x7FFF},
    {"nid", "NID", Form::Hexadecimal, 0xFFFF},
    {"base-station-id", "Base Station ID", Form::Hexadecimal, 0xFFFF},
    {"ref-pn", "PN Offset", Form::Hexadecimal, 511},
    {"pilot-strength", "Pilot Strength", Form::Number}};
constexpr CellValue kGSMCell[] = {
    {"operator-id", "Operator Code", Form::Network},       {"lac", "LAC", Form::Hexadecimal, kLac},
    {"ci", "Cell ID", Form::Hexadecimal, kCell28},         {"arfcn", "ARFCN", Form::Channel, 1023},
    {"base-station-id", "BSIC", Form::Colours, 63},        {"rx-level", "RxLev", Form::RxLevel, 63},
    {"timing-advance", "Timing Advance", Form::Number, 63}};
constexpr CellValue kUMTSCell[] = {{"operator-id", "Operator Code", Form::Network},
                                   {"lac", "LAC", Form::Hexadecimal, kLac},
                                   {"ci", "Cell ID", Form::Hexadecimal, kCell28},
                                   {"uarfcn", "UARFCN", Form::Channel, 16383},
                                   {"frequency-fdd-dl", "Frequency FDD DL", Form::Number},
                                   {"frequency-fdd-ul", "Frequency FDD UL", Form::Number},
                                   {"frequency-tdd", "Frequency TDD", Form::Number},
                                   {"psc", "PSC", Form::Number, 511},
                                   {"rscp", "RSCP", Form::Level},
                                   {"ecio", "Ec/Io", Form::Ratio},
                                   {"path-loss", "Path Loss", Form::Loss, 400}};
constexpr CellValue kTDSCDMACell[] = {{"operator-id", "Operator Code", Form::Network},
                                      {"lac", "LAC", Form::Hexadecimal, kLac},
                                      {"ci", "Cell ID", Form::Hexadecimal, kCell28},
                                      {"uarfcn", "UARFCN", Form::Channel, 16383},
                                      {"cell-parameter-id", "Cell Parameter ID", Form::Number, 127},
                                      {"rscp", "RSCP", Form::Level},
                                      {"path-loss", "Path Loss", Form::Loss, 400},
                                      {"timing-advance", "Timing Advance", Form::Number}};
constexpr CellValue kLTECell[] = {{"operator-id", "Operator Code", Form::Network},
                                  {"tac", "TAC", Form::Hexadecimal, kTac},
                                  {"ci", "Cell ID", Form::Hexadecimal, kCell28},
                                  {"earfcn", "EARFCN", Form::Channel, 262'143},
                                  {"physical-ci", "Physical Cell ID", Form::Hexadecimal, 503},
                                  {"rsrp", "RSRP", Form::Level},
                                  {"rsrq", "RSRQ", Form::Ratio},
                                  {"timing-advance", "Timing Advance", Form::Number}};
constexpr CellValue kNRCell[] = {{"operator-id", "Operator Code", Form::Network},
                                 {"tac", "TAC", Form::Hexadecimal, kTac},
                                 {"ci", "Cell ID", Form::Hexadecimal, kCell36},
                                 {"nrarfcn", "NR-ARFCN", Form::Channel, 3'279'165},
                                 {"physical-ci", "Physical Cell ID", Form::Hexadecimal, 1007},
                                 {"rsrp", "SS-RSRP", Form::Level},
                                 {"rsrq", "SS-RSRQ", Form::Ratio},
                                 {"sinr", "SS-SINR", Form::Ratio},
                                 {"timing-advance", "Timing Advance", Form::Number}};

/// A type of cells, by the number that the interface gives it.
struct CellType {
  std::uint64_t number;
  std::string_view radio;
  RadioSystem system;
  std::span<const CellValue> values;
};
constexpr CellType kTypes[] = {{1, "1x", RadioSystem::CDMA2000, kCDMACell},
                               {2, "GSM", RadioSystem::GSM, kGSMCell},
                               {3, "UMTS", RadioSystem::UTRAFDD, kUMTSCell},
                               {4, "UTRA TDD", RadioSystem::UTRATDD, kTDSCDMACell},
                               {5, "LTE", RadioSystem::EUTRA, kLTECell},
                               {6, "5G", RadioSystem::NR, kNRCell}};

constexpr double kLeastLevel = -200;
constexpr double kGreatestLevel = 50;
constexpr double kGreatestRatio = 100;

BusFields fieldsOf(const BusProperties& cell, BusFaults& faults) {
  return {cell, "Modem GetCellInfo", faults};
}

/// 1 to 63 are steps of 1 dB from -110 dBm on; 0 is all below.
std::string rxLevelText(std::uint64_t level) {
  constexpr std::int64_t kOffset = 111;
  if (level == 0) return "< -110 dBm";
  return fmt::format("{} dBm", static_cast<std::int64_t>(level) - kOffset);
}

std::string coloursText(std::uint64_t code) { return fmt::format("{}-{}", code / 8, code % 8); }

template <class T>
std::optional<std::string> formatted(const std::optional<T>& value, std::string_view unit = "") {
  if (!value) return std::nullopt;
  return fmt::format("{}{}", *value, unit);
}

std::optional<std::string> textOf(const BusFields& cell, const CellValue& value) {
  switch (value.form) {
    case Form::Text:
    case Form::Network:
      return cell.text(value.key);
    case Form::Number:
    case Form::Channel:
      return formatted(cell.number(value.key, value.greatest));
    case Form::Hexadecimal:
      return formatted(cell.hexadecimal(value.key, value.greatest));
    case Form::Colours: {
      const auto code = cell.hexadecimal(value.key, value.greatest);
      return code ? std::optional(coloursText(*code)) : std::nullopt;
    }
    case Form::RxLevel: {
      const auto level = cell.number(value.key, value.greatest);
      return level ? std::optional(rxLevelText(*level)) : std::nullopt;
    }
    case Form::Level:
      return formatted(cell.real(value.key, kLeastLevel, kGreatestLevel), " dBm");
    case Form::Ratio:
      return formatted(cell.real(value.key, -kGreatestRatio, kGreatestRatio), " dB");
    case Form::Loss:
      return formatted(cell.number(value.key, value.greatest), " dB");
  }
  return std::nullopt;
}

void addBand(RadioSystem system, std::uint64_t channel, Dictionary& values) {
  constexpr double kKHzOfMHz = 1'000;
  const ChannelBand place = bandOfChannel(system, static_cast<std::uint32_t>(channel));
  if (!place.band.empty()) values.set("Band", place.band);
  if (place.downlinkKHz) {
    values.set("Downlink Frequency", fmt::format("{} MHz", *place.downlinkKHz / kKHzOfMHz));
  }
}

}  // namespace

void addNetwork(std::string_view operatorCode, Dictionary& values) {
  constexpr std::size_t kCountryDigits = 3;
  const bool isCode =
      (operatorCode.size() == 5 || operatorCode.size() == 6) &&
      std::ranges::all_of(operatorCode, [](char c) { return c >= '0' && c <= '9'; });
  if (!isCode) return;
  values.set("MCC", operatorCode.substr(0, kCountryDigits));
  values.set("MNC", operatorCode.substr(kCountryDigits));
}

Dictionary cellValues(const BusProperties& cell, BusFaults& faults) {
  const BusFields fields = fieldsOf(cell, faults);
  Dictionary result;
  const auto number = fields.number("cell-type");
  const auto* type = std::ranges::find_if(
      kTypes, [&](const CellType& candidate) { return candidate.number == number; });
  if (type == std::end(kTypes)) return result;
  result.set("Technology", type->radio);
  for (const CellValue& value : type->values) {
    const auto text = textOf(fields, value);
    if (!text) continue;
    result.set(value.name, *text);
    if (value.form == Form::Network) addNetwork(*text, result);
    if (value.form == Form::Channel) {
      addBand(type->system, *fields.number(value.key, value.greatest), result);
    }
  }
  return result;
}

bool isServingCell(const BusProperties& cell, BusFaults& faults) {
  return fieldsOf(cell, faults).flag("serving").value_or(false);
}

void addLocation(const LocationCell& location, Dictionary& cell) {
  const auto add = [&cell](std::string_view name, const std::optional<std::uint64_t>& number) {
    if (number && !cell.contains(name)) cell.set(name, fmt::format("{}", *number));
  };
  if (!cell.contains("MCC")) {
    cell.set("MCC", location.countryCode);
    cell.set("MNC", location.networkCode);
  }
  add("LAC", location.locationArea);
  add("TAC", location.trackingArea);
  add("Cell ID", location.cell);
}

}  // namespace kestro
