// SPDX-License-Identifier: MIT
// Decoding UTRAN packets: each log code by itself and a mixed drive, from the message to the
// display. "of_floor" is the time over that of merely formatting the same values, in the same run;
// the line for the console counts as one of them. The system log takes errors only.
#include <array>
#include <cstdlib>

#include "Benchmarks/MessageMix.h"
#include "LogGenerator/Packets/Encode.h"
#include "LogGenerator/UTRAN/Measurements.h"
#include "LogGenerator/UTRAN/RRCState.h"
#include "LogGenerator/UTRAN/ServingCellInfo.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

namespace kestro::benchmarks {
namespace {

using Display = LiveDisplay<UTRANLogGenerator>;

const PacketReading& reading(const Section& section) { return section.readings[0]; }
const RecordTable& table(const Section& section) { return reading(section).lists[0].table; }

Message finished(PacketWriter& writer, ShownValues values, Format format) {
  return {writer.finish(Moment{}).value_or(Bytes()), std::move(values), format};
}

/// Writes the values under the keys of a layout, in its order.
void write(PacketWriter::Fields fields, std::span<const Field> layout,
           std::span<const std::int64_t> values) {
  for (std::size_t i = 0; i < values.size(); ++i) fields.raw(layout[i].key, values[i]);
}

// --- 0xD0E0 --------------------------------------------------------------------------------------

constexpr std::array kModes = {"Disconnected", "Connecting", "Cell Fach",
                               "Cell DCH",     "Cell PCH",   "Cell URA PCH"};

/// What the display shows; the line for the console goes behind it.
char* formatState(const ShownValues& v, char* end) {
  const char* const mode = kModes[static_cast<std::size_t>(v.whole[0])];
  end = fmt::format_to(end, FMT_COMPILE("{}"), mode);
  char* const line = end + 1;
  benchmark::DoNotOptimize(
      fmt::format_to(line, FMT_COMPILE("Display Dict = {{ State = \"{}\"; }}, rrc mode = {} {}"),
                     mode, v.whole[0], mode));
  return end;
}

Message rrcState(Draw& draw, unsigned /*number*/) {
  const std::int64_t mode = draw.upTo(kModes.size() - 1);
  const PacketReading& packet = reading(kRRCStateSection);
  PacketWriter writer(packet.packet);
  writer.fields(packet.fields).raw("Mode Valid", 1).raw("State", mode);
  return finished(writer, {.whole = {mode}}, formatState);
}

// --- 0xD0E2 --------------------------------------------------------------------------------------

char* formatSystemInformation(const ShownValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{}{}{}{}{}{}"), v.whole[0], v.whole[1], v.whole[2],
                        v.whole[3], v.whole[4],
                        v.whole[5] == 1 ? "Emergency Calls Only" : "All Calls");
}

Message systemInformation(Draw& draw, unsigned /*number*/) {
  ShownValues values{
      .whole = {draw.upTo(255), draw.upTo(0xFFFFFFF), 10054, 9504, draw.upTo(255), draw.upTo(1)}};
  const PacketReading& packet = reading(kUTRANServingCellInfoSection);
  PacketWriter writer(packet.packet);
  write(writer.fields(packet.fields), packet.fields, values.whole);
  return finished(writer, std::move(values), formatSystemInformation);
}

// --- 0xD00A with eight neighbours ----------------------------------------------------------------

constexpr unsigned kNeighbors = 8;
constexpr std::array kSets = {"ASET", "MSET", "DSET"};

char* formatNeighbors(const ShownValues& v, char* end) {
  for (std::size_t i = 0; i < kNeighbors; ++i) {
    const std::int64_t* row = &v.whole[4 * i];
    end = fmt::format_to(end, FMT_COMPILE("{}{}{:.6f}{}{}"), row[0], row[1], v.real[i],
                         kSets[static_cast<std::size_t>(row[2])], row[3] == 1 ? "TRUE" : "FALSE");
  }
  return end;
}

Message neighbors(Draw& draw, unsigned /*number*/) {
  const RecordTable& records = table(kUTRANNeighborsSection);
  PacketWriter writer(kUTRANNeighborsPacket);
  writer.setCount(records, kNeighbors);
  ShownValues values;
  for (unsigned i = 0; i < kNeighbors; ++i) {
    const std::int64_t raw[] = {10054, draw.upTo(127), draw.upTo(255), draw.upTo(2), draw.upTo(1)};
    write(writer.record(records, i), records.fields, raw);
    values.whole.insert(values.whole.end(), {raw[0], raw[1], raw[3], raw[4]});
    values.real.push_back(static_cast<double>(raw[2]) / 256);
  }
  return finished(writer, std::move(values), formatNeighbors);
}

// --- 0xD00E with six neighbours, which are read and not shown ------------------------------------

constexpr unsigned kGSMNeighbors = 6;

char* formatNumbers(const ShownValues& v, char* end) {
  for (const std::int64_t number : v.whole) end = fmt::format_to(end, FMT_COMPILE("{}"), number);
  return end;
}

/// The values are formatted as if they were shown, and not kept either.
char* formatDroppedNumbers(const ShownValues& v, char* end) {
  benchmark::DoNotOptimize(formatNumbers(v, end));
  return end;
}

Message gsmNeighbors(Draw& draw, unsigned /*number*/) {
  const RecordTable& records = table(kUTRANGSMNeighborsSection);
  PacketWriter writer(kUTRANGSMNeighborsPacket);
  writer.setCount(records, kGSMNeighbors);
  ShownValues values;
  for (unsigned i = 0; i < kGSMNeighbors; ++i) {
    const std::int64_t raw[] = {draw.upTo(16383),
                                0,
                                1,
                                draw.upTo(7),
                                draw.upTo(7),
                                draw.upTo(1023),
                                -static_cast<std::int64_t>(draw.upTo(110))};
    write(writer.record(records, i), records.fields, raw);
    values.whole.insert(values.whole.end(), std::begin(raw), std::end(raw));
  }
  return finished(writer, std::move(values), formatDroppedNumbers);
}

// --- 0xD00C with four transport channels and two coded composite ones ----------------------------

constexpr unsigned kChannels = 4;
constexpr unsigned kCompositeChannels = 2;

Message transportChannels(Draw& draw, unsigned /*number*/) {
  const RecordTable& channels = table(kTRCHBLERSection);
  const RecordTable& composites = table(kCCTRCHSIRSection);
  PacketWriter writer(kUTRANTransportChannelsPacket);
  writer.setCount(channels, kChannels);
  writer.setCount(composites, kCompositeChannels);
  ShownValues values;
  for (unsigned i = 0; i < kChannels; ++i) {
    const std::int64_t raw[] = {i, draw.upTo(63)};
    write(writer.record(channels, i), channels.fields, raw);
    values.whole.insert(values.whole.end(), std::begin(raw), std::end(raw));
  }
  for (unsigned i = 0; i < kCompositeChannels; ++i) {
    std::vector<std::int64_t> ratios;
    for (int k = 0; k < 6; ++k) ratios.push_back(draw.upTo(63));
    const std::int64_t slot = draw.upTo(6);
    writer.record(composites, i).raw("CCTRCH ID", i).raw("TSNUM", slot).raw("SIR", ratios);
    values.whole.insert(values.whole.end(), {i, slot});
    values.whole.insert(values.whole.end(), ratios.begin(), ratios.end());
  }
  return finished(writer, std::move(values), formatNumbers);
}

constexpr Kind kKinds[] = {
    {"0xD00A (8 neighbours)", neighbors, 40},    {"0xD00C (4 + 2 channels)", transportChannels, 30},
    {"0xD00E (6 neighbours)", gsmNeighbors, 10}, {"0xD0E0", rrcState, 10},
    {"0xD0E2", systemInformation, 10},
};

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro::benchmarks;  // NOLINT(google-build-using-namespace)
  Display display("UTRAN");
  if (!registerKinds(display, kKinds)) return EXIT_FAILURE;
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
