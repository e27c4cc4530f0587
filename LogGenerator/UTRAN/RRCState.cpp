// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/RRCState.h"

#include <fmt/format.h>

#include "LogGenerator/GeneratorServices.h"
#include "Platform/PropertyListDescription.h"
#include "Platform/TextSink.h"

namespace kestro {
namespace {

constexpr std::string_view kStateKey = "State";
constexpr std::string_view kUnknownMode = "Unknown RRC Mode";

constexpr NamedValue kModeNames[] = {
    {0, "Disconnected"}, {1, "Connecting"}, {2, "Cell Fach"},
    {3, "Cell DCH"},     {4, "Cell PCH"},   {5, "Cell URA PCH"},
};
constexpr TextRule kModeRule = named(kModeNames, kUnknownMode);

// --- 0xD0E0: the mode, and whether it is valid ---------------------------------------------------

constexpr Place kIsValid = u8(13);
constexpr Place kMode = u8(14);
constexpr std::int64_t kValid = 1;

constexpr Field kRRCState[] = {
    {"Mode Valid", kIsValid, hidden()},
    {kStateKey, kMode, kModeRule, when(equals(kIsValid, kValid)).elseText(kUnknownMode)},
};
static_assert(isLayout(kRRCState));

constexpr Field kMissingRRCState[] = {
    {kStateKey, kMode, named({}, kUnknownMode)},
};
static_assert(isLayout(kMissingRRCState));

constexpr PacketKind kRRCStateWithoutMode = {.code = kUTRANRRCStatePacket.code,
                                             .name = "UTRAN RRC state without a mode"};

constexpr PacketReading kRRCReadings[] = {
    {.packet = kUTRANRRCStatePacket, .fields = kRRCState},
    {.packet = kRRCStateWithoutMode, .fields = kMissingRRCState},
};

/// The mode of a packet that has none, or no valid one.
constexpr int kNoMode = 255;

int modeOf(PacketView packet) {
  const bool isValid = packet.size() >= kUTRANRRCStatePacket.minimumLength &&
                       readNumber(kIsValid, packet, {}) == kValid;
  return isValid ? static_cast<int>(readNumber(kMode, packet, {})) : kNoMode;
}

}  // namespace

constexpr Section kRRCStateSection = {
    .name = "RRC Info",
    .kind = SectionKind::Dictionary,
    .readings = kRRCReadings,
    .reportsUnknownCodes = false,
};

void RRC_State::didRead(const PacketReading& /*reading*/, PacketView packet) {
  if (packet.size() < kUTRANRRCStatePacket.minimumLength) {
    systemLog().log(LogPriority::Warning, "LogCode_0xD0E0 is length is {} expected size {}",
                    packet.size(), kUTRANRRCStatePacket.minimumLength);
  }
  const Dictionary section = sectionDictionary();
  const int mode = modeOf(packet);
  TextBuffer text;
  writeText(kModeRule, mode, text);
  services().consoleLog.writeLine(
      fmt::format("Display Dict = {}, rrc mode = {} {}", describe(section), mode, text.text()));
}

}  // namespace kestro
