// SPDX-License-Identifier: MIT
// Decoding LTE packets: each log code by itself and a mixed drive, from the message to the display.
// "of_floor" is the time over that of merely formatting the same values with formats that fmt has
// compiled, into one buffer, in the same run. The system log takes errors only.
#include <cstdlib>
#include <span>
#include <vector>

#include "Benchmarks/DecodeSpeed.h"
#include "Benchmarks/MeasureSpeed.h"
#include "Benchmarks/MessageMix.h"
#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/Packets/Encode.h"

namespace kestro::benchmarks {
namespace {

using Display = LiveDisplay<LTELogGenerator>;

/// Raw values in the order in which the display shows them.
using RawValues = std::vector<unsigned>;

using Format = FormatOf<RawValues>;
using Message = MessageOf<RawValues>;

double steps(unsigned raw, double scale, double offset) { return raw * scale + offset; }
int plus(unsigned raw, int addend, int multiplier = 1) {
  return static_cast<int>(raw) * multiplier + addend;
}

/// Writes `values` under the layout's keys, in its order.
void write(PacketWriter::Fields fields, std::span<const Field> layout,
           std::span<const unsigned> values) {
  for (std::size_t i = 0; i < values.size(); ++i) fields.raw(layout[i].key, values[i]);
}

const PacketReading& reading(const Section& section) { return section.readings[0]; }

Message finished(PacketWriter& writer, RawValues raw, Format format) {
  return {writer.finish(Moment{}).value_or(Bytes()), std::move(raw), format};
}

// --- 0xB17F --------------------------------------------------------------------------------------

char* formatServingCell(const RawValues& v, char* end) {
  return fmt::format_to(
      end,
      FMT_COMPILE("{}{}{}{}{:4.2f} dBm{:4.2f} dBm{:4.2f} dB{:4.2f} dB{:4.2f} dBm{} dBm{} dBm{} dBm"
                  "{} dBm{}{} dB{} dBm{}{}"),
      v[0], v[1], v[2], v[3], steps(v[4], 0.25, -140), steps(v[5], 0.25, -140),
      steps(v[6], 0.25, -30), steps(v[7], 0.25, -30), steps(v[8], 0.5, -140), plus(v[9], -140, 2),
      plus(v[10], -30), plus(v[11], -30), plus(v[12], -30), v[13], plus(v[14], 0, 2),
      plus(v[15], 0, 2), v[16] == 1 ? "True" : "False", v[17]);
}

Message servingCell(Draw& draw, unsigned /*number*/) {
  RawValues raw = {4,
                   1300,
                   draw.upTo(503),
                   5,
                   draw.between(60, 320),
                   draw.between(60, 320),
                   draw.between(40, 108),
                   draw.between(40, 108),
                   draw.between(60, 220),
                   8,
                   53,
                   53,
                   draw.upTo(100),
                   draw.upTo(8),
                   31,
                   4,
                   draw.upTo(1),
                   draw.upTo(15)};
  const PacketReading& packet = reading(kServingCellMeasurementSection);
  PacketWriter writer(kLTEServingCellPacket);
  write(writer.fields(packet.fields), packet.fields, raw);
  return finished(writer, std::move(raw), formatServingCell);
}

// --- 0xB179 with four measured neighbours and two detected cells ---------------------------------

constexpr unsigned kMeasured = 4;
constexpr unsigned kDetected = 2;

char* formatIntraFrequency(const RawValues& v, char* end) {
  end = fmt::format_to(end, FMT_COMPILE("{}{}{}{:4.2f} dBm{:4.2f} dB"), v[0], v[1], v[2],
                       steps(v[3], 0.25, -140), steps(v[4], 0.125, -20));
  std::size_t i = 5;
  for (unsigned row = 0; row < kMeasured; ++row, i += 3) {
    end = fmt::format_to(end, FMT_COMPILE("{}{:4.2f} dBm{:4.2f} dB"), v[i],
                         steps(v[i + 1], 0.25, -140), steps(v[i + 2], 0.125, -20));
  }
  for (unsigned row = 0; row < kDetected; ++row) {
    end = fmt::format_to(end, FMT_COMPILE("{}"), v[i++]);
  }
  return end;
}

Message intraFrequency(Draw& draw, unsigned /*number*/) {
  const PacketReading& header = reading(kConnectedModeMeasurementSection);
  const RecordTable& measured = reading(kMeasuredNeighborCellsSection).lists[0].table;
  const RecordTable& detected = reading(kDetectedCellsSection).lists[0].table;
  PacketWriter writer(kLTEIntraFrequencyPacket);
  writer.setCount(measured, kMeasured);
  writer.setCount(detected, kDetected);
  RawValues raw = {1300, draw.upTo(503), draw.upTo(10239), draw.between(60, 320),
                   draw.between(40, 140)};
  write(writer.fields(header.fields), header.fields, raw);
  for (unsigned row = 0; row < kMeasured; ++row) {
    const unsigned cell[] = {draw.upTo(503), draw.between(60, 320), draw.between(40, 140)};
    write(writer.record(measured, row), measured.fields, cell);
    raw.insert(raw.end(), std::begin(cell), std::end(cell));
  }
  for (unsigned row = 0; row < kDetected; ++row) {
    const unsigned cell[] = {draw.upTo(503)};
    write(writer.record(detected, row), detected.fields, cell);
    raw.push_back(cell[0]);
  }
  return finished(writer, std::move(raw), formatIntraFrequency);
}

// --- 0xB180 --------------------------------------------------------------------------------------

char* formatNeighbors(const RawValues& v, char* end) {
  end = fmt::format_to(end, FMT_COMPILE("{}{}{} dBm"), v[0], v[1], plus(v[2], -140, 2));
  for (std::size_t i = 3; i < v.size(); i += 10) {
    end = fmt::format_to(
        end, FMT_COMPILE("{}{:4.2f} dBm{:4.2f} dBm{:4.2f} dBm{:4.2f} dB{:4.2f} dB{} dBm{}{}{}{}{}"),
        v[i], steps(v[i + 1], 0.5, -140), steps(v[i + 2], 0.5, -140), steps(v[i + 3], 0.5, -140),
        steps(v[i + 4], 0.25, -30), steps(v[i + 5], 0.25, -30), plus(v[i + 6], -30), v[i + 7],
        v[i + 8], v[i + 9], v[i + 8], v[i + 9]);
  }
  return end;
}

/// A cell as a drive sees it for a while: its identity and timing stay about what they are.
std::vector<unsigned> drivenCell(Draw& draw, unsigned cell) {
  return {37 * cell + 11,        draw.between(100, 140),
          draw.between(60, 110), draw.between(60, 110),
          draw.between(50, 90),  draw.between(50, 90),
          draw.upTo(60),         draw.between(100, 160),
          101 * cell % 1024,     20'000 * cell + draw.upTo(40)};
}

/// A cell with anything that its bits can carry.
std::vector<unsigned> anyCell(Draw& draw, unsigned /*cell*/) {
  return {draw.upTo(511), draw.upTo(255), draw.upTo(511),   draw.upTo(511),  draw.upTo(127),
          draw.upTo(127), draw.upTo(127), draw.upTo(65535), draw.upTo(2047), draw.upTo(524287)};
}

Message neighbors(Draw& draw, unsigned count,
                  std::vector<unsigned> (*cellValues)(Draw&, unsigned)) {
  const PacketReading& header = reading(kNeighborMeasurementSection);
  const RecordTable& records = reading(kNeighborCellsListSection).lists[0].table;
  PacketWriter writer(kLTENeighborPacket);
  writer.setCount(records, count);
  RawValues raw = {1, 1300, 8};
  write(writer.fields(header.fields), header.fields, raw);
  for (unsigned row = 0; row < count; ++row) {
    const std::vector<unsigned> cell = cellValues(draw, row);
    write(writer.record(records, row), records.fields, cell);
    raw.insert(raw.end(), cell.begin(), cell.end());
  }
  return finished(writer, std::move(raw), formatNeighbors);
}

Message fourNeighbors(Draw& draw, unsigned /*number*/) { return neighbors(draw, 4, drivenCell); }
Message eightNeighbors(Draw& draw, unsigned /*number*/) { return neighbors(draw, 8, drivenCell); }
Message anyNeighbors(Draw& draw, unsigned /*number*/) { return neighbors(draw, 8, anyCell); }

// --- 0xB0C2, 0xB0C1 and 0xB186 -------------------------------------------------------------------

char* formatSystemInformation(const RawValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{}{}{}{}{}{}{}{}"), v[0], v[1], v[2],
                        v[3] == 50 ? "10 MHz" : "20 MHz", v[4] == 50 ? "10 MHz" : "20 MHz",
                        static_cast<int>(v[5]), v[6], static_cast<int>(v[7]));
}

Message systemInformation(Draw& draw, unsigned /*number*/) {
  const unsigned blocks = draw.upTo(1) == 1 ? 50 : 100;
  RawValues raw = {
      draw.upTo(503),     1300, 19300, blocks, blocks, draw.upTo(0xFFFFFFF), draw.upTo(65535),
      draw.between(1, 44)};
  const PacketReading& packet = reading(kLTEServingCellInfoSection);
  PacketWriter writer(kLTESystemInformationPacket);
  std::vector<Field> shown(packet.fields.begin(), packet.fields.end());
  std::erase_if(shown, [](const Field& field) { return field.placeCount == 0; });
  write(writer.fields(packet.fields), shown, raw);
  return finished(writer, std::move(raw), formatSystemInformation);
}

char* formatNumbers(const RawValues& v, char* end) {
  for (const unsigned number : v) end = fmt::format_to(end, FMT_COMPILE("{}"), number);
  return end;
}

Message antennas(Draw& draw, unsigned /*number*/) {
  RawValues raw = {draw.between(1, 4)};
  const PacketReading& packet = *readingOf(kLTEServingCellInfoSection, kLTEAntennasPacket.code);
  PacketWriter writer(kLTEAntennasPacket);
  write(writer.fields(packet.fields), packet.fields, raw);
  return finished(writer, std::move(raw), formatNumbers);
}

char* formatReselection(const RawValues& v, char* end) {
  return fmt::format_to(end, FMT_COMPILE("{}{}{}{}{}{}{}"), v[0], v[1], v[2], v[3], "LTE", v[4],
                        v[5]);
}

Message reselection(Draw& draw, unsigned /*number*/) {
  RawValues raw = {1, 1300, draw.upTo(503), draw.upTo(7), draw.upTo(65535), draw.upTo(503)};
  const PacketReading& header = reading(kReselectionCandidatesSection);
  const RecordTable& candidates = reading(kReselectionCandidatesListSection).lists[0].table;
  PacketWriter writer(kLTEReselectionPacket);
  writer.setCount(candidates, 1);
  write(writer.fields(header.fields), header.fields, std::span(raw).first(3));
  writer.record(candidates, 0)
      .raw("Candidate Priority", raw[3])
      .text("Candidate RAT Type", "LTE")
      .raw("E ARFCN", raw[4])
      .raw("Cell ID", raw[5]);
  return finished(writer, std::move(raw), formatReselection);
}

// --- Measuring -----------------------------------------------------------------------------------

constexpr KindOf<RawValues> kKinds[] = {
    {"0xB17F", servingCell, 35},
    {"0xB179 (4 + 2 cells)", intraFrequency, 30},
    {"0xB180 (4 records)", fourNeighbors, 30},
    {"0xB180 (8 records)", eightNeighbors, 0},
    {"0xB180 (8 records of any values)", anyNeighbors, 0},
    {"0xB0C2", systemInformation, 5},
    {"0xB0C1", antennas, 0},
    {"0xB186 (1 candidate)", reselection, 0},
};

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro::benchmarks;  // NOLINT(google-build-using-namespace)
  Display display("LTE");
  if (!registerKinds(display, kKinds)) return EXIT_FAILURE;
  if (!registerMeasured("LTE", display, kKinds)) return EXIT_FAILURE;
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
