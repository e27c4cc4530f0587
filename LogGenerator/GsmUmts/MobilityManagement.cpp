// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/MobilityManagement.h"

namespace kestro {
namespace {

constexpr std::string_view kUnknown = "Unknown";

// --- 0x7131: MM state, at least 16 bytes ---------------------------------------------------------

// The texts are the display's own, with their blanks.
constexpr NamedValue kMMStates[] = {
    {0, "MM_NULL"},
    {3, "MM_LOCATION_UPDATE_INITIATED"},
    {5, "MM_WAIT_FOR_OUTGOING_MM_CONNECTION"},
    {6, "MM_CONNECTION_ACTIVE"},
    {7, "MM_IMSI_DETACH_INITIATED"},
    {8, "MM_PROCESS_CM_SERVICE_PROMPT"},
    {9, "MM_WAIT_FOR_NETWORK_COMMAND"},
    {10, "MM_LOCATION_UPDATE_REJECTED"},
    {13, "MM_WAIT_FOR_RR_CONNECTION_LU"},
    {14, "MM_WAIT_FOR_RR_CONNECTION_MM"},
    {15, "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH"},
    {17, "MM_REESTABLISHMENT_INITIATED"},
    {18, "MM_WAIT_FOR_RR_ACTIVE"},
    {19, "MM_IDLE"},
    {20, "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION"},
    {21, "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT"},
    {22, "MM_WAIT_FOR_REESTABLISH_DECISION"},
    {23, "MM_LOCATION_UPDATING_PENDING"},
    {25, "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED"},
};

constexpr NamedValue kMMSubStates[] = {
    {0, "MM_NULL_SUBSTATE"},        {1, "MM_NO_IMSI"},
    {2, "MM_PLMN_SEARCH"},          {3, "MM_LIMITED_SERVICE"},
    {4, "MM_ATTEMPTING_TO_UPDATE"}, {5, "MM_LOCATION_UPDATE_NEEDED"},
    {6, "MM_NO_CELL_AVAILABLE"},    {7, "MM_PLMN_SEARCH_NORMAL_SERVICE"},
    {8, "MM_NORMAL_SERVICE"},
};

constexpr NamedValue kUpdateStatuses[] = {
    {0, "UPDATED"},
    {1, "NOT_UPDATED"},
    {2, "ROAMING_NOT_ALLOWED"},
    {3, "LOCATION_AREA_NOT_ALLOWED"},
};

constexpr Field kMMState[] = {
    {"MM State", u8(13), named(kMMStates, kUnknown)},
    {"MM Sub State", u8(14), named(kMMSubStates, kUnknown)},
    {"LU Reject Cause", u8(15), named(kUpdateStatuses, kUnknown)},
};
static_assert(isLayout(kMMState));

// --- 0x7132: registration state, at least 16 bytes -----------------------------------------------

constexpr NamedValue kRegistrationStates[] = {
    {0, "REG_STATE_INACTIVE"},      {1, "REG_STATE_IDLE"},
    {2, "REG_STATE_REGISTERING"},   {3, "REG_STATE_DEREGISTERING"},
    {4, "REG_STATE_MANUAL_SEARCH"}, {5, "REG_STATE_AUTOMATIC_SEARCH"},
    {6, "REG_STATE_OFFLINE"},
};

constexpr NamedValue kSelectionModes[] = {
    {0, "Automatic"},          {1, "Manual"}, {2, "Limited"}, {3, "LIMITED_ROUTINE_ACQ"},
    {4, "LIMITED_MANUAL_ACQ"},
};

constexpr Field kRegistrationState[] = {
    {"MM Service State", u8(13), named(kRegistrationStates, kUnknown)},
    {"PLMN Sel Mod", u8(14), named(kSelectionModes, kUnknown)},
};
static_assert(isLayout(kRegistrationState));

// --- 0x7130: GMM state, at least 16 bytes --------------------------------------------------------

constexpr NamedValue kGMMStates[] = {
    {0, "GMM_NULL"},
    {1, "GMM_DEREGISTERED"},
    {2, "GMM_REGISTERED_INITIATED"},
    {3, "GMM_REGISTERED"},
    {4, "GMM_DEREGISTERED_INITIATED"},
    {5, "GMM_ROUTING_AREA_UPDATE_INITIATED"},
    {6, "GMM_SERVICE_REQUEST_INITIATED"},
};

constexpr NamedValue kGMMSubStates[] = {
    {0, "GMM_NORMAL_SERVICE"},
    {1, "GMM_LIMITED_SERVICE"},
    {2, "GMM_ATTACH_NEEDED"},
    {3, "GMM_ATTEMPTING_TO_ATTACH"},
    {4, "GMM_NO_IMSI"},
    {5, "GMM_NO_CELL_AVAILABLE"},
    {6, "GMM_PLMN_SEARCH"},
    {7, "GMM_SUSPENDED"},
    {8, "GMM_UPDATE_NEEDED"},
    {9, "GMM_ATTEMPING_TO_UPDATE"},
    {10, "GMM_ATTEMPTING_TO_UPDATE_MM"},
    {11, "GMM_IMSI_DETACH_INITIATED"},
    {12, "GMM_NULL_SUBSTATE"},
};

constexpr NamedValue kGMMUpdateStatuses[] = {
    {0, "GMM_GU1_UPDATED"},
    {1, "GMM_GU2_NOT_UPDATED"},
    {2, "GMM_GU3_PLMN_NOT_ALLOWED"},
    {3, "GMM_GU3_ROUTING_AREA_NOT_ALLOWED"},
};

constexpr Field kGMMState[] = {
    {"MM State", u8(13), named(kGMMStates, kUnknown)},
    {"MM Sub State", u8(14), named(kGMMSubStates, kUnknown)},
    {"Attach Reject Cause", u8(15), named(kGMMUpdateStatuses, kUnknown)},
};
static_assert(isLayout(kGMMState));

// --- 0x7135: serving PLMN, at least 32 bytes -----------------------------------------------------

constexpr NamedValue kServiceTypes[] = {
    {0, "NO_SERVICE"}, {1, "CS_ONLY"}, {2, "PS_ONLY"}, {3, "CS_PS_SERVICE"}, {4, "LIMITED_SERVICE"},
};

/// The digits of a code, by how many of them a filler makes longer.
constexpr NumberFormat kCodeFormats[] = {"%03d", "%04d", "%05d", "%06d"};

/// Three digits of four bits each; a filler shows as the number 15.
ComputedValue writeDigits(std::span<const std::int64_t> raw) {
  std::int64_t code = 0;
  std::size_t fillers = 0;
  for (const std::int64_t digit : raw) {
    code = code * (digit < 10 ? 10 : 100) + digit;
    if (digit >= 10) ++fillers;
  }
  return {.number = static_cast<double>(code), .format = &kCodeFormats[fillers]};
}

constexpr Place lowDigit(unsigned offset) { return u8(offset).bits(0, 3); }
constexpr Place highDigit(unsigned offset) { return u8(offset).bits(4, 7); }

// The service type, the packet's first, is the display's last.
constexpr Field kServingPLMN[] = {
    {"Mobile Country Code",
     {lowDigit(15), highDigit(15), highDigit(16)},
     computed(writeDigits, "writeDigits")},
    {"Mobile Network Code",
     {lowDigit(17), highDigit(17), lowDigit(16)},
     computed(writeDigits, "writeDigits")},
    {"Location Area Code", u16(18).bigEndian(), decimal()},
    {"Routing Area Code", u8(20), decimal()},
    {"Service Type", u8(14), named(kServiceTypes, kUnknown)},
};
static_assert(isLayout(kServingPLMN));

// --- 0x7150: equivalent PLMN list, at least 17 bytes ---------------------------------------------

/// Three bytes of one decimal digit each.
std::int64_t numberOfDigits(std::span<const std::int64_t> raw) {
  return raw[0] * 100 + raw[1] * 10 + raw[2];
}

constexpr Place kPLMNCount = u8(16);
constexpr Field kEquivalentPLMNCount[] = {{"PLMNs", kPLMNCount, hidden()}};
static_assert(isLayout(kEquivalentPLMNCount));

// Entries stand three bytes apart, yet each is read over six: it reaches into the next one.
constexpr Field kEquivalentPLMN[] = {
    {"Mobile Country Code", {u8(0), u8(2), u8(4)}, decimal().of(numberOfDigits, "numberOfDigits")},
    {"Mobile Network Code", {u8(1), u8(3), u8(5)}, decimal().of(numberOfDigits, "numberOfDigits")},
};
static_assert(isLayout(kEquivalentPLMN));

constexpr ListReading kEquivalentPLMNs[] = {{.table = {
                                                 .name = "PLMN",
                                                 .count = kPLMNCount,
                                                 .isBounded = false,
                                                 .base = 17,
                                                 .stride = 3,
                                                 .fields = kEquivalentPLMN,
                                                 .identity = kEquivalentPLMN,
                                             }}};

// --- The cell monitor's serving cell -------------------------------------------------------------

constexpr ListedValue kServingPLMNValues[] = {
    {.listKey = kTqCellMonitorMCC,
     .key = "Mobile Country Code",
     .text = decimal(),
     .failureLine = "ServingPLMN: Failed to retrieve MCC\n"},
    {.listKey = kTqCellMonitorMNC,
     .key = "Mobile Network Code",
     .text = decimal(),
     .failureLine = "ServingPLMN: Failed to retrieve MNC\n"},
    {.listKey = kTqCellMonitorLAC,
     .key = "Location Area Code",
     .text = decimal(),
     .failureLine = "ServingPLMN: Failed to retrieve LAC\n"},
};

constexpr PropertyListReading kServingPLMNOfMonitor = {
    .packet = kCellMonitorPacket,
    .part = ListedPart::FirstCell,
    .cells = {.technologies = {kTqCellMonitorRadioAccessTechnologyUMTS,
                               kTqCellMonitorRadioAccessTechnologyGSM},
              .type = kTqCellMonitorCellTypeServing},
    .values = kServingPLMNValues,
    .missingListLine = kMissingCellArrayLine,
};

// --- What the sections take ----------------------------------------------------------------------

constexpr std::span<const Field> kMMStateField = std::span(kMMState).first<1>();
constexpr std::span<const Field> kServiceStateField = std::span(kRegistrationState).first<1>();
constexpr std::span<const Field> kSelectionModeField = std::span(kRegistrationState).last<1>();

constexpr PacketReading kProcessCOReadings[] = {
    {.packet = kMMStatePacket, .fields = kMMStateField},
    {.packet = kRegistrationStatePacket, .fields = kServiceStateField},
};
constexpr PacketReading kProcessCSReadings[] = {
    {.packet = kMMStatePacket, .fields = kMMState},
    {.packet = kRegistrationStatePacket, .fields = kServiceStateField},
};
constexpr PacketReading kProcessPSReadings[] = {
    {.packet = kGMMStatePacket, .fields = kGMMState},
    {.packet = kRegistrationStatePacket, .fields = kServiceStateField},
};
constexpr PacketReading kServingPLMNReadings[] = {
    {.packet = kServingPLMNPacket, .fields = kServingPLMN},
    {.packet = kRegistrationStatePacket, .fields = kSelectionModeField},
};
constexpr PacketReading kEquivalentPLMNListReadings[] = {
    {.packet = kEquivalentPLMNListPacket,
     .fields = kEquivalentPLMNCount,
     .lists = kEquivalentPLMNs},
};

}  // namespace

constexpr Section kProcessCOSection = {
    .name = "Process CO",
    .logLine = "ProcessCO",
    .kind = SectionKind::Dictionary,
    .readings = kProcessCOReadings,
};

constexpr Section kProcessCSSection = {
    .name = "Process CS",
    .logLine = "ProcessCS",
    .kind = SectionKind::Dictionary,
    .readings = kProcessCSReadings,
};

constexpr Section kProcessPSSection = {
    .name = "Process PS",
    .logLine = "ProcessPS",
    .kind = SectionKind::Dictionary,
    .readings = kProcessPSReadings,
};

constexpr Section kServingPLMNSection = {
    .name = "Serving PLMN",
    .logLine = "ServingPLMN",
    .kind = SectionKind::Dictionary,
    .readings = kServingPLMNReadings,
    .propertyList = &kServingPLMNOfMonitor,
};

constexpr Section kEquivalentPLMNListSection = {
    .name = "Equivalent PLMN List",
    .logLine = "EquivalentPLMNList",
    .kind = SectionKind::List,
    .readings = kEquivalentPLMNListReadings,
};

}  // namespace kestro
