// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/LinkQuality.h"

namespace kestro {
namespace {

// --- 0x4116: downlink transport-channel BLER, at least 16 bytes ----------------------------------

constexpr Place kChannelCount = u8(13);
constexpr Field kBLER[] = {
    {"Channels", kChannelCount, hidden()},
    {"Window Size", u16(14), decimal()},
};
static_assert(isLayout(kBLER));

constexpr Field kChannel[] = {
    {"Transport Channel ID", u8(0), decimal()},
    {"CRC Received", u32(1), decimal()},
    {"CRC Received in Error", u32(5), decimal()},
};
static_assert(isLayout(kChannel));
constexpr auto kChannelIdentity = fieldsNamed(kChannel, "Transport Channel ID");

constexpr ListReading kChannels[] = {{
    .table = {.name = "transport channel",
              .count = kChannelCount,
              .base = 16,
              .stride = 9,
              .fields = kChannel,
              .identity = kChannelIdentity},
    .key = "Transport Channels",
}};

constexpr PacketReading kBLERReadings[] = {
    {.packet = kUMTSBlockErrorsPacket, .fields = kBLER, .lists = kChannels},
};

// --- 0x4221: HSDPA decoding statistics, at least 18 bytes ----------------------------------------

constexpr NamedValue kCarrierTypes[] = {
    {0, "Single Carrier"},
    {1, "MIMO"},
    {2, "Dual Carrier"},
    {3, "Reserved"},
};

constexpr Place kPrimaryCount = u8(16);
constexpr Place kSecondaryCount = u8(17);
constexpr Field kHSDPA[] = {
    {"Version", u8(13), decimal("%u")},
    {"Sub Frames", u16(14).bits(0, 9), decimal("%u")},
    {"Carrier Info", u16(14).bits(10, 11), namedElse(kCarrierTypes, "%u")},
    {"Primary Processes", kPrimaryCount, hidden()},
    {"Secondary Processes", kSecondaryCount, hidden()},
};
static_assert(isLayout(kHSDPA));

constexpr Field kHARQProcess[] = {
    {"Process ID", u8(0), decimal("%u")},
    {"No Rx Bits", u32(1), decimal("%u")},
    {"New Tx", u16(5), decimal("%u")},
    {"Block Errors", u16(7), decimal("%u")},
};
static_assert(isLayout(kHARQProcess));
constexpr auto kHARQIdentity = fieldsNamed(kHARQProcess, "Process ID");

// The packet reserves room for 18 records per primary process before the secondary ones.
constexpr ListReading kHARQProcesses[] = {
    {
        .table = {.name = "primary process",
                  .count = kPrimaryCount,
                  .base = 18,
                  .stride = 9,
                  .fields = kHARQProcess,
                  .identity = kHARQIdentity},
        .key = "Primary HARQ Process",
        .keepsOldWhenEmpty = true,
    },
    {
        .table = {.name = "secondary process",
                  .count = kSecondaryCount,
                  .base = 18,
                  .perCount = 18 * 9,
                  .counted = kPrimaryCount,
                  .stride = 9,
                  .fields = kHARQProcess,
                  .identity = kHARQIdentity},
        .key = "Secondary HARQ Process",
        .keepsOldWhenEmpty = true,
    },
};

constexpr PacketReading kHSDPAReadings[] = {
    {.packet = kHSDPAStatisticsPacket, .fields = kHSDPA, .lists = kHARQProcesses},
};

}  // namespace

constexpr Section kBLERSection = {
    .name = "BLER",
    .logLine = "BLER",
    .kind = SectionKind::Dictionary,
    .readings = kBLERReadings,
};

constexpr Section kHSDPAInformationSection = {
    .name = "HSDPA Info",
    .logLine = "HSDPAInformation",
    .kind = SectionKind::Dictionary,
    .readings = kHSDPAReadings,
};

}  // namespace kestro
