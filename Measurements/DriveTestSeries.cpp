// SPDX-License-Identifier: MIT
#include "Measurements/DriveTestSeries.h"

#include <algorithm>
#include <string_view>

#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

struct LogSeries {
  std::string_view technology;
  std::string_view section;
  std::string_view key;
};

constexpr std::string_view kLTEChannel = kTqLogChannelTechnology_Ondrel_LTE;
constexpr std::string_view kGsmUmtsChannel = kTqLogChannelTechnology_Ondrel_GSM;
constexpr std::string_view kServing = "Serving Cell Measurements";
constexpr std::string_view kConnectedMode = "Connected mode LTE Intra-frequency Measurement";
constexpr std::string_view kMeasured = "Measured Neighbor Cells";
constexpr std::string_view kNeighbours = "Neighbor Cells List";

// A scrambling code stands for the log's identity: RAWCELLID modulo 512.
constexpr LogSeries kLogSeries[] = {
    {kLTEChannel, "Serving Cell Info", "Cell Identity"},
    {kLTEChannel, "Serving Cell Info", "Tracking Area Code"},
    {kLTEChannel, kServing, "Measured RSRP"},
    {kLTEChannel, kServing, "Average RSRP"},
    {kLTEChannel, kServing, "Measured RSRQ"},
    {kLTEChannel, kServing, "Average RSRQ"},
    {kLTEChannel, kServing, "Measured RSSI"},
    {kLTEChannel, kConnectedMode, "Serving Filtered RSRP"},
    {kLTEChannel, kConnectedMode, "Serving Filtered RSRQ"},
    {kLTEChannel, kMeasured, "Filtered RSRP"},
    {kLTEChannel, kMeasured, "Filtered RSRQ"},
    {kLTEChannel, kNeighbours, "Measured RSRP"},
    {kLTEChannel, kNeighbours, "Average RSRP"},
    {kLTEChannel, kNeighbours, "Measured RSRQ"},
    {kLTEChannel, kNeighbours, "Average RSRQ"},
    {kGsmUmtsChannel, "Active Set", "RSCP"},
    {kGsmUmtsChannel, "Active Set", "Energy Per Chip"},
    {kGsmUmtsChannel, "Active Set", "Scrambling Code"},
    {kGsmUmtsChannel, "Serving PLMN", "Location Area Code"},
    {kGsmUmtsChannel, "GSM Serving Cell", "Cell ID"},
    {kGsmUmtsChannel, "GSM Serving Cell", "RSSI"},
    {kGsmUmtsChannel, "GSM RR Info", "Serving Rx Level"},
};

}  // namespace

bool isOfDriveTestLog(const SeriesGroup& group) noexcept {
  if (group.technology == kTqLogChannelTechnology_IFX) return true;
  return std::ranges::any_of(kLogSeries, [&](const LogSeries& row) {
    return row.technology == group.technology && row.section == group.section &&
           row.key == group.key;
  });
}

}  // namespace kestro
