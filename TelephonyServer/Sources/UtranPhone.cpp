// SPDX-License-Identifier: MIT
#include "TelephonyServer/Sources/UtranPhone.h"

#include <algorithm>
#include <cmath>

#include "TelephonyServer/Sources/Noise.h"

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
constexpr std::size_t kMostGsmCells = 6;

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

std::string_view utranModeName(UtranMode mode) noexcept {
  switch (mode) {
    case UtranMode::Disconnected:
      return "Disconnected";
    case UtranMode::Connecting:
      return "Connecting";
    case UtranMode::Fach:
      return "Cell Fach";
    case UtranMode::Dch:
      return "Cell DCH";
    case UtranMode::CellPch:
      return "Cell PCH";
    case UtranMode::UraPch:
      break;
  }
  return "Cell URA PCH";
}

// --- UtranConnection -----------------------------------------------------------------------------

void UtranConnection::advance(milliseconds time, Activity activity) noexcept {
  _inMode += time;
  const UtranMode mode = next(activity);
  if (mode == _mode) return;
  _mode = mode;
  _inMode = {};
}

UtranMode UtranConnection::next(Activity activity) const noexcept {
  constexpr milliseconds kSetUp{500};
  constexpr milliseconds kInCellPch{4'000};
  constexpr milliseconds kInUraPch{6'000};
  const bool isTransfer = activity == Activity::Transfer;
  switch (_mode) {
    case UtranMode::Disconnected:
      return isTransfer ? UtranMode::Connecting : _mode;
    case UtranMode::Connecting:
      return _inMode >= kSetUp ? UtranMode::Dch : _mode;
    case UtranMode::Dch:
      return isTransfer ? _mode : UtranMode::Fach;
    case UtranMode::Fach:
      if (isTransfer) return _inMode >= kSetUp ? UtranMode::Dch : _mode;
      return activity == Activity::Idle ? UtranMode::CellPch : _mode;
    case UtranMode::CellPch:
      if (isTransfer) return UtranMode::Fach;
      return _inMode >= kInCellPch ? UtranMode::UraPch : _mode;
    case UtranMode::UraPch:
      if (isTransfer) return UtranMode::Fach;
      return _inMode >= kInUraPch ? UtranMode::Disconnected : _mode;
  }
  return _mode;
}

// --- UtranPhone ----------------------------------------------------------------------------------

UtranPhone::UtranPhone(std::uint64_t seed)
    : _seed(seed),
      _drive(hashed(seed, 0)),
      _radio(radioParameters(seed)),
      _gsm(gsmLayerParameters(seed)),
      _session(hashed(seed, 4)) {
  advance(milliseconds(0));
}

void UtranPhone::advance(milliseconds time) {
  _drive.advance(time);
  _session.advance(time);
  _connection.advance(time, _session.activity());
  _levels = _radio.levels(_drive);
  _gsmLevels = _gsm.levels(_drive);
  _hasNewCell = _selection.update(_levels, time);
  measureInterference();
  transfer(time);
}

UtranCell UtranPhone::cell(std::size_t index) const {
  const auto [site, sector] = _radio.cells()[index];
  return {.uarfcn = kUarfcns[(site + sector) % std::size(kUarfcns)],
          .parameterId = (7 * site + 40 * sector + 3) % 128,
          .cellIdentity = (12U << 16) + 30'000 + 10 * site + sector,
          .locationArea = site < RingRoad::kSites / 2 ? 601U : 602U,
          .registrationArea = 1 + site / 4};
}

bool UtranPhone::isListed(std::size_t index) const {
  const unsigned site = _radio.cells()[index].site;
  const unsigned servingSite = _radio.cells()[_selection.serving()].site;
  const unsigned between = (site + RingRoad::kSites - servingSite) % RingRoad::kSites;
  return between <= 1 || between == RingRoad::kSites - 1;
}

void UtranPhone::measureInterference() {
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

UtranCellReport UtranPhone::report(const CellLevel& level, UtranSet set) const {
  const UtranCell measured = cell(level.cell);
  return {.uarfcn = measured.uarfcn,
          .parameterId = measured.parameterId,
          .rscp = level.level,
          .set = set,
          .isJointlyDetected =
              std::ranges::find(_jointlyDetected, level.cell) != _jointlyDetected.end()};
}

std::vector<UtranCellReport> UtranPhone::cells() const {
  const std::size_t serving = _selection.serving();
  std::vector<UtranCellReport> reports{report(levelOfCell(_levels, serving), UtranSet::Active)};
  for (const CellLevel& level : _levels) {
    if (reports.size() == kMostCells || level.level < kWeakestCell) break;
    if (level.cell == serving) continue;
    // On other frequencies the phone measures only what it was told to.
    const bool isFound = cell(level.cell).uarfcn == cell(serving).uarfcn;
    if (isListed(level.cell)) {
      reports.push_back(report(level, UtranSet::Monitored));
    } else if (isFound) {
      reports.push_back(report(level, UtranSet::Detected));
    }
  }
  return reports;
}

std::vector<UtranGsmCellReport> UtranPhone::gsmCells() const {
  std::vector<UtranGsmCellReport> reports;
  for (const CellLevel& level : _gsmLevels) {
    if (reports.size() == kMostGsmCells) break;
    const auto [site, sector] = _gsm.cells()[level.cell];
    reports.push_back({.cellId = 1'000 + 10 * site + sector,
                       .arfcn = 42 + (5 * site + 7 * sector) % 24,
                       .bsic = 8 * (site % 3 + 1) + (site + 3 * sector) % 8,
                       .level = level.level});
  }
  return reports;
}

// --- Channels ------------------------------------------------------------------------------------

double UtranPhone::dedicatedSir() const noexcept {
  constexpr double kDeviation = 0.8;
  const SmoothNoise control(hashed(_seed, 23), 3);
  return std::min(_commonSir, kTargetSir) + kDeviation * control.at(_drive.seconds());
}

std::vector<UtranTransportChannel> UtranPhone::transportChannels() const {
  constexpr unsigned kPaging = 1;
  constexpr unsigned kForwardAccess = 2;
  constexpr unsigned kSpeechOrData = 5;
  constexpr unsigned kSignalling = 24;
  const double common = blockErrorRate(_commonSir);
  if (mode() == UtranMode::Dch) {
    const double dedicated = blockErrorRate(dedicatedSir());
    return {{kSpeechOrData, dedicated}, {kSignalling, dedicated / 4}};
  }
  if (mode() == UtranMode::Fach || mode() == UtranMode::Connecting) {
    return {{kPaging, common / 2}, {kForwardAccess, common}};
  }
  return {{kPaging, common / 2}};
}

UtranCodedChannel UtranPhone::codedChannel(unsigned id, unsigned timeslot, double sir) const {
  constexpr double kMeasurementSeconds = 0.08;
  constexpr double kDeviation = 0.7;
  const SmoothNoise noise(hashed(_seed, 30 + timeslot), 0.2);
  UtranCodedChannel channel{.id = id, .timeslot = timeslot, .sir = {}};
  double time = _drive.seconds();
  for (double& measured : channel.sir) {
    measured = sir + kDeviation * noise.at(time);
    time += kMeasurementSeconds;
  }
  return channel;
}

std::vector<UtranCodedChannel> UtranPhone::codedChannels() const {
  if (mode() != UtranMode::Dch) return {codedChannel(1, kCommonTimeslot, _commonSir)};
  return {codedChannel(1, kSignallingTimeslot, dedicatedSir()),
          codedChannel(2, kDataTimeslot, dedicatedSir() - 1)};
}

void UtranPhone::transfer(milliseconds time) {
  if (mode() != UtranMode::Dch) return;
  constexpr double kHertz = 1.28e6;
  const double bitsPerHertz = std::log2(1 + std::pow(10, (_commonSir - kSpreadingGain) / 10));
  const double bits =
      std::min(bitsPerHertz, 2.0) * kHertz * std::chrono::duration<double>(time).count();
  _downlinkBytes += bits / 8;
  _uplinkBytes += bits / 50;
}

}  // namespace kestro
