// SPDX-License-Identifier: MIT
#include "LogGenerator/Bands.h"

#include <algorithm>
#include <span>
#include <vector>

#include "LogGenerator/BandRows.h"

namespace kestro {
namespace {

std::span<const BandRow> bandRowsOf(RadioSystem system) {
  switch (system) {
    case RadioSystem::EUTRA:
      return kEUTRARows;
    case RadioSystem::UTRAFDD:
      return kUTRAFDDRows;
    case RadioSystem::UTRATDD:
      return kUTRATDDRows;
    case RadioSystem::GSM:
      return kGSMRows;
    case RadioSystem::CDMA2000:
      return kCDMA2000Rows;
    case RadioSystem::NR:
      break;
  }
  return {};
}

/// The rows that have the channel: the one of `ownBand` where that is among them.
template <class Row>
std::vector<const Row*> fittingRows(std::span<const Row> rows, std::uint32_t channel,
                                    std::optional<std::uint32_t> ownBand) {
  std::vector<const Row*> fitting;
  for (const Row& row : rows) {
    if (channel < row.first || channel > row.last) continue;
    if (ownBand && row.number != kNoBandNumber && row.number == *ownBand) return {&row};
    fitting.push_back(&row);
  }
  return fitting;
}

/// `row` is a BandRow or a RasterRow that has the channel.
std::uint32_t frequencyIn(const auto& row, std::uint32_t channel) {
  return row.firstKHz + (channel - row.first) * row.stepKHz;
}

ChannelBand nrBand(std::uint32_t channel, std::optional<std::uint32_t> ownBand) {
  ChannelBand answer;
  for (const RasterRow& part : kNRRaster) {
    if (channel >= part.first && channel <= part.last) {
      answer.downlinkKHz = frequencyIn(part, channel);
    }
  }
  const auto fitting = fittingRows(std::span<const NRBandRow>(kNRRows), channel, ownBand);
  if (fitting.size() == 1) answer.band = fitting.front()->name;
  return answer;
}

}  // namespace

ChannelBand bandOfChannel(RadioSystem system, std::uint32_t channel,
                          std::optional<std::uint32_t> ownBand) {
  if (system == RadioSystem::NR) return nrBand(channel, ownBand);
  const auto fitting = fittingRows(bandRowsOf(system), channel, ownBand);
  if (fitting.empty()) return {};
  ChannelBand answer{.band = {}, .downlinkKHz = frequencyIn(*fitting.front(), channel)};
  for (const BandRow* row : fitting) {
    if (!answer.band.empty()) answer.band += ", ";
    answer.band += row->name;
    if (frequencyIn(*row, channel) != answer.downlinkKHz) answer.downlinkKHz = std::nullopt;
  }
  return answer;
}

}  // namespace kestro
