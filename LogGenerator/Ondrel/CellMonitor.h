// SPDX-License-Identifier: MIT
// The telephony service's cell-monitor list: its keys, and the sections that are filled from it.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "LogGenerator/Ondrel/SectionDecoder.h"
#include "LogGenerator/Packets/PropertyListReading.h"

namespace kestro {

// What tells one cell of the list from another.
inline constexpr std::string_view kTqCellMonitorCellRadioAccessTechnology =
    "kTqCellMonitorCellRadioAccessTechnology";
inline constexpr std::string_view kTqCellMonitorRadioAccessTechnologyGSM =
    "kTqCellMonitorRadioAccessTechnologyGSM";
inline constexpr std::string_view kTqCellMonitorRadioAccessTechnologyUMTS =
    "kTqCellMonitorRadioAccessTechnologyUMTS";
inline constexpr std::string_view kTqCellMonitorRadioAccessTechnologyUTRAN2 =
    "kTqCellMonitorRadioAccessTechnologyUTRAN2";
inline constexpr std::string_view kTqCellMonitorRadioAccessTechnologyLTE =
    "kTqCellMonitorRadioAccessTechnologyLTE";
inline constexpr std::string_view kTqCellMonitorCellType = "kTqCellMonitorCellType";
inline constexpr std::string_view kTqCellMonitorCellTypeServing = "kTqCellMonitorCellTypeServing";
inline constexpr std::string_view kTqCellMonitorCellTypeNeighbor = "kTqCellMonitorCellTypeNeighbor";

// A cell's numbers.
inline constexpr std::string_view kTqCellMonitorMCC = "kTqCellMonitorMCC";
inline constexpr std::string_view kTqCellMonitorMNC = "kTqCellMonitorMNC";
inline constexpr std::string_view kTqCellMonitorLAC = "kTqCellMonitorLAC";
inline constexpr std::string_view kTqCellMonitorTAC = "kTqCellMonitorTAC";
inline constexpr std::string_view kTqCellMonitorCellId = "kTqCellMonitorCellId";
inline constexpr std::string_view kTqCellMonitorPID = "kTqCellMonitorPID";
inline constexpr std::string_view kTqCellMonitorSCN = "kTqCellMonitorSCN";
inline constexpr std::string_view kTqCellMonitorBandInfo = "kTqCellMonitorBandInfo";
inline constexpr std::string_view kTqCellMonitorARFCN = "kTqCellMonitorARFCN";
inline constexpr std::string_view kTqCellMonitorUARFCN = "kTqCellMonitorUARFCN";
inline constexpr std::string_view kTqCellMonitorRSSI = "kTqCellMonitorRSSI";
inline constexpr std::string_view kTqCellMonitorRSCP = "kTqCellMonitorRSCP";
inline constexpr std::string_view kTqCellMonitorECN0 = "kTqCellMonitorECN0";

/// The low 16 bits of a level that was not measured. Shown as an empty text:
/// `decimal("%d dBm").absentAt(kCellMonitorNotMeasured, "")`.
inline constexpr std::int64_t kCellMonitorNotMeasured = 0x7FFF;

inline constexpr PacketKind kCellMonitorPacket = {.code = 0xFF0001, .name = "Cell-monitor list"};

/// What most sections log when a packet carries no array of cells.
inline constexpr std::string_view kMissingCellArrayLine = "Failed to get Cell Array\n";

/// The array of cells in a cell-monitor packet; a null handle when there is none. Bytes that are no
/// property list leave a line in `log`; a root that is no array leaves none.
[[nodiscard]] Array readCellArray(const Packet& packet, const PropertyListCoding& coding,
                                  SystemLog& log);

/// Whether the cell says its technology and its type, and both are those asked for.
[[nodiscard]] bool isCellOfKind(const Dictionary& cell, const CellKind& kind);

/// The cells of `list` that the reading shows, in order. Elements that are no dictionaries are
/// passed over.
[[nodiscard]] std::vector<Dictionary> chosenCells(const PropertyListReading& reading,
                                                  const Array& list);

/// A cell's number under `key`: an integer's low 32 bits, signed. Nothing when the key is missing
/// or holds anything else.
[[nodiscard]] std::optional<std::int32_t> cellNumber(const Dictionary& cell, std::string_view key);

/// Whether the number stands for a level that was not measured.
[[nodiscard]] bool isNotMeasured(const ListedValue& value, std::int32_t number);

/// The text that a section shows for a cell's number.
[[nodiscard]] Value cellText(const ListedValue& value, std::int32_t number);

/// Writes the cell's values under their section keys, in the table's order. A value that is no
/// number leaves its key alone and its failure line in `log`.
void writeCellValues(const Dictionary& cell, std::span<const ListedValue> values,
                     Dictionary& target, SystemLog& log);

/// A section that is filled from binary packets, perhaps none, and from the cell-monitor list. The
/// description's property list must be of cells. A list section is emptied by every cell-monitor
/// packet and gets a row for each cell that is shown, also for one without values.
class CellMonitorDecoder : public SectionDecoder {
 public:
  using SectionDecoder::SectionDecoder;

 protected:
  bool updateWithOtherPacket(const Packet& packet, LogCode code) override;
  void explainOtherPacket(const Packet& packet, LogCode code,
                          const ExplainVisitor& visit) const override;

 private:
  void showCells(const PropertyListReading& reading, const Array& list);
};

/// The decoder of one constant section that the cell-monitor list feeds too.
template <const Section& description>
class CellMonitorTableDecoder : public CellMonitorDecoder {
 public:
  explicit CellMonitorTableDecoder(const GeneratorServices& services)
      : CellMonitorDecoder(services, description) {}
};

}  // namespace kestro
