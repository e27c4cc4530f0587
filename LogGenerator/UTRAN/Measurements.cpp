// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/Measurements.h"

namespace kestro {
namespace {

// --- 0xD00A: UTRAN neighbours, at least 21 bytes; the records stand far behind -------------------

constexpr NamedValue kSetNames[] = {{0, "ASET"}, {1, "MSET"}, {2, "DSET"}};
constexpr NamedValue kJDCSNames[] = {{0, "FALSE"}, {1, "TRUE"}};

constexpr Place kSet = u8(3).bits(5, 6);

constexpr Field kNeighbor[] = {
    {"UARFCN", u16(0).bits(0, 13), decimal()},
    {"Cell ID", u16(1).bits(6, 12), decimal()},
    {"Filter RSCP", u16(2).bits(5, 12), scaled("%f", 0, 0.00390625)},
    {"Status", kSet, named(kSetNames, ""), when(between(kSet, 0, 2))},
    {"inJDCS", u8(3).bit(7), named(kJDCSNames, "TRUE")},
};
static_assert(isLayout(kNeighbor));
constexpr auto kUTRANNeighborIdentity = fieldsNamed(kNeighbor, "UARFCN", "Cell ID");

constexpr ListReading kNeighbors[] = {{.table = {.name = "UTRAN neighbour",
                                                 .count = u8(16).bits(1, 7),
                                                 .isBounded = false,
                                                 .base = 168,
                                                 .stride = 16,
                                                 .fields = kNeighbor,
                                                 .identity = kUTRANNeighborIdentity}}};

// --- 0xD00E: GSM neighbours: a count, then records of 8 bytes ------------------------------------

constexpr Field kGSMNeighbor[] = {
    {"Cell ID", u16(0).bits(0, 13), decimal()},
    {"Band Indicator", u8(1).bit(6), decimal()},
    {"BSIC Valid", u8(1).bit(7), decimal()},
    {"NCC", u8(2), decimal()},
    {"BCC", u8(3), decimal()},
    {"ARFCN", u16(4), decimal()},
    {"RSSI", s16(6), decimal()},
};
static_assert(isLayout(kGSMNeighbor));

constexpr ListReading kGSMNeighbors[] = {{.table = {.name = "GSM neighbour",
                                                    .count = u8(16),
                                                    .base = 17,
                                                    .stride = 8,
                                                    .fields = kGSMNeighbor},
                                          .use = RowsUse::Dropped}};

// --- 0xD00C: transport channels (TrCH) and coded composite ones (CCTrCH) -------------------------

constexpr Place kTRCHCount = u16(14).bits(6, 11);

constexpr Field kTRCH[] = {
    {"TRCH ID", u8(0), decimal()},
    {"TRCH BLER Measurement", u8(1), decimal()},
};
static_assert(isLayout(kTRCH));
constexpr auto kTRCHIdentity = fieldsNamed(kTRCH, "TRCH ID");

constexpr Field kCCTRCH[] = {
    {"CCTRCH ID", u8(0), decimal()},
    {"TSNUM", u8(1), decimal()},
    {"SIR", {u8(2), u8(3), u8(4), u8(5), u8(6), u8(7)}, eachDecimal()},
};
static_assert(isLayout(kCCTRCH));
constexpr auto kCCTRCHIdentity = fieldsNamed(kCCTRCH, "CCTRCH ID", "TSNUM");

constexpr ListReading kTRCHs[] = {{.table = {.name = "transport channel",
                                             .count = kTRCHCount,
                                             .base = 17,
                                             .stride = 2,
                                             .fields = kTRCH,
                                             .identity = kTRCHIdentity}}};

// The packet counts 34 bytes for each transport channel here, though its record above has two.
constexpr ListReading kCCTRCHs[] = {{.table = {.name = "coded composite transport channel",
                                               .count = u8(15).bits(4, 7),
                                               .base = 289,
                                               .perCount = 34,
                                               .counted = kTRCHCount,
                                               .stride = 8,
                                               .fields = kCCTRCH,
                                               .identity = kCCTRCHIdentity}}};

constexpr PacketReading kNeighborsReadings[] = {
    {.packet = kUTRANNeighborsPacket, .lists = kNeighbors}};
constexpr PacketReading kGSMNeighborsReadings[] = {
    {.packet = kUTRANGSMNeighborsPacket, .lists = kGSMNeighbors}};
constexpr PacketReading kTRCHReadings[] = {
    {.packet = kUTRANTransportChannelsPacket, .lists = kTRCHs}};
constexpr PacketReading kCCTRCHReadings[] = {
    {.packet = kUTRANTransportChannelsPacket, .lists = kCCTRCHs}};

}  // namespace

// None of these reports a code that it does not know.

constexpr Section kUTRANNeighborsSection = {
    .name = "Neighbor Cell List",
    .logLine = "NeighbhorMeasurements List",
    .kind = SectionKind::List,
    .readings = kNeighborsReadings,
    .reportsUnknownCodes = false,
};

constexpr Section kUTRANGSMNeighborsSection = {
    .name = "GSM Neighbor Cell List",
    .kind = SectionKind::List,
    .readings = kGSMNeighborsReadings,
    .reportsUnknownCodes = false,
};

constexpr Section kTRCHBLERSection = {
    .name = "TRCH BLER",
    .logLine = "TRCH BLER Measurement",
    .kind = SectionKind::List,
    .readings = kTRCHReadings,
    .logPriority = LogPriority::Notice,
    .reportsUnknownCodes = false,
};

constexpr Section kCCTRCHSIRSection = {
    .name = "CCTRCH SIR",
    .logLine = "CCTRCH SIR Measurement",
    .kind = SectionKind::List,
    .readings = kCCTRCHReadings,
    .reportsUnknownCodes = false,
};

}  // namespace kestro
