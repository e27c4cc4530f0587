// SPDX-License-Identifier: MIT
#include "Sources/IFX/IFXDriveTest.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

#include <array>
#include <span>

#include "Platform/TelephonyService.h"
#include "Sources/IFX/IFXMessage.h"

namespace kestro {
namespace {

/// How a column is shown. Its name depends on the row's family; where it has none there it is left
/// out.
struct Shown {
  DriveTestColumn column;
  std::array<std::string_view, kDriveTestFamilyCount> names;  ///< GSM, UMTS, LTE
  std::string_view unit;
};

constexpr std::array<std::string_view, kDriveTestFamilyCount> everywhere(std::string_view name) {
  return {name, name, name};
}

constexpr Shown kMode[] = {
    {DriveTestColumn::NetworkMode, everywhere("Network Mode"), ""},
    {DriveTestColumn::Operator, everywhere("Operator"), ""},
    {DriveTestColumn::State, everywhere("State"), ""},
};

constexpr Shown kServingCell[] = {
    {DriveTestColumn::CellId, everywhere("Cell ID"), ""},
    {DriveTestColumn::Cell, everywhere("Cell ID (hex)"), ""},
    {DriveTestColumn::Node, {"BSC (hex)", "RNC (hex)", "eNodeB (hex)"}, ""},
    {DriveTestColumn::Area, {"LAC (hex)", "LAC (hex)", "TAC (hex)"}, ""},
    {DriveTestColumn::RawCellId, everywhere("Whole Cell ID"), ""},
};

constexpr Shown kRadioQuality[] = {
    {DriveTestColumn::Level, {"RxLev", "RSCP", "RSRP"}, " dBm"},
    {DriveTestColumn::Quality, {"", "Ec/N0", "RSRQ"}, " dB"},
    {DriveTestColumn::SignalToNoise, everywhere("SNR"), " dB"},
    {DriveTestColumn::TotalPower, everywhere("RSSI"), " dBm"},
    {DriveTestColumn::ChannelQuality, everywhere("CQI"), ""},
};

constexpr Shown kNeighbour[] = {
    {DriveTestColumn::NeighbourLevel, everywhere("RSRP"), " dBm"},
    {DriveTestColumn::NeighbourQuality, everywhere("RSRQ"), " dB"},
};

constexpr Shown kThroughput[] = {
    {DriveTestColumn::DownlinkRate, everywhere("Downlink"), " kbit/s"},
    {DriveTestColumn::UplinkRate, everywhere("Uplink"), " kbit/s"},
};

constexpr Shown kPosition[] = {
    {DriveTestColumn::Latitude, everywhere("Latitude"), ""},
    {DriveTestColumn::Longitude, everywhere("Longitude"), ""},
    {DriveTestColumn::Speed, everywhere("Speed"), " km/h"},
};

void fill(Dictionary& section, std::span<const Shown> columns, const DriveTestRow& row) {
  for (const auto& shown : columns) {
    const auto name = shown.names[static_cast<std::size_t>(row.family)];
    const auto& text = row.text(shown.column);
    if (!name.empty() && text) section.set(name, fmt::format("{}{}", *text, shown.unit));
  }
}

void addNeighbours(IFXMessage& message, const DriveTestRow& row) {
  auto list = message.addList("Neighbour Cells", "the strongest neighbour");
  // Its rank keeps a neighbour of which one value is known from collapsing to that value.
  Dictionary neighbour{{"Rank", "1"}};
  fill(neighbour, kNeighbour, row);
  if (neighbour.size() > 1) list.append(neighbour);
}

}  // namespace

std::string_view IFXDriveTestEncoder::technology() const { return kTqLogChannelTechnology_IFX; }

std::vector<Bytes> IFXDriveTestEncoder::messages(const DriveTestRow& row) {
  IFXMessage message;
  auto mode = message.addSection("Mode");
  mode.set("Time", fmt::format("{:%Y-%m-%d %H:%M:%S}", fmt::gmtime(row.time)));
  fill(mode, kMode, row);
  auto servingCell = message.addSection("Serving Cell");
  fill(servingCell, kServingCell, row);
  auto quality = message.addSection("Radio Quality");
  quality.set("Technology", nameOf(row.family));
  fill(quality, kRadioQuality, row);
  addNeighbours(message, row);
  auto throughput = message.addSection("Throughput");
  fill(throughput, kThroughput, row);
  auto position = message.addSection("Position");
  fill(position, kPosition, row);

  std::vector<Bytes> result;
  if (auto bytes = message.bytes(_coding)) result.push_back(std::move(*bytes));
  return result;
}

}  // namespace kestro
