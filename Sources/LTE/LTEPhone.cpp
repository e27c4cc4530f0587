// SPDX-License-Identifier: MIT
#include "Sources/LTE/LTEPhone.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Sources/World/Noise.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

// One resource block: its noise, the receiver's own included, and its subcarriers, which carry
// traffic half of the time.
constexpr double kNoisePerBlock = -114.4;
constexpr double kTrafficPerBlock = 7.8;  // 10 log10(12 × 0.5)

// How much a new measurement counts in the filtered level.
constexpr double kFilter = 0.3;

constexpr double kWeakestNeighbour = -124;
constexpr std::size_t kMostNeighbours = 7;
constexpr unsigned kMostLowCycles = 63;

// What the packets can carry of a quality, dB.
constexpr double kLowestQuality = -19.5;
constexpr double kHighestQuality = -3;

constexpr double kMetresPerSample = 9.77;  // light, at 30.72 million samples a second

/// Every second mast carries the low frequency.
std::vector<unsigned> coverageSites() {
  std::vector<unsigned> sites;
  for (unsigned site = 0; site < RingRoad::kSites; site += 2) sites.push_back(site);
  return sites;
}

/// The masts beyond the town's edge do not carry the high one.
std::vector<unsigned> citySites() {
  std::vector<unsigned> sites;
  for (unsigned site = 0; site < RingRoad::kSites; ++site) {
    if (site < 8 || site > 11) sites.push_back(site);
  }
  return sites;
}

/// 20 MHz at 1800 MHz: preferred, but it does not reach far.
LTECarrier::Parameters cityCarrier(std::uint64_t seed) {
  return {.cell = {.earfcn = 1300, .uplinkEarfcn = 19300, .band = 3, .resourceBlocks = 100},
          .radio = {.seed = hashed(seed, 11), .frequency = 1800, .power = 32, .sites = citySites()},
          .reselection = {.priority = 6, .minimumRsrp = -122, .nonIntraSearch = 14},
          .firstPhysicalCellId = 12,
          .firstSectorNumber = 1};
}

/// 10 MHz at 800 MHz: the layer to fall back to.
LTECarrier::Parameters coverageCarrier(std::uint64_t seed) {
  return {
      .cell = {.earfcn = 6400, .uplinkEarfcn = 24400, .band = 20, .resourceBlocks = 50},
      .radio = {.seed = hashed(seed, 12), .frequency = 800, .power = 34, .sites = coverageSites()},
      .reselection = {.priority = 4, .minimumRsrp = -126, .nonIntraSearch = 20},
      .firstPhysicalCellId = 300,
      .firstSectorNumber = 21};
}

}  // namespace

// --- LTECarrier ----------------------------------------------------------------------------------

LTECarrier::LTECarrier(Parameters parameters)
    : _parameters(std::move(parameters)), _radio(_parameters.radio) {}

void LTECarrier::measure(const Drive& drive) {
  _levels = _radio.levels(drive);
  PowerSum total;
  total.add(kNoisePerBlock);
  for (const CellLevel& level : _levels) total.add(level.level + kTrafficPerBlock);
  _totalPerBlock = total.level();
  const bool isFirst = _averages.empty();
  std::vector<CellLevel> averages = _levels;
  for (CellLevel& average : averages) {
    if (isFirst) continue;
    const double before = levelOfCell(_averages, average.cell).level;
    average.level = before + kFilter * (average.level - before);
  }
  std::ranges::sort(averages, std::greater(), &CellLevel::level);
  _averages = std::move(averages);
}

LTECell LTECarrier::cell(std::size_t index) const {
  const SimulatedCell& place = _radio.cells()[index];
  LTECell cell = _parameters.cell;
  cell.physicalCellId = _parameters.firstPhysicalCellId + 3 * place.site + place.sector;
  cell.cellIdentity = ((4'100 + place.site) << 8) + _parameters.firstSectorNumber + place.sector;
  cell.trackingAreaCode = place.site < RingRoad::kSites / 2 ? 601 : 602;
  cell.antennas = place.site % 4 == 0 ? 4 : 2;
  return cell;
}

const CellLevel& LTECarrier::measured(std::size_t index) const {
  return levelOfCell(_levels, index);
}

LTELevel LTECarrier::levelOf(double rsrp) const {
  const double bandwidth = 10 * std::log10(_parameters.cell.resourceBlocks);
  return {.rsrp = rsrp,
          .rsrq = std::clamp(rsrp - _totalPerBlock, kLowestQuality, kHighestQuality),
          .rssi = _totalPerBlock + bandwidth};
}

int LTECarrier::selectionLevel(std::size_t index) const {
  return _parameters.reselection.selectionLevel(levelOfCell(_averages, index).level);
}

LTEServing LTECarrier::serving(std::size_t index) const {
  return {.cell = cell(index),
          .now = levelOf(measured(index).level),
          .average = levelOf(levelOfCell(_averages, index).level),
          .reselection = _parameters.reselection};
}

LTENeighbour LTECarrier::neighbour(std::size_t index) const {
  const CellLevel& level = measured(index);
  return {.physicalCellId = cell(index).physicalCellId,
          .now = levelOf(level.level),
          .average = levelOf(levelOfCell(_averages, index).level),
          .frameOffset = static_cast<unsigned>(index % 2),
          .sampleOffset = static_cast<unsigned>(level.distance / kMetresPerSample),
          .frequencyOffset = static_cast<unsigned>(20 + 37 * index % 90)};
}

// --- LTEPhone ------------------------------------------------------------------------------------

LTEPhone::LTEPhone(std::uint64_t seed)
    : _drive(hashed(seed, 0)),
      _session(hashed(seed, 4)),
      _carriers{LTECarrier(cityCarrier(seed)), LTECarrier(coverageCarrier(seed))},
      _selections{CellSelection(3, milliseconds(1'000)), CellSelection(4, milliseconds(1'000))} {
  advance(milliseconds(0));
}

void LTEPhone::advance(milliseconds time) {
  _drive.advance(time);
  _session.advance(time);
  for (LTECarrier& carrier : _carriers) carrier.measure(_drive);
  _hasNewCell = _selections[_carrier].update(servingCarrier().levels(), time);
  chooseCarrier(time);
  const bool isLow = servingCarrier().selectionLevel(servingCell()) < 0;
  _lowCycles = isLow ? std::min(_lowCycles + 1, kMostLowCycles) : 0;
  transfer(time);
}

void LTEPhone::chooseCarrier(milliseconds time) {
  constexpr int kGoodLevel = 26;  // of the preferred frequency, above which it is taken
  constexpr int kAdvantage = 6;   // of the other one, when the preferred is too weak
  const int servingLevel = servingCarrier().selectionLevel(servingCell());
  const int otherLevel = otherCarrier().selectionLevel(otherCell());
  const bool isPreferred =
      servingCarrier().reselection().priority > otherCarrier().reselection().priority;
  const bool otherIsBetter = isPreferred
                                 ? servingLevel < servingCarrier().reselection().nonIntraSearch &&
                                       otherLevel > servingLevel + kAdvantage
                                 : otherLevel > kGoodLevel;
  _otherIsBetter = otherIsBetter ? _otherIsBetter + time : milliseconds(0);
  if (_otherIsBetter < milliseconds(2'000)) return;
  _otherIsBetter = {};
  _carrier = 1 - _carrier;
  _selections[_carrier].reset();
  _selections[_carrier].update(servingCarrier().levels(), time);
  _hasNewCell = true;
}

void LTEPhone::transfer(milliseconds time) {
  if (_session.activity() != Activity::Transfer) return;
  const LTEServing cell = serving();
  const double bitsPerHertz = std::log2(1 + std::pow(10, (cell.now.rsrq + 19) / 10)) / 2;
  const double hertz = 180e3 * cell.cell.resourceBlocks;
  const double seconds = std::chrono::duration<double>(time).count();
  _downlinkBytes += bitsPerHertz * hertz * seconds / 8;
  _uplinkBytes += bitsPerHertz * hertz * seconds / 80;
}

LTEServing LTEPhone::serving() const {
  LTEServing serving = servingCarrier().serving(servingCell());
  serving.consecutiveLowCycles = _lowCycles;
  serving.rulesUpdated = _hasNewCell;
  return serving;
}

std::vector<LTENeighbour> LTEPhone::neighbours() const {
  std::vector<LTENeighbour> neighbours;
  for (const CellLevel& level : servingCarrier().levels()) {
    if (level.cell == servingCell()) continue;
    const bool isTooWeak = level.level < kWeakestNeighbour && !neighbours.empty();
    if (isTooWeak || neighbours.size() == kMostNeighbours) break;
    neighbours.push_back(servingCarrier().neighbour(level.cell));
  }
  return neighbours;
}

}  // namespace kestro
