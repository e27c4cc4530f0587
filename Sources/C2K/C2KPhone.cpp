// SPDX-License-Identifier: MIT
#include "Sources/C2K/C2KPhone.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Sources/World/Noise.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;

// Thermal noise and the receiver's own; what a receiver that is off reports.
constexpr double kNoise = -106;

constexpr std::size_t kFingers = 6;

// The forward link's chip rate, and its fastest and slowest rates, bit/s.
constexpr double kHertz = 1.2288e6;
constexpr double kFastest = 3.072e6;
constexpr double kSlowest = 38'400;
constexpr double kFastestReverse = 1.8432e6;

/// A part of each sector's power is its pilot.
C2KCarrier::Parameters oneXParameters(std::uint64_t seed) {
  return {.radio = {.seed = hashed(seed, 31),
                    .frequency = 881,
                    .power = 44,
                    .sites = RingRoad::allSites()},
          .channel = {.bandClass = 0, .number = 283},
          .traffic = 5.5,
          .hysteresis = 3};
}

/// Pilots come in bursts of full power.
C2KCarrier::Parameters evdoParameters(std::uint64_t seed) {
  return {.radio = {.seed = hashed(seed, 32),
                    .frequency = 881,
                    .power = 50,
                    .sites = RingRoad::allSites()},
          .channel = {.bandClass = 0, .number = 201},
          .traffic = 0,
          .hysteresis = 2};
}

/// The masts of another operator.
bool isPartners(const SimulatedCell& cell) { return cell.site >= 8 && cell.site < 12; }

double linear(double decibels) { return std::pow(10, decibels / 10); }

/// What a phone sends that hears so much.
double transmitPower(double received) { return std::clamp(-73 - received, -50.0, 23.0); }

}  // namespace

// --- C2KCarrier ---------------------------------------------------------------------------------

C2KCarrier::C2KCarrier(Parameters parameters)
    : _parameters(std::move(parameters)),
      _radio(_parameters.radio),
      _selection(_parameters.hysteresis, milliseconds(500)) {}

bool C2KCarrier::measure(const Drive& drive, milliseconds time) {
  _levels = _radio.levels(drive);
  PowerSum total;
  total.add(kNoise);
  for (const CellLevel& level : _levels) total.add(level.level + _parameters.traffic);
  _total = total.level();
  _handover.update(_levels);
  return _selection.update(_levels, time);
}

const SimulatedCell& C2KCarrier::servingCell() const {
  return _radio.cells()[_selection.serving()];
}

C2KPilot C2KCarrier::pilot(std::size_t index) const {
  const auto [site, sector] = _radio.cells()[index];
  return {.pnOffset = 4 + 8 * site + 168 * sector,
          .energy = levelOfCell(_levels, index).level - _total};
}

std::vector<C2KPilot> C2KCarrier::pilots() const {
  std::vector<C2KPilot> pilots{pilot(_selection.serving())};
  for (const CellLevel& level : _levels) {
    const bool isOther = level.cell != _selection.serving() && _handover.contains(level.cell);
    if (isOther && pilots.size() < SoftHandoverSet::kMaximumSize) {
      pilots.push_back(pilot(level.cell));
    }
  }
  return pilots;
}

double C2KCarrier::carrierToInterference(const C2KPilot& pilot) const {
  const double carrier = linear(pilot.energy);
  return 10 * std::log10(carrier / (1 - carrier));
}

// --- C2KPhone ------------------------------------------------------------------------------------

C2KPhone::C2KPhone(std::uint64_t seed)
    : _drive(hashed(seed, 0)),
      _session(hashed(seed, 4)),
      _load(hashed(seed, 3), 8),
      _frameSeed(hashed(seed, 33)),
      _oneXCarrier(oneXParameters(seed)),
      _evdoCarrier(evdoParameters(seed)),
      _oneX(hashed(seed, 34)) {
  advance(milliseconds(0));
}

void C2KPhone::advance(milliseconds time) {
  _drive.advance(time);
  _session.advance(time);
  _oneX.advance(time);
  _evdo.advance(time, _oneX.isIdle(), _session.activity());
  _hasNewCell = _oneXCarrier.measure(_drive, time);
  _evdoCarrier.measure(_drive, time);
  transfer();
}

void C2KPhone::transfer() {
  _forwardRate = 0;
  _reverseRate = 0;
  const bool isOpen = _evdo.isConnected() && _evdo.session() == EVDOSession::Open;
  if (!isOpen || _session.activity() != Activity::Transfer) return;
  const double share = std::clamp(0.6 + 0.15 * _load.at(_drive.seconds()), 0.1, 1.0);
  const double capacity = kHertz * std::log2(1 + linear(carrierToInterference()));
  _forwardRate = share * std::clamp(capacity, kSlowest, kFastest);
  _reverseRate = std::min(20'000 + 0.2 * _forwardRate, kFastestReverse);
}

double C2KPhone::secondReceivePower(double first) const {
  return first - 1.5 + _load.at(_drive.seconds() * 4);
}

// --- 1x

std::vector<C2KPilot> C2KPhone::oneXPilots() const {
  if (!_oneX.hasPilot()) return {};
  std::vector<C2KPilot> pilots = _oneXCarrier.pilots();
  if (!_oneX.isInTraffic()) pilots.resize(1);
  return pilots;
}

OneXReport C2KPhone::oneXReport(std::span<const C2KPilot> activeSet) const {
  const double received = _oneXCarrier.total();
  // Power control keeps the calls at the base station at one level.
  const double control = 2 * _load.at(_drive.seconds() * 8);
  return {.state = _oneX.state(),
          .channel = _oneXCarrier.channel(),
          .receivePower = {received, secondReceivePower(received)},
          .transmitPower = transmitPower(received) + control,
          .activeSet = activeSet};
}

OneXSystem C2KPhone::system() const {
  const SimulatedCell& cell = _oneXCarrier.servingCell();
  const bool isRoaming = isPartners(cell);
  return {.systemId = isRoaming ? 4160U : 4139U,
          .networkId = isRoaming ? 3U : 1U,
          .baseStationId = 3'000 + 10 * cell.site + cell.sector,
          .packetZoneId = 1 + cell.site / 4,
          .isRoaming = isRoaming};
}

bool C2KPhone::receivesBadFrame() {
  constexpr double kUsualRate = 0.03;
  constexpr double kUsualEnergy = -9;
  constexpr double kDecade = 8;  // dB
  double sum = 0;
  for (const C2KPilot& pilot : _oneXCarrier.pilots()) sum += linear(pilot.energy);
  const double energy = 10 * std::log10(sum);
  const double rate = kUsualRate * std::pow(10, (kUsualEnergy - energy) / kDecade);
  return hashedFraction(_frameSeed, _frames++) < std::clamp(rate, 0.002, 0.3);
}

// --- EV-DO

std::vector<C2KPilot> C2KPhone::evdoPilots() const {
  return _evdo.hasPilot() ? _evdoCarrier.pilots() : std::vector<C2KPilot>();
}

double C2KPhone::carrierToInterference() const {
  return _evdoCarrier.carrierToInterference(_evdoCarrier.pilots().front());
}

std::vector<std::optional<C2KPilot>> C2KPhone::fingers() const {
  constexpr double kEchoLoss = 7;
  std::vector<std::optional<C2KPilot>> fingers(kFingers);
  std::size_t next = 0;
  for (const C2KPilot& pilot : evdoPilots()) {
    const double level = _evdoCarrier.carrierToInterference(pilot);
    fingers[next++] = C2KPilot{pilot.pnOffset, level};
    // The serving pilot's echo comes and goes; its finger stays reserved for it.
    if (next != 1) continue;
    const bool hasEcho = _load.at(_drive.seconds() * 2) > -0.5;
    if (hasEcho) fingers[next] = C2KPilot{pilot.pnOffset, level - kEchoLoss};
    ++next;
  }
  return fingers;
}

EVDOReport C2KPhone::evdoReport() const {
  constexpr std::uint32_t kAddress = 0x2A51C7;
  const bool isOn = _evdo.state() != EVDOState::Inactive;
  const bool hasAddress = _evdo.session() != EVDOSession::Closed;
  const double received = isOn ? _evdoCarrier.total() : kNoise;
  EVDOReport report{.deviceState = _evdo.state(),
                    .sessionState = _evdo.session(),
                    .channel = _evdoCarrier.channel(),
                    .receivePower = {received, secondReceivePower(received)},
                    .transmitPower = transmitPower(received),
                    .address = hasAddress ? kAddress : 0};
  if (hasAddress) report.colorCode = isPartners(_evdoCarrier.servingCell()) ? 23 : 17;
  if (_evdo.hasPilot()) report.servingPilot = _evdoCarrier.pilots().front().pnOffset;
  return report;
}

}  // namespace kestro
