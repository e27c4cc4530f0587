// SPDX-License-Identifier: MIT
#include "Sources/C2K/C2KSimulation.h"

#include <algorithm>

#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

// How often the system is said again and the counters are reported, in steps.
constexpr unsigned kSystemSteps = 4;
constexpr unsigned kCounterSteps = 2;

constexpr std::chrono::milliseconds kFrame{20};

/// The counter of the rate at which a sector sends to a phone that receives it so well.
std::size_t forwardCounter(double carrierToInterference) {
  constexpr double kSlowestLevel = -12;
  constexpr double kFastestLevel = 12;
  const auto counters = forwardPacketCounters();
  const double place = (carrierToInterference - kSlowestLevel) / (kFastestLevel - kSlowestLevel);
  const auto last = static_cast<double>(counters.size() - 1);
  return counters[static_cast<std::size_t>(std::clamp(place * last, 0.0, last))];
}

}  // namespace

std::string_view C2KSimulation::technology() const { return kTqLogChannelTechnology_Ondrel_CDMA; }

std::vector<Bytes> C2KSimulation::step(std::chrono::milliseconds elapsed, Moment now) {
  if (elapsed.count() != 0) _phone.advance(elapsed);
  PacketList packets;
  addOneX(packets, now);
  addEVDO(packets, now);
  count(elapsed);
  if (_steps % kCounterSteps == 0) {
    packets.add(_forward.packet(now));
    packets.add(_reverse.packet(now));
  }
  ++_steps;
  return packets.take();
}

void C2KSimulation::addOneX(PacketList& packets, Moment now) {
  const std::vector<C2KPilot> pilots = _phone.oneXPilots();
  packets.add(oneXStatus(_phone.oneXReport(pilots), now));
  if (_phone.oneX().isInTraffic()) {
    for (auto time = kFrame; time <= kSimulationStep; time += kFrame) {
      packets.add(oneXTrafficFrame(_phone.receivesBadFrame(), now));
    }
  }
  if (_phone.hasNewCell() || _steps % kSystemSteps == 0) {
    packets.add(oneXSystemParameters(_phone.system(), now));
  }
}

void C2KSimulation::addEVDO(PacketList& packets, Moment now) {
  packets.add(evdoStatus(_phone.evdoReport(), now));
  packets.add(evdoActiveSet(_phone.evdoPilots(), now));
  packets.add(evdoFingers(_phone.fingers(), now));
}

void C2KSimulation::count(std::chrono::milliseconds elapsed) {
  const double seconds = std::chrono::duration<double>(elapsed).count();
  _forward.send(forwardCounter(_phone.carrierToInterference()), _phone.forwardRate() * seconds);
  _reverse.send(reversePacketCounter(_phone.reverseRate()), _phone.reverseRate() * seconds);
}

}  // namespace kestro
