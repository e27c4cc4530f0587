// SPDX-License-Identifier: MIT
#include "Sources/World/SimulatedPhone.h"

#include <algorithm>
#include <cmath>

namespace kestro {
namespace {

using std::chrono::milliseconds;

// Thermal noise and the receiver's own, in the bandwidth of each system.
constexpr double kUMTSNoise = -100;
constexpr double kGSMNoise = -113;
// A UMTS cell radiates so much more than its pilot, as the traffic that it carries comes and goes.
constexpr double kUMTSTraffic = 5;
constexpr double kUMTSTrafficSpread = 1.5;
// GSM cells reuse their channels; of what the others radiate so much less is on this one.
constexpr double kGSMReuse = 21;

/// The masts beyond the town's edge carry GSM only.
std::vector<unsigned> sitesWithUMTS() {
  std::vector<unsigned> sites;
  for (unsigned site = 0; site < RingRoad::kSites; ++site) {
    if (site < 4 || site > 7) sites.push_back(site);
  }
  return sites;
}

RadioLayerParameters umtsParameters(std::uint64_t seed) {
  return {.seed = hashed(seed, 1), .frequency = 2100, .power = 44, .sites = sitesWithUMTS()};
}

RadioLayerParameters gsmParameters(std::uint64_t seed) {
  return {.seed = hashed(seed, 2),
          .frequency = 900,
          .power = 47,
          .shadowDeviation = 5,
          .sites = RingRoad::allSites()};
}

/// What a cell of this quality can carry, kbit/s.
double downlinkCapacity(RadioAccess access, double quality) {
  if (access == RadioAccess::UMTS) return 21'000 * std::pow(10, (quality + 1) / 8);
  return std::clamp(12.0 * quality, 20.0, 236.8);
}

}  // namespace

void DataSession::advance(milliseconds time) {
  _left -= time;
  if (_left > milliseconds(0)) return;
  const double random = hashedFraction(_seed, _phases++);
  const auto between = [random](double shortest, double longest) {
    return milliseconds(std::llround((shortest + (longest - shortest) * random) * 1000));
  };
  switch (_activity) {
    case Activity::Idle:
      _activity = Activity::Transfer;
      _left = between(15, 70);
      break;
    case Activity::Transfer:
      _activity = Activity::Tail;
      _left = between(4, 8);
      break;
    case Activity::Tail:
      _activity = Activity::Idle;
      _left = between(6, 25);
      break;
  }
}

SimulatedPhone::SimulatedPhone(std::uint64_t seed)
    : _drive(hashed(seed, 0)),
      _umts(umtsParameters(seed)),
      _gsm(gsmParameters(seed)),
      _load(hashed(seed, 3), 8),
      _session(hashed(seed, 4)) {
  advance(milliseconds(0));
}

void SimulatedPhone::advance(milliseconds time) {
  _drive.advance(time);
  _session.advance(time);
  _umtsLevels = _umts.levels(_drive);
  _gsmLevels = _gsm.levels(_drive);
  const double traffic = kUMTSTraffic + kUMTSTrafficSpread * _load.at(_drive.seconds());
  PowerSum total;
  total.add(kUMTSNoise);
  for (const auto& cell : _umtsLevels) total.add(cell.level + traffic);
  _umtsTotal = total.level();
  chooseAccess(time);
  chooseCell(time);
  measure();
  transfer(time);
}

void SimulatedPhone::chooseAccess(milliseconds time) {
  constexpr double kTooWeak = -103;
  constexpr double kStrongAgain = -96;
  const double strongest = _umtsLevels.front().level;
  const bool isUMTS = _access == RadioAccess::UMTS;
  const bool otherIsBetter = isUMTS ? strongest < kTooWeak : strongest > kStrongAgain;
  _otherIsBetter = otherIsBetter ? _otherIsBetter + time : milliseconds(0);
  if (_otherIsBetter < (isUMTS ? milliseconds(2'000) : milliseconds(5'000))) return;
  _otherIsBetter = {};
  _access = isUMTS ? RadioAccess::GSM : RadioAccess::UMTS;
  (isUMTS ? _gsmSelection : _umtsSelection).reset();
  ++_accessChanges;
}

void SimulatedPhone::chooseCell(milliseconds time) {
  const bool isUMTS = _access == RadioAccess::UMTS;
  const bool changed =
      isUMTS ? _umtsSelection.update(_umtsLevels, time) : _gsmSelection.update(_gsmLevels, time);
  if (isUMTS) _activeSet.update(_umtsLevels);
  if (!changed) return;
  if (_drive.seconds() > 0) ++_cellChanges;
  _inCellSince = _drive.seconds();
}

std::size_t SimulatedPhone::servingCell() const {
  return _access == RadioAccess::UMTS ? _umtsSelection.serving() : _gsmSelection.serving();
}

void SimulatedPhone::measure() {
  if (_access == RadioAccess::UMTS) {
    const auto& serving = levelOfCell(_umtsLevels, servingCell());
    _quality = {.level = serving.level,
                .quality = energyOverNoise(serving.level),
                .total = _umtsTotal,
                .distance = serving.distance};
    return;
  }
  const auto& serving = levelOfCell(_gsmLevels, servingCell());
  PowerSum interference;
  interference.add(kGSMNoise);
  for (const auto& cell : _gsmLevels) {
    if (cell.cell != serving.cell) interference.add(cell.level - kGSMReuse);
  }
  PowerSum total;
  total.add(serving.level);
  total.add(interference.level());
  _quality = {.level = serving.level,
              .quality = serving.level - interference.level(),
              .total = total.level(),
              .distance = serving.distance};
}

void SimulatedPhone::transfer(milliseconds time) {
  _downlinkRate = 0;
  _uplinkRate = 0;
  if (activity() == Activity::Transfer) {
    const double share = std::clamp(0.6 + 0.15 * _load.at(_drive.seconds()), 0.1, 1.0);
    _downlinkRate = share * downlinkCapacity(_access, _quality.quality);
    _uplinkRate = _downlinkRate * (_access == RadioAccess::UMTS ? 0.12 : 0.3);
  }
  const double seconds = std::chrono::duration<double>(time).count();
  _downlinkBytes += _downlinkRate * 1000 / 8 * seconds;
  _uplinkBytes += _uplinkRate * 1000 / 8 * seconds;
}

}  // namespace kestro
