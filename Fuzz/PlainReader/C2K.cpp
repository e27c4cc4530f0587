// SPDX-License-Identifier: MIT
// The packets of the CDMA2000 channel.
#include <algorithm>
#include <array>
#include <cmath>
#include <iterator>
#include <optional>

#include "Fuzz/PlainReader/PlainReader.h"

namespace kestro::plain {
namespace {

constexpr std::uint32_t kC2KCodes[] = {0x108A, 0x1183, 0x1192, 0x12B6,
                                       0x119C, 0x119D, 0x127E, 0x134F};
constexpr std::string_view kLookupNames[] = {"kChannel",         "k1xEVDODeviceState",
                                             "kBandClass",       "kRxAGC0",
                                             "kRxAGC1",          "kTxAGC",
                                             "kServingPNOffset", "kSessionState",
                                             "kUATI24",          "kColorCode",
                                             "kActiveSetPilots", "kFingerC2I",
                                             "k1xDeviceState",   "k1xRx0BandClass",
                                             "k1xRx0ChanNum",    "k1xRxAGC0",
                                             "k1xRx1BandClass",  "k1xRx1ChanNum",
                                             "k1xRxAGC1",        "k1xTxAGC",
                                             "k1xActiveSetInfo", "k1xTrafficFER",
                                             "k1xRoamingHome",   "kSystemId",
                                             "kNetworkId",       "kPacketZoneId",
                                             "kBaseId",          "kProtocolRevision",
                                             "kFLDataRate",      "kRLDataRate"};

constexpr std::string_view kEVDOStates[] = {"Inactive [0]", "Acquisition [1]", "Sync [2]",
                                            "Idle [3]",     "Access [4]",      "Connected [5]"};
constexpr std::string_view kSessionStates[] = {
    "Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]", "Open [4]"};
constexpr std::string_view kOneXStates[] = {"Inactive [0]",
                                            "Deep sleep in start state [1]",
                                            "Initial state for CDMA operation [2]",
                                            "Acquisition [3]",
                                            "Sync [4]",
                                            "Slew [5]",
                                            "Paging [6]",
                                            "Slotted mode sleep state [7]",
                                            "Traffic [8]",
                                            "UnSlew [9]",
                                            "Operation in PCG state [10]",
                                            "Powerup state [11]"};
constexpr std::string_view kBands[] = {"800 MHz cellular band [0]",
                                       "1.8 to 2.0GHz PCS band [1]",
                                       "872 to 960MHz TACS band [2]",
                                       "832 to 925MHz JTACS band [3]",
                                       "1.75 to 1.87GHz Korean PCS band [4]",
                                       "450MHz band [5]",
                                       "2GHz band [6]",
                                       "700MHz band [7]",
                                       "1800 MHz band [8]",
                                       "900 MHzband [9]",
                                       "Secondary 800 MHz band [10]",
                                       "400 MHz European PAMR band [11]",
                                       "800 MHz European PAMR band [12]"};
constexpr std::string_view kRoaming[] = {"OFF [0]",
                                         "ON [1]",
                                         "Flashing [2]",
                                         "Out of Neighborhood [3]",
                                         "Out of Building [4]",
                                         "Preferred system [5]",
                                         "Available system [6]",
                                         "Alliance partner [7]",
                                         "Premium partner [8]",
                                         "Full service functionality [9]",
                                         "Partial service functionality [10]",
                                         "Banner ON [11]",
                                         "Banner OFF [12]"};

std::string bandText(int band) {
  return std::string(
      nameOf(static_cast<std::uint32_t>(band), kBands, text("[Bad Value %d]", band)));
}

std::string energyText(int linear) { return text("%+.2f dB", 10 * std::log10(linear / 512.0)); }

std::string receivePower(int raw) { return text("%+.2f dBm", raw * 334 / 1000.0 - 63.248); }

/// Where the sub-packet with an id starts; nothing when it is missing or a size is bad.
std::optional<std::size_t> subPacket(const Packet& packet, int id) {
  std::size_t start = 17;
  for (int i = 0; i < packet.byte(14); ++i) {
    const std::size_t next = start + static_cast<std::size_t>(packet.half(start + 2));
    if (next >= packet.size() + 17) return std::nullopt;
    if (packet.byte(start) == id) return start;
    start = next;
  }
  return std::nullopt;
}

Dictionary emptyPilots() { return {{"_sorted", "_sorted"}}; }

Value pilotsOrNone(const Dictionary& pilots) {
  if (pilots.size() == 1) return "(none)";
  return pilots;
}

/// The rate between two packets of one link.
struct Throughput {
  std::optional<std::uint32_t> sequence;
  std::int64_t sent = 0;
};

class C2KReader : public PlainReader {
 public:
  C2KReader() {
    for (const std::string_view name : kLookupNames) shown().set(name, "");
  }

  [[nodiscard]] Dictionary displayTemplate() const override {
    Dictionary result;
    for (const std::string_view name : kLookupNames) result.set(name, name);
    return result;
  }
  [[nodiscard]] std::span<const std::uint32_t> codes() const override { return kC2KCodes; }

  bool receive(ByteView message) override {
    if (message.size() < 13) return true;
    const Packet packet = packetOf(message);
    if (read(packet, codeOf(packet))) collect(message[0] == 0x81 ? message.subspan(2) : message);
    return true;
  }

 private:
  void store(std::string_view name, const Value& value) { shown().set(name, value); }
  void storeNumber(std::string_view name, int number) { store(name, text("%d", number)); }

  /// False for a code that nobody wants.
  bool read(const Packet& packet, std::uint32_t code) {
    const auto is = [&](std::uint32_t wanted, std::size_t length) {
      return code == wanted && packet.size() >= length;
    };
    if (is(0x1183, 50) && packet.size() == 50) readEVDOStatus(packet);
    if (is(0x12B6, 25)) readActiveSet(packet);
    if (is(0x108A, 23)) readFingers(packet);
    if (is(0x119C, 17)) readOneXStatus(packet);
    if (is(0x119D, 17)) readFrame(packet);
    if (is(0x134F, 171) && packet.byte(13) >= 2) readSystemParameters(packet);
    if (is(0x1192, 241)) readForwardLink(packet);
    if (is(0x127E, 1750)) readReverseLink(packet);
    return std::ranges::find(kC2KCodes, code) != std::end(kC2KCodes);
  }

  void readEVDOStatus(const Packet& packet) {
    const int state = packet.byte(36);
    const int session = packet.byte(37);
    storeNumber("kChannel", packet.byte(13) + 256 * (packet.byte(14) & 7));
    store("k1xEVDODeviceState",
          nameOf(static_cast<std::uint32_t>(state), kEVDOStates, text("[Reserved %d]", state)));
    store("kBandClass", bandText(packet.byte(14) >> 3));
    store("kRxAGC0", text("%+d dBm", packet.signedByte(15)));
    store("kRxAGC1", state < 4 ? "N/A" : text("%+d dBm", packet.signedByte(16)));
    store("kTxAGC", state < 4 ? "N/A" : text("%+d dBm", packet.signedByte(17)));
    const int serving = packet.half(18);
    store("kServingPNOffset",
          serving == 0xFFFF ? "Invalid Value" : text("%d \xC3\x97 64chips", serving));
    store("kSessionState", nameOf(static_cast<std::uint32_t>(session), kSessionStates,
                                  text("[Reserved %d]", session)));
    store("kUATI24", text("0x%06x", packet.word(38) & 0xFFFFFF));
    storeNumber("kColorCode", packet.byte(41));
  }

  void readActiveSet(const Packet& packet) {
    const auto count = static_cast<std::size_t>(packet.byte(15));
    if (packet.size() < 25 + 12 * count) return;
    Dictionary pilots = emptyPilots();
    for (std::size_t i = 0; i < count; ++i) {
      pilots.set(text("%zu;%d", i, packet.half(25 + 12 * i)), energyText(packet.half(27 + 12 * i)));
    }
    store("kActiveSetPilots", pilotsOrNone(pilots));
  }

  void readFingers(const Packet& packet) {
    const auto count = static_cast<std::size_t>(packet.byte(22));
    if (packet.size() != 23 + 14 * count) return;
    Dictionary fingers = emptyPilots();
    for (std::size_t i = 0; i < count; ++i) {
      const int offset = packet.half(23 + 14 * i);
      if (offset == 0xFFFF) continue;
      fingers.set(text("%zu;%d", i, offset), energyText(packet.half(29 + 14 * i)));
    }
    store("kFingerC2I", pilotsOrNone(fingers));
  }

  void readOneXStatus(const Packet& packet) {
    const auto state = subPacket(packet, 1);
    const auto radio = subPacket(packet, 2);
    const auto pilots = subPacket(packet, 3);
    if (!state || !radio || !pilots || !subPacket(packet, 4)) return;
    const int value = packet.byte(*state + 4);
    store("k1xDeviceState",
          nameOf(static_cast<std::uint32_t>(value), kOneXStates, text("[Bad Value %d]", value)));
    readRadio(packet, *radio, value == 8);
    readPilots(packet, *pilots);
    if (value == 8 || !_errorRate) return;
    store("k1xTrafficFER", text("%.02f%% (old)", static_cast<double>(*_errorRate * 100)));
    _errorRate.reset();
  }

  void readRadio(const Packet& packet, std::size_t at, bool isTraffic) {
    store("k1xRx0BandClass", bandText(packet.byte(at + 4)));
    storeNumber("k1xRx0ChanNum", packet.half(at + 6));
    store("k1xRxAGC0", receivePower(packet.signedByte(at + 10)));
    store("k1xRx1BandClass", isTraffic ? bandText(packet.byte(at + 5)) : "N/A");
    store("k1xRx1ChanNum", isTraffic ? text("%d", packet.half(at + 8)) : "N/A");
    store("k1xRxAGC1", isTraffic ? receivePower(packet.signedByte(at + 11)) : "N/A");
    store("k1xTxAGC", isTraffic ? text("%+.2f dBm", packet.signedHalf(at + 12) / 10.0) : "N/A");
  }

  void readPilots(const Packet& packet, std::size_t at) {
    const double length = packet.half(at + 4);
    const double divisor = 9 * length * length * packet.byte(at + 6);
    const double factor = std::pow(2, 2 * packet.byte(at + 7) - 3);
    const auto values = static_cast<std::size_t>(packet.byte(at + 9));
    const std::size_t size = (12 + 6 * values + 3) / 4 * 4;
    Dictionary pilots = emptyPilots();
    for (int i = 0; i < packet.byte(at + 8); ++i) {
      const std::size_t record = at + size * static_cast<std::size_t>(i);
      const int offset = packet.half(record + 12);
      double energy = factor * packet.half(record + 24 + 4 * values) / divisor - 1 / length;
      if (!(energy > 0.00001)) energy = 0.00001;
      const bool isReference = offset == packet.half(at + 10);
      pilots.set(text("%d;%d", i, offset),
                 text("%s%+.2f dB", isReference ? "(ref pilot) " : "", 10 * std::log10(energy)));
    }
    store("k1xActiveSetInfo", pilots);
  }

  void readFrame(const Packet& packet) {
    const auto traffic = subPacket(packet, 11);
    if (!traffic) return;
    const float sample = packet.byte(*traffic + 24) != 0 ? 1.0F : 0.0F;
    _errorRate = sample * 0.015625F + (_errorRate ? 0.984375F * *_errorRate : 0.0F);
    store("k1xTrafficFER", text("%.02f%%", static_cast<double>(*_errorRate * 100)));
  }

  void readSystemParameters(const Packet& packet) {
    const int roaming = packet.signedWord(42);
    store("k1xRoamingHome",
          nameOf(static_cast<std::uint32_t>(roaming), kRoaming, text("ERI - %d", roaming)));
    const std::uint32_t type = packet.word(46);
    const std::string unknown = text("(unknown system type %d)", packet.signedWord(46));
    store("kSystemId", type == 2 ? text("%d", packet.half(50)) : unknown);
    store("kNetworkId", type == 2 ? text("%d", packet.half(52)) : unknown);
    storeNumber("kPacketZoneId", packet.byte(131));
    storeNumber("kBaseId", packet.half(184));
    storeNumber("kProtocolRevision", packet.byte(133));
  }

  void readForwardLink(const Packet& packet) {
    static constexpr std::array<int, 56> kWeights = {
        128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
        0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
        0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
        1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};
    std::int64_t sent = 0;
    for (std::size_t i = 0; i < kWeights.size(); ++i) {
      sent += std::int64_t{packet.word(17 + 4 * i)} * kWeights[i];
    }
    storeRate("kFLDataRate", _forward, packet.word(13), sent);
  }

  void readReverseLink(const Packet& packet) {
    static constexpr std::array<int, 12> kWeights = {128,  256,  512,  768,  1024, 1536,
                                                     2048, 3072, 4096, 6144, 8192, 12288};
    std::int64_t sent = 0;
    for (std::size_t rate = 0; rate < kWeights.size(); ++rate) {
      for (std::size_t k = 0; k < 3; ++k) {
        for (const unsigned offset : {18U, 22U, 26U, 30U, 306U, 310U, 314U, 318U}) {
          sent += std::int64_t{packet.word(offset + 24 * rate + 576 * k)} * kWeights[rate];
        }
      }
    }
    storeRate("kRLDataRate", _reverse, packet.word(14), sent);
  }

  void storeRate(std::string_view name, Throughput& last, std::uint32_t sequence,
                 std::int64_t sent) {
    if (last.sequence) {
      const auto distance = static_cast<std::int32_t>(sequence - *last.sequence);
      const double difference = static_cast<double>(sent - last.sent);
      if (distance >= 1) store(name, text("%.2f kbps", difference / (distance * 1024.0)));
    } else {
      store(name, "");
    }
    last = {sequence, sent};
  }

  std::optional<float> _errorRate;
  Throughput _forward;
  Throughput _reverse;
};

}  // namespace

std::unique_ptr<PlainReader> makeC2KReader() { return std::make_unique<C2KReader>(); }

}  // namespace kestro::plain
