// SPDX-License-Identifier: MIT
#include "Sources/UTRAN/UTRANPhone.h"

#include <algorithm>
#include <cmath>

#include "Sources/World/Noise.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

// The frequencies around 2012 MHz, in units of 200 kHz; neighbouring sectors use different ones.
constexpr unsigned kUarfcns[] = {10055, 10063, 10071};

// Thermal noise and the receiver's own.
constexpr double kTddNoise = -106;
// What spreading gains, how much of a jointly detected cell's interference is taken away, and how
// far below itself a signal disturbs itself by its echoes.
constexpr double kSpreadingGain = 9;
constexpr double kDetectionGain = 8;
constexpr double kEchoLoss = 8;
constexpr std::size_t kMostJointlyDetected = 4;

// Where power control keeps a dedicated channel.
constexpr double kTargetSir = 9;

constexpr double kWeakestCell = -112;
constexpr std::size_t kMostCells = 7;
constexpr std::size_t kMostGSMCells = 6;

// Channels, and the timeslots that carry them: the first is the common one, the last three go down.
constexpr unsigned kCommonTimeslot = 0;
constexpr unsigned kSignallingTimeslot = 4;
constexpr unsigned kDataTimeslot = 5;

RadioLayerParameters radioParameters(std::uint64_t seed) {
  return {.seed = hashed(seed, 21), .frequency = 2012, .power = 44, .sites = RingRoad::allSites()};
}

RadioLayerParameters gsmLayerParameters(std::uint64_t seed) {
  return {.seed = hashed(seed, 22),
          .frequency = 900,
          .power = 47,
          .shadowDeviation = 5,
          .sites = RingRoad::allSites()};
}

/// Of a channel that is received so well.
double blockErrorRate(double sir) { return std::clamp(std::pow(10, -sir / 5), 1e-4, 0.5); }

}  // namespace

// --- UTRANConnection -----------------------------------------------------------------------------

void UTRANConnection::advance(milliseconds time, Activity activity) noexcept {
  _inMode += time;
  const UTRANMode mode = next(activity);
  if (mode == _mode) return;
  _mode = mode;
  _inMode = {};
}

UTRANMode UTRANConnection::next(Activity activity) const noexcept {
  constexpr milliseconds kSetUp{500};
  constexpr milliseconds kInCellPch{4'000};
  constexpr milliseconds kInUraPch{6'000};
  const bool isTransfer = activity == Activity::Transfer;
  switch (_mode) {
    case UTRANMode::Disconnected:
      return isTransfer ? UTRANMode::Connecting : _mode;
    case UTRANMode::Connecting:
      return _inMode >= kSetUp ? UTRANMode::Dch : _mode;
    case UTRANMode::Dch:
      return isTransfer ? _mode : UTRANMode::Fach;
    case UTRANMode::Fach:
      if (isTransfer) return _inMode >= kSetUp ? UTRANMode::Dch : _mode;
      return activity == Activity::Idle ? UTRANMode::CellPch : _mode;
    case UTRANMode::CellPch:
      if (isTransfer) return UTRANMode::Fach;
      return _inMode >= kInCellPch ? UTRANMode::UraPch : _mode;
    case UTRANMode::UraPch:
      if (isTransfer) return UTRANMode::Fach;
      return _inMode >= kInUraPch ? UTRANMode::Disconnected : _mode;
  }
  return _mode;
}

// --- UTRANPhone ----------------------------------------------------------------------------------

UTRANPhone::UTRANPhone(std::uint64_t seed)
    : _seed(seed),
      _drive(hashed(seed, 0)),
      _radio(radioParameters(seed)),
      _gsm(gsmLayerParameters(seed)),
      _session(hashed(seed, 4)) {
  advance(milliseconds(0));
}

void UTRANPhone::advance(milliseconds time) {
  _drive.advance(time);
  _session.advance(time);
  _connection.advance(time, _session.activity());
  _levels = _radio.levels(_drive);
  _gsmLevels = _gsm.levels(_drive);
  _hasNewCell = _selection.update(_levels, time);
  measureInterference();
  transfer(time);
}

UTRANCell UTRANPhone::cell(std::size_t index) const {
  const auto [site, sector] = _radio.cells()[index];
  return {.uarfcn = kUarfcns[(site + sector) % std::size(kUarfcns)],
          .parameterId = (7 * site + 40 * sector + 3) % 128,
          .cellIdentity = (12U << 16) + 30'000 + 10 * site + sector,
          .locationArea = site < RingRoad::kSites / 2 ? 601U : 602U,
          .registrationArea = 1 + site / 4};
}

bool UTRANPhone::isListed(std::size_t index) const {
  const unsigned site = _radio.cells()[index].site;
  const unsigned servingSite = _radio.cells()[_selection.serving()].site;
  const unsigned between = (site + RingRoad::kSites - servingSite) % RingRoad::kSites;
  return between <= 1 || between == RingRoad::kSites - 1;
}

void UTRANPhone::measureInterference() {
  const std::size_t serving = _selection.serving();
  const double servingLevel = levelOfCell(_levels, serving).level;
  PowerSum interference;
  interference.add(kTddNoise);
  interference.add(servingLevel - kEchoLoss);
  _jointlyDetected = {serving};
  for (const auto& [index, level, distance] : _levels) {
    if (index == serving || cell(index).uarfcn != cell(serving).uarfcn) continue;
    const bool isDetected = _jointlyDetected.size() < kMostJointlyDetected;
    if (isDetected) _jointlyDetected.push_back(index);
    interference.add(level - (isDetected ? kDetectionGain : 0));
  }
  _commonSir = servingLevel - interference.level() + kSpreadingGain;
}

UTRANCellReport UTRANPhone::report(const CellLevel& level, UTRANSet set) const {
  const UTRANCell measured = cell(level.cell);
  return {.uarfcn = measured.uarfcn,
          .parameterId = measured.parameterId,
          .rscp = level.level,
          .set = set,
          .isJointlyDetected =
              std::ranges::find(_jointlyDetected, level.cell) != _jointlyDetected.end()};
}

std::vector<UTRANCellReport> UTRANPhone::cells() const {
  const std::size_t serving = _selection.serving();
  std::vector<UTRANCellReport> reports{report(levelOfCell(_levels, serving), UTRANSet::Active)};
  for (const CellLevel& level : _levels) {
    if (reports.size() == kMostCells || level.level < kWeakestCell) break;
    if (level.cell == serving) continue;
    // On other frequencies the phone measures only what it was told to.
    const bool isFound = cell(level.cell).uarfcn == cell(serving).uarfcn;
    if (isListed(level.cell)) {
      reports.push_back(report(level, UTRANSet::Monitored));
    } else if (isFound) {
      reports.push_back(report(level, UTRANSet::Detected));
    }
  }
  return reports;
}

std::vector<UTRANGSMCellReport> UTRANPhone::gsmCells() const {
  std::vector<UTRANGSMCellReport> reports;
  for (const CellLevel& level : _gsmLevels) {
    if (reports.size() == kMostGSMCells) break;
    const auto [site, sector] = _gsm.cells()[level.cell];
    reports.push_back({.cellId = 1'000 + 10 * site + sector,
                       .arfcn = 42 + (5 * site + 7 * sector) % 24,
                       .bsic = 8 * (site % 3 + 1) + (site + 3 * sector) % 8,
                       .level = level.level});
  }
  return reports;
}

// --- Channels ------------------------------------------------------------------------------------

double UTRANPhone::dedicatedSir() const noexcept {
  constexpr double kDeviation = 0.8;
  const SmoothNoise control(hashed(_seed, 23), 3);
  return std::min(_commonSir, kTargetSir) + kDeviation * control.at(_drive.seconds());
}

std::vector<UTRANTransportChannel> UTRANPhone::transportChannels() const {
  constexpr unsigned kPaging = 1;
  constexpr unsigned kForwardAccess = 2;
  constexpr unsigned kSpeechOrData = 5;
  constexpr unsigned kSignalling = 24;
  const double common = blockErrorRate(_commonSir);
  if (mode() == UTRANMode::Dch) {
    const double dedicated = blockErrorRate(dedicatedSir());
    return {{kSpeechOrData, dedicated}, {kSignalling, dedicated / 4}};
  }
  if (mode() == UTRANMode::Fach || mode() == UTRANMode::Connecting) {
    return {{kPaging, common / 2}, {kForwardAccess, common}};
  }
  return {{kPaging, common / 2}};
}

UTRANCodedChannel UTRANPhone::codedChannel(unsigned id, unsigned timeslot, double sir) const {
  constexpr double kMeasurementSeconds = 0.08;
  constexpr double kDeviation = 0.7;
  const SmoothNoise noise(hashed(_seed, 30 + timeslot), 0.2);
  UTRANCodedChannel channel{.id = id, .timeslot = timeslot, .sir = {}};
  double time = _drive.seconds();
  for (double& measured : channel.sir) {
    measured = sir + kDeviation * noise.at(time);
    time += kMeasurementSeconds;
  }
  return channel;
}

std::vector<UTRANCodedChannel> UTRANPhone::codedChannels() const {
  if (mode() != UTRANMode::Dch) return {codedChannel(1, kCommonTimeslot, _commonSir)};
  return {codedChannel(1, kSignallingTimeslot, dedicatedSir()),
          codedChannel(2, kDataTimeslot, dedicatedSir() - 1)};
}

void UTRANPhone::transfer(milliseconds time) {
  if (mode() != UTRANMode::Dch) return;
  constexpr double kHertz = 1.28e6;
  const double bitsPerHertz = std::log2(1 + std::pow(10, (_commonSir - kSpreadingGain) / 10));
  const double bits =
      std::min(bitsPerHertz, 2.0) * kHertz * std::chrono::duration<double>(time).count();
  _downlinkBytes += bits / 8;
  _uplinkBytes += bits / 50;
}

}  // namespace kestro
