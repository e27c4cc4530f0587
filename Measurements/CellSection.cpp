// SPDX-License-Identifier: MIT
#include "Measurements/CellSection.h"

#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

constexpr std::string_view kLTE = kTqLogChannelTechnology_Ondrel_LTE;
constexpr std::string_view kGsmUmts = kTqLogChannelTechnology_Ondrel_GSM;
constexpr std::string_view kUTRAN = kTqLogChannelTechnology_Ondrel_UTRAN2;
constexpr std::string_view kC2K = kTqLogChannelTechnology_Ondrel_CDMA;
constexpr std::string_view kIFX = kTqLogChannelTechnology_IFX;

using enum CellField;

struct RadioRow {
  Radio radio;
  std::string_view name;
  std::string_view family;
  RadioSystem system;
};
constexpr RadioRow kRadios[] = {
    {Radio::LTE, "LTE", "LTE", RadioSystem::EUTRA},
    {Radio::UMTS, "UMTS", "UMTS", RadioSystem::UTRAFDD},
    {Radio::GSM, "GSM", "GSM", RadioSystem::GSM},
    {Radio::UTRATDD, "UTRA TDD", "UTRA TDD", RadioSystem::UTRATDD},
    {Radio::OneX, "1x", "CDMA2000", RadioSystem::CDMA2000},
    {Radio::EVDO, "EV-DO", "CDMA2000", RadioSystem::CDMA2000},
};
static_assert(std::size(kRadios) == kRadioCount);

constexpr const RadioRow& radioRow(Radio radio) { return kRadios[static_cast<std::size_t>(radio)]; }

// --- LTE -----------------------------------------------------------------------------------------

constexpr CellKey kLTEServing[] = {
    {Channel, "Download Frequency"}, {Physical, "Physical Cell ID"}, {Identity, "Cell Identity"},
    {Area, "Tracking Area Code"},    {Band, "Freq Band Indicator"},
};
constexpr CellKey kLTEMeasured[] = {
    {Channel, "E-ARFCN"},
    {Physical, "Physical Cell ID"},
    {Level, "Measured RSRP"},
    {Quality, "Measured RSRQ"},
};
constexpr CellKey kLTEConnected[] = {
    {Channel, "E-ARFCN"},
    {Physical, "Serving Physical Cell ID"},
    {Level, "Serving Filtered RSRP"},
    {Quality, "Serving Filtered RSRQ"},
};
constexpr CellKey kLTEFiltered[] = {
    {Channel, "E-ARFCN"},
    {Physical, "Physical Cell ID"},
    {Level, "Filtered RSRP"},
    {Quality, "Filtered RSRQ"},
};
constexpr CellKey kLTECandidate[] = {{Channel, "E ARFCN"}, {Physical, "Cell ID"}};
constexpr CellKey kUMTSCandidate[] = {{Channel, "U ARFCN"}, {Physical, "PSC"}};
constexpr CellKey kGSMCandidate[] = {{Channel, "ARFCN"}, {Physical, "BSIC ID"}, {Band, "Band"}};
constexpr CellKey kC2KCandidate[] = {{Channel, "Channel"}, {Physical, "Pilot"}, {Band, "Band"}};

// --- GSM and UMTS --------------------------------------------------------------------------------

// A packet's GSM level is in dB above -110 dBm.
constexpr double kGSMLevelOffset = -110;

constexpr CellKey kActiveSet[] = {
    {Physical, "Scrambling Code"}, {Level, "RSCP"}, {Quality, "Energy Per Chip"}};
constexpr CellKey kUMTSRanked[] = {{Channel, "Downlink Frequency"},
                                   {Physical, "Scrambling Code"},
                                   {Level, "RSCP"},
                                   {Quality, "Energy Per Chip"}};
constexpr CellKey kUMTSListed[] = {{Channel, "UARFCN"},
                                   {Physical, "Scrambling Code"},
                                   {Level, "RSCP"},
                                   {Quality, "Energy Per Chip"}};
constexpr CellKey kGSMServing[] = {{Identity, "Cell ID"}, {Channel, "ARFCN"}, {Physical, "BSIC"}};
constexpr CellKey kGSMServingLevel[] = {{Level, "RSSI", CellReading::Number, kGSMLevelOffset}};
constexpr CellKey kGSMMeasured[] = {
    {Channel, "ARFCN"}, {Physical, "BSIC"}, {Level, "RSSI", CellReading::Number, kGSMLevelOffset}};
constexpr CellKey kGSMRanked[] = {{Channel, "ARFCN"}, {Physical, "BSIC"}, {Level, "RSSI"}};
constexpr CellKey kServingPLMN[] = {{CountryCode, "Mobile Country Code"},
                                    {NetworkCode, "Mobile Network Code"},
                                    {Area, "Location Area Code"}};

// --- UTRAN in TDD mode ---------------------------------------------------------------------------

constexpr CellKey kUTRANServing[] = {{Channel, "Downlink UARFCN"}, {Identity, "Cell ID"}};
constexpr CellKey kUTRANListed[] = {{Channel, "Downlink UARFCN"},
                                    {Physical, "Cell Scrambling Code"},
                                    {Identity, "Cell ID"},
                                    {Area, "Local Area Code"}};
constexpr CellKey kUTRANNeighbour[] = {
    {Channel, "UARFCN"}, {Physical, "Cell ID"}, {Level, "Filter RSCP"}};

// --- CDMA2000: the network is system and network identity ----------------------------------------

constexpr CellKey kOneXSystem[] = {{Identity, "Base Station ID"},
                                   {CountryCode, "System ID"},
                                   {NetworkCode, "Network ID"},
                                   {Area, "Packet Zone ID"}};
constexpr CellKey kOneXRadio[] = {
    {Channel, "Rx 0 Channel"}, {Band, "Rx 0 Band Class"}, {Level, "Rx 0 AGC"}};
constexpr CellKey kEVDORadio[] = {{Channel, "Channel"},
                                  {Band, "Band Class"},
                                  {Physical, "Serving PN Offset"},
                                  {Level, "Rx 0 AGC"}};
constexpr CellKey kPilot[] = {{Physical, "PN Offset"}, {Quality, "Energy"}};

// --- IFX -----------------------------------------------------------------------------------------

constexpr CellKey kIFXServing[] = {
    {Identity, "Cell ID"},
    {Identity, "Whole Cell ID"},
    {Channel, "UARFCN"},
    {Channel, "ARFCN"},
    {Physical, "PSC"},
    {Physical, "BSIC", CellReading::Colours},
    {Area, "LAC"},
    {Area, "LAC (hex)", CellReading::Hexadecimal},
    {Area, "TAC (hex)", CellReading::Hexadecimal},
    {CountryCode, "MCC"},
    {NetworkCode, "MNC"},
};
constexpr CellKey kIFXQuality[] = {
    {Level, "RSRP"}, {Level, "RSCP"}, {Level, "RxLev"}, {Quality, "RSRQ"}, {Quality, "Ec/N0"}};
constexpr CellKey kIFXUMTSCell[] = {{Physical, "PSC"}, {Level, "RSCP"}, {Quality, "Ec/N0"}};
constexpr CellKey kIFXGSMCell[] = {
    {Channel, "ARFCN"}, {Physical, "BSIC", CellReading::Colours}, {Level, "RxLev"}};

using enum CellUse;

constexpr CellSection kCellSections[] = {
    {kLTE, "Serving Cell Info", 0xB0C2, Radio::LTE, Deciding, kLTEServing},
    {kLTE, "Serving Cell Measurements", 0xB17F, Radio::LTE, Fallback, kLTEMeasured},
    {kLTE, "Connected mode LTE Intra-frequency Measurement", 0xB179, Radio::LTE, Serving,
     kLTEConnected},
    {kLTE, "Measured Neighbor Cells", 0xB179, Radio::LTE, Neighbour, kLTEFiltered},
    {kLTE, "Detected Cells", 0xB179, Radio::LTE, Neighbour, kLTEFiltered},
    {kLTE, "Neighbor Cells List", 0xB180, Radio::LTE, Neighbour, kLTEMeasured},
    {kLTE, "Reselection Candidates List", 0xB186, Radio::LTE, Neighbour, kLTECandidate},
    {kLTE, "Reselection Candidates List", 0xB186, Radio::UMTS, Neighbour, kUMTSCandidate},
    {kLTE, "Reselection Candidates List", 0xB186, Radio::GSM, Neighbour, kGSMCandidate},
    {kLTE, "Reselection Candidates List", 0xB186, Radio::OneX, Neighbour, kC2KCandidate},

    {kGsmUmts, "Active Set", 0x417A, Radio::UMTS, ActiveSet, kActiveSet},
    {kGsmUmts, "GSM Serving Cell", 0x5134, Radio::GSM, Deciding, kGSMServing},
    {kGsmUmts, "GSM Serving Cell", 0x5137, Radio::GSM, Serving, kGSMServingLevel},
    {kGsmUmts, "Serving PLMN", 0, Radio::GSM, Network, kServingPLMN},
    {kGsmUmts, "UMTS Set", 0x4005, Radio::UMTS, Neighbour, kUMTSRanked},
    {kGsmUmts, "UMTS Set", 0xFF0001, Radio::UMTS, Neighbour, kUMTSListed},
    {kGsmUmts, "Neighboring Cells", 0x5137, Radio::GSM, Neighbour, kGSMMeasured},
    {kGsmUmts, "GSM Set", 0x4005, Radio::GSM, Neighbour, kGSMRanked},

    {kUTRAN, "Serving Cell Info", 0xD0E2, Radio::UTRATDD, Deciding, kUTRANServing},
    {kUTRAN, "Serving Cell Info", 0xFF0001, Radio::UTRATDD, Serving, kUTRANListed},
    {kUTRAN, "Neighbor Cell List", 0xD00A, Radio::UTRATDD, Neighbour, kUTRANNeighbour},

    {kC2K, "1x/System", 0x134F, Radio::OneX, Deciding, kOneXSystem},
    {kC2K, "1x/Radio", 0x119C, Radio::OneX, Serving, kOneXRadio},
    {kC2K, "1x/Active Set", 0x119C, Radio::OneX, Neighbour, kPilot, false, true},
    {kC2K, "EV-DO/Radio", 0x1183, Radio::EVDO, Deciding, kEVDORadio},
    {kC2K, "EV-DO/Active Set", 0x12B6, Radio::EVDO, Neighbour, kPilot, false, true},

    {kIFX, "Serving Cell", 0, Radio::UMTS, Deciding, kIFXServing, true},
    {kIFX, "Radio Quality", 0, Radio::UMTS, Serving, kIFXQuality, true},
    {kIFX, "Active Set", 0, Radio::UMTS, Neighbour, kIFXUMTSCell, false, true},
    {kIFX, "Monitored Set", 0, Radio::UMTS, Neighbour, kIFXUMTSCell, false, true},
    {kIFX, "GSM Neighbours", 0, Radio::GSM, Neighbour, kIFXGSMCell},
};

constexpr RadioNameKey kRadioNameKeys[] = {
    {kIFX, "Mode", "Radio Access"},
    {kIFX, "Radio Quality", "Technology"},
};

// --- Connected mode ------------------------------------------------------------------------------

constexpr int kConnectedRRStates[] = {9, 13, 19};  // data transfer, handovers from and to UMTS
constexpr int kConnectedRRCStates[] = {2, 3};      // common and dedicated channels
constexpr int kTraffic[] = {8};
constexpr int kConnected[] = {5};

constexpr ConnectedMark kConnectedMarks[] = {
    {kLTE, "Connected mode LTE Intra-frequency Measurement", "Serving Physical Cell ID", 0xB179,
     Radio::LTE},
    {kGsmUmts, "GSM RR Info", "RR State", 0x512C, Radio::UMTS, kConnectedRRStates},
    {kGsmUmts, "GSM Serving Cell", "MA Dedicated ARFCN", 0x5076, Radio::GSM},
    {kUTRAN, "RRC Info", "State", 0xD0E0, Radio::UTRATDD, kConnectedRRCStates},
    {kC2K, "1x", "State", 0x119C, Radio::OneX, kTraffic},
    {kC2K, "EV-DO", "State", 0x1183, Radio::EVDO, kConnected},
};

constexpr NamedState kNamedStates[] = {
    {kGsmUmts, "GSM RR Info", "RR State"},
    {kGsmUmts, "Process PS", "MM State"},
    {kGsmUmts, "Process PS", "MM Sub State"},
    {kGsmUmts, "Process PS", "MM Service State"},
    {kGsmUmts, "Process CS", "MM State"},
    {kGsmUmts, "Process CS", "MM Sub State"},
    {kGsmUmts, "Process CS", "MM Service State"},
    {kGsmUmts, "Serving PLMN", "Service Type"},
    {kUTRAN, "RRC Info", "State"},
    {kUTRAN, "Serving Cell Info", "Allowed Access"},
    {kC2K, "1x", "State"},
    {kC2K, "1x/System", "Roaming"},
    {kC2K, "EV-DO", "State"},
    {kC2K, "EV-DO/Session", "Session State"},
    {kIFX, "Mode", "State"},
    {kIFX, "Mobility", "MM State"},
    {kIFX, "Mobility", "GMM State"},
};

}  // namespace

std::string_view nameOfRadio(Radio radio) noexcept { return radioRow(radio).name; }
std::string_view familyOfRadio(Radio radio) noexcept { return radioRow(radio).family; }
RadioSystem systemOfRadio(Radio radio) noexcept { return radioRow(radio).system; }

std::span<const CellSection> cellSections() noexcept { return kCellSections; }
std::span<const RadioNameKey> radioNameKeys() noexcept { return kRadioNameKeys; }
std::span<const ConnectedMark> connectedMarks() noexcept { return kConnectedMarks; }
std::span<const NamedState> namedStates() noexcept { return kNamedStates; }

std::optional<Radio> radioNamed(std::string_view text) noexcept {
  for (const RadioRow& row : kRadios) {
    if (row.name == text) return row.radio;
  }
  return std::nullopt;
}

}  // namespace kestro
