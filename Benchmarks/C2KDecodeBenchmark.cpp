// SPDX-License-Identifier: MIT
// Decoding CDMA2000 packets: each log code by itself and a mixed drive, from the message to the
// display, collected for the export. "of_floor" is the time over that of merely formatting the same
// values, logarithms taken beforehand; "of_plain_loop" the time of a throughput packet's sum over
// that of a plain loop over the same words; both in the same run.
#include <array>
#include <cmath>
#include <cstdlib>
#include <cstring>

#include "Benchmarks/MessageMix.h"
#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/C2K/C2KState.h"
#include "LogGenerator/C2K/EVDOPilots.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/EVDOThroughput.h"
#include "LogGenerator/C2K/FrameErrorRate.h"
#include "LogGenerator/C2K/OneXActiveSet.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXSystemParameters.h"
#include "LogGenerator/C2K/PilotList.h"
#include "LogGenerator/C2K/SubPackets.h"
#include "LogGenerator/Packets/Encode.h"

namespace kestro::benchmarks {
namespace {

/// The generator with its display.
class Display {
 public:
  Display() {
    const auto resource = createBundle()->resource("C2KTemplate", "plist");
    if (resource) _platform.bundle().setResource("C2KTemplate.plist", *resource);
    _platform.systemLog().setThreshold(LogPriority::Error);
    startAfresh();
  }

  /// An empty display.
  void startAfresh() {
    _state = Dictionary();
    _generator = C2KLogGenerator::generator(generatorServices(_platform));
    _generator->getDisplayFromState(_state);
  }

  void receive(ByteView packet) {
    _generator->updateStateWithData(_state, packet);
    if (++_received % kPacketsPerRefresh == 0) _generator->generateLogUsingState(_state);
  }

  /// Every text of the display, in the template's order; of pilots their keys too.
  [[nodiscard]] std::vector<std::string> texts() const {
    std::vector<std::string> found;
    for (const auto& name : _state[kStateLookup].dictionary()) {
      const Dictionary target = name.value.array()[0].dictionary();
      const Value shown = target["dict"].dictionary()[target["key"].text()];
      if (shown.isText()) found.emplace_back(shown.text());
      for (const auto& [key, value] : shown.dictionary()) {
        if (key == Value("_sorted")) continue;
        found.emplace_back(key.text());
        found.emplace_back(value.text());
      }
    }
    return found;
  }

 private:
  static constexpr unsigned kPacketsPerRefresh = 4096;

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  VirtualPlatform _platform{*_coding};
  std::unique_ptr<C2KLogGenerator> _generator;
  Dictionary _state;
  unsigned _received = 0;
};

Message finished(PacketWriter& writer, ShownValues values, Format format) {
  return {writer.finish(Moment{}).value_or(Bytes()), std::move(values), format};
}

PacketWriter writerOf(const PacketReading& reading) { return PacketWriter(reading.packet); }

double decibels(double ratio) { return 10 * std::log10(ratio); }

// --- EV-DO status and pilots ---------------------------------------------------------------------

char* formatStatus(const ShownValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{}{}0x{:06x}{}{}{}{} × 64chips{:+} dBm{:+} dBm{:+} dBm"),
                        "Connected [5]", "Open [4]", v.whole[0], v.whole[1],
                        "1.8 to 2.0GHz PCS band [1]", v.whole[2], v.whole[3], v.whole[4],
                        v.whole[5], v.whole[6]);
}

std::int64_t level(Draw& draw) { return -static_cast<std::int64_t>(draw.between(40, 110)); }

Message evdoStatus(Draw& draw, unsigned /*number*/) {
  ShownValues values{.whole = {draw.upTo(0xFFFFFF), draw.upTo(255), draw.upTo(2047), draw.upTo(511),
                               level(draw), level(draw), level(draw)}};
  PacketWriter writer = writerOf(kEVDOStatusReading);
  writer.fields(kEVDOStatusReading.fields)
      .raw("k1xEVDODeviceState", 5)
      .raw("kSessionState", 4)
      .raw("kUATI24", values.whole[0])
      .raw("kColorCode", values.whole[1])
      .raw("kBandClass", 1)
      .raw("kChannel", values.whole[2])
      .raw("kServingPNOffset", values.whole[3])
      .raw("kRxAGC0", values.whole[4])
      .raw("kRxAGC1", values.whole[5])
      .raw("kTxAGC", values.whole[6]);
  return finished(writer, std::move(values), formatStatus);
}

char* formatPilots(const ShownValues& v, char* end) {
  for (std::size_t i = 0; i < v.whole.size(); ++i) {
    end = fmt::format_to(end, FMT_COMPILE("{};{}{:+.2f} dB"), i, v.whole[i], v.real[i]);
  }
  return end;
}

Message pilots(Draw& draw, const PacketReading& reading, unsigned count) {
  const RecordTable& records = reading.lists[0].table;
  const PacketKind& packet = reading.packet;
  PacketWriter writer(packet.code, packet.minimumLength + std::size_t{count} * records.stride);
  writer.setCount(records, count);
  ShownValues values;
  for (unsigned i = 0; i < count; ++i) {
    const unsigned energy = draw.between(1, 2000);
    values.whole.push_back(draw.upTo(511));
    values.real.push_back(decibels(energy / 512.0));
    writer.record(records, i).raw(kPilotPNOffset, values.whole.back()).raw(kPilotEnergy, energy);
  }
  return finished(writer, std::move(values), formatPilots);
}

Message evdoActiveSet(Draw& draw, unsigned /*number*/) {
  return pilots(draw, kEVDOActiveSetReading, 6);
}
Message evdoFingers(Draw& draw, unsigned /*number*/) {
  return pilots(draw, kEVDOFingersReading, 6);
}

// --- 1x status -----------------------------------------------------------------------------------

constexpr unsigned kPilots = 4;
constexpr double kWeakest = 0.00001;

char* formatOneXStatus(const ShownValues& v, char* end) {
  end = fmt::format_to(end, FMT_COMPILE("{}{}{}{:+.2f} dBm{}{}{:+.2f} dBm{:+.2f} dBm"),
                       "Traffic [8]", "800 MHz cellular band [0]", v.whole[0], v.real[0],
                       "800 MHz cellular band [0]", v.whole[1], v.real[1], v.real[2]);
  for (std::size_t i = 0; i < kPilots; ++i) {
    const char* const reference = i == 0 ? "(ref pilot) " : "";
    end = fmt::format_to(end, FMT_COMPILE("{};{}{}{:+.2f} dB"), i, v.whole[2 + i], reference,
                         v.real[3 + i]);
  }
  return end;
}

void writeSubPacket(PacketWriter& writer, std::size_t start, unsigned id, unsigned size) {
  writer.put(kSubPacketId, {.here = start}, id);
  writer.put(kSubPacketSize, {.here = start}, size);
}

/// N = 64, f = 1, e = 10: y = 2^17 x / 36864 - 1 / 64.
void writeActiveSet(PacketWriter& writer, std::size_t start, Draw& draw, ShownValues& values) {
  const RecordPosition position{.here = start};
  writer.fieldsAt(kOneXActiveSetFields, position)
      .raw("Accumulation Length", 64)
      .raw("Energy Factor", 1)
      .raw("Energy Exponent", 10)
      .raw("Pilots", kPilots)
      .raw("Values per Pilot", 2);
  const std::size_t stride = 24;
  const std::size_t energyOffset = 8;
  for (unsigned i = 0; i < kPilots; ++i) {
    const std::int64_t pn = i == 0 ? 168 : 200 + draw.upTo(300);
    const unsigned sum = draw.upTo(60000);
    writer.put(kOneXPilotPN, {.here = start + stride * i}, pn);
    writer.put(kOneXPilotEnergy, {.here = start + stride * i + energyOffset}, sum);
    const double energy = 131072.0 * sum / 36864 - 1.0 / 64;
    values.whole.push_back(pn);
    values.real.push_back(decibels(energy >= kWeakest ? energy : kWeakest));
  }
  writer.fieldsAt(kOneXActiveSetFields, position).raw("Reference PN Offset", 168);
}

Message oneXStatus(Draw& draw, unsigned /*number*/) {
  constexpr std::size_t kState = kFirstSubPacket;
  constexpr std::size_t kRadio = kState + 6;
  constexpr std::size_t kActiveSet = kRadio + 14;
  constexpr unsigned kActiveSetSize = 140;
  constexpr std::size_t kFingers = kActiveSet + kActiveSetSize;
  const std::int64_t receivers[] = {level(draw), level(draw)};
  const std::int64_t transmitter = draw.upTo(230);
  ShownValues values{.whole = {draw.upTo(1175), draw.upTo(1175)}};
  for (const std::int64_t raw : receivers) {
    values.real.push_back(static_cast<double>(raw) * 334 / 1000 - 63.248);
  }
  values.real.push_back(static_cast<double>(transmitter) / 10);
  PacketWriter writer(kOneXStatusPacket.code, kFingers + 8);
  writer.put(kSubPacketCount, {}, 4);
  writeSubPacket(writer, kState, kOneXStateId, 6);
  writeSubPacket(writer, kRadio, kOneXRadioId, 14);
  writeSubPacket(writer, kActiveSet, kOneXActiveSetId, kActiveSetSize);
  writeSubPacket(writer, kFingers, kOneXFingersId, 8);
  writer.fieldsAt(kOneXStatusFields, {.here = kRadio, .twin = kState})
      .raw("k1xDeviceState", 8)
      .raw("k1xRx0ChanNum", values.whole[0])
      .raw("k1xRx1ChanNum", values.whole[1])
      .raw("k1xRxAGC0", receivers[0])
      .raw("k1xRxAGC1", receivers[1])
      .raw("k1xTxAGC", transmitter);
  writeActiveSet(writer, kActiveSet, draw, values);
  return finished(writer, std::move(values), formatOneXStatus);
}

// --- 1x traffic and system -----------------------------------------------------------------------

char* formatErrorRate(const ShownValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{:.2f}%"), v.real[0]);
}

Message trafficFrame(Draw& draw, unsigned /*number*/) {
  const unsigned errors = draw.upTo(1);
  PacketWriter writer(kOneXTrafficFramePacket.code, kFirstSubPacket + 25);
  writer.put(kSubPacketCount, {}, 1);
  writeSubPacket(writer, kFirstSubPacket, kTrafficDemodulationId, 25);
  writer.put(kIsBadFrame, {.here = kFirstSubPacket}, errors);
  return finished(writer, {.real = {errors * 1.5625}}, formatErrorRate);
}

char* formatSystem(const ShownValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{}{}{}{}{}{}"), v.whole[0], v.whole[1], v.whole[2],
                        v.whole[3], v.whole[4], "ON [1]");
}

Message systemParameters(Draw& draw, unsigned /*number*/) {
  ShownValues values{.whole = {draw.upTo(32767), draw.upTo(65535), draw.upTo(65535), draw.upTo(255),
                               draw.upTo(9)}};
  PacketWriter writer = writerOf(kOneXSystemParametersReading);
  writer.fields(kOneXSystemParametersReading.fields)
      .raw("Version", 2)
      .raw("k1xRoamingHome", 1)
      .raw("kSystemId", {2, values.whole[0]})
      .raw("kNetworkId", {2, values.whole[1]})
      .raw("kBaseId", values.whole[2])
      .raw("kPacketZoneId", values.whole[3])
      .raw("kProtocolRevision", values.whole[4]);
  return finished(writer, std::move(values), formatSystem);
}

// --- Throughput ----------------------------------------------------------------------------------

char* formatRate(const ShownValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{:.2f} kbps"), v.real[0]);
}

/// A packet whose counters are drawn, numbered.
Message throughput(Draw& draw, const ThroughputLayout& layout, unsigned number) {
  PacketWriter writer = writerOf(layout.reading);
  writer.put(layout.sequenceNumber, {}, number);
  std::int64_t sent = 0;
  for (const SentCounter& counter : layout.counters) {
    const unsigned count = draw.upTo(100000);
    writer.put(counter.place(), {}, count);
    sent += std::int64_t{count} * counter.bits;
  }
  ShownValues values{.real = {static_cast<double>(sent) / (1024.0 * number)}};
  Message message = finished(writer, std::move(values), formatRate);
  message.primer = writerOf(layout.reading).finish(Moment{}).value_or(Bytes());
  return message;
}

Message forwardThroughput(Draw& draw, unsigned number) {
  return throughput(draw, kForwardThroughput, number);
}
Message reverseThroughput(Draw& draw, unsigned number) {
  return throughput(draw, kReverseThroughput, number);
}

std::int64_t wordAt(const std::uint8_t* bytes) {
  std::uint32_t word;
  std::memcpy(&word, bytes, sizeof(word));
  return word;
}

std::int64_t plainForwardSum(const std::uint8_t* packet) {
  static constexpr std::int64_t kBits[] = {
      128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
      0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
      0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
      1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};
  std::int64_t sum = 0;
  for (std::size_t i = 0; i < std::size(kBits); ++i) sum += wordAt(packet + 17 + 4 * i) * kBits[i];
  return sum;
}

std::int64_t plainReverseSum(const std::uint8_t* packet) {
  static constexpr std::int64_t kBits[] = {128,  256,  512,  768,  1024, 1536,
                                           2048, 3072, 4096, 6144, 8192, 12288};
  static constexpr std::size_t kOffsets[] = {18, 22, 26, 30, 306, 310, 314, 318};
  std::int64_t sum = 0;
  for (std::size_t rate = 0; rate < std::size(kBits); ++rate) {
    for (std::size_t block = 0; block < 3; ++block) {
      for (const std::size_t offset : kOffsets) {
        sum += wordAt(packet + offset + 24 * rate + 576 * block) * kBits[rate];
      }
    }
  }
  return sum;
}

/// Registers the sum alone beside a plain loop, once both add up to the same.
bool registerSum(const char* name, const ThroughputLayout& layout,
                 std::int64_t (*plain)(const std::uint8_t* packet)) {
  Draw draw;
  const Bytes bytes = throughput(draw, layout, 1).bytes;
  const EVDOThroughput parser(layout);
  if (parser.sentIn(PacketView(bytes)) != plain(bytes.data())) {
    fmt::print(stderr, "{}: {} is not {}\n", name, parser.sentIn(PacketView(bytes)),
               plain(bytes.data()));
    return false;
  }
  benchmark::RegisterBenchmark(name, [bytes, plain, &layout](benchmark::State& state) {
    const EVDOThroughput summing(layout);
    const auto sum = [&] { benchmark::DoNotOptimize(summing.sentIn(PacketView(bytes))); };
    for (auto _ : state) sum();
    const double least = leastNanoseconds([&] {
      const std::uint8_t* packet = bytes.data();
      benchmark::DoNotOptimize(packet);
      benchmark::DoNotOptimize(plain(packet));
    });
    state.counters["of_plain_loop"] = leastNanoseconds(sum) / least;
  });
  return true;
}

constexpr Kind kKinds[] = {
    {"0x119C (4 pilots)", oneXStatus, 20},
    {"0x1183", evdoStatus, 20},
    {"0x12B6 (6 pilots)", evdoActiveSet, 15},
    {"0x108A (6 fingers)", evdoFingers, 15},
    {"0x119D", trafficFrame, 10},
    {"0x1192", forwardThroughput, 10},
    {"0x127E", reverseThroughput, 5},
    {"0x134F", systemParameters, 5},
};

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro::benchmarks;  // NOLINT(google-build-using-namespace)
  Display display;
  if (!registerKinds(display, kKinds)) return EXIT_FAILURE;
  if (!registerSum("0x1192/sum", kestro::kForwardThroughput, plainForwardSum)) return EXIT_FAILURE;
  if (!registerSum("0x127E/sum", kestro::kReverseThroughput, plainReverseSum)) return EXIT_FAILURE;
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
