// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/RadioResource.h"

#include "LogGenerator/GsmUmts/Cells.h"

namespace kestro {
namespace {

// --- 0x512C: RR state, at least 17 bytes ---------------------------------------------------------

// The texts are the display's own, with their blanks.
constexpr NamedValue kRRStates[] = {
    {0, "RR_INACTIVE"},
    {1, "RR_GOING_ACTIVE"},
    {2, "RR_GOING_INACTIVE"},
    {3, "RR_CELL_SELECTION"},
    {4, "RR_PLMN_LIST_CONSTRUCTION"},
    {5, "RR_IDLE"},
    {6, "RR_CELL_RESELECTION"},
    {7, "RR_CONNECTION_PENDING"},
    {8, "RR_CHOOSE_CELL"},
    {9, "RR_DATA_TRANSFER"},
    {10, "RR_NO_CHANNELS"},
    {11, "RR_CONNECTION_RELEASE"},
    {12, "RR_EARLY_CAMPED_WAIT_FOR_SI"},
    {13, "RR_W2G_INTERRAT_HANDOVER_ PROGRESS"},
    {14, "RR_W2G_INTERRAT_RESELECTION_PROGRESS"},
    {15, "RR_WAIT_FOR_EARLY_PSCAN"},
    {16, "GRR51"},
    {17, "GRR52"},
    {18, "RR_G2W_INTERRAT_RESELECTION_PROGRESS"},
    {19, "RR_G2W_INTERRAT_HANDOVER_ PROGRESS"},
    {20, "RR_CELL_REEST"},
    {21, "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS"},
};

constexpr Field kRRState[] = {
    {"RR State", u8(13), named(kRRStates, "Unknown")},
    {"RR Sub State", u8(14), decimal()},
    {"RR Status", u8(15), decimal()},
    {"RR Mode", u8(16), decimal()},
};
static_assert(isLayout(kRRState));

// --- 0x51F6: discontinuous reception, at least 24 bytes ------------------------------------------

constexpr Field kDiscontinuousReception[] = {{"DRX Used", u8(16), decimal("%d sec")}};
static_assert(isLayout(kDiscontinuousReception));

// --- 0x5072: discontinuous transmission, at least 20 bytes ---------------------------------------

constexpr NamedValue kSwitch[] = {{0, "OFF"}, {1, "ON"}};

constexpr Field kDiscontinuousTransmission[] = {{"DTX Used", u8(19), named(kSwitch, "ON")}};
static_assert(isLayout(kDiscontinuousTransmission));

// --- 0x5137: GSM serving and neighbour measurements, at least 29 bytes ---------------------------

constexpr Field kServingMeasurements[] = {
    {"Serving Rx Level", GSMMeasurements::kServingLevel, decimal()},
    {"Rx Quality Full", GSMMeasurements::kServingQualityFull, decimal()},
    {"Rx Quality Sub", GSMMeasurements::kServingQualitySub, decimal()},
};
static_assert(isLayout(kServingMeasurements));

constexpr PacketReading kRRReadings[] = {
    {.packet = kGSMRRStatePacket, .fields = kRRState},
    {.packet = kGSMMeasurementsPacket, .fields = kServingMeasurements},
    {.packet = kGSMDiscontinuousTransmissionPacket, .fields = kDiscontinuousTransmission},
    {.packet = kGSMDiscontinuousReceptionPacket, .fields = kDiscontinuousReception},
};

}  // namespace

constexpr Section kGSMRRInfoSection = {
    .name = "GSM RR Info",
    .logLine = "GSMRRInfo",
    .kind = SectionKind::Dictionary,
    .readings = kRRReadings,
};

}  // namespace kestro
