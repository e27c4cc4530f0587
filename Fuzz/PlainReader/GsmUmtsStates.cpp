// SPDX-License-Identifier: MIT
#include "Fuzz/PlainReader/GsmUmts.h"

namespace kestro::plain {
namespace {

constexpr std::string_view kUnknown = "Unknown";

constexpr std::string_view kMobilityStates[] = {
    "MM_NULL",
    kUnknown,
    kUnknown,
    "MM_LOCATION_UPDATE_INITIATED",
    kUnknown,
    "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
    "MM_CONNECTION_ACTIVE",
    "MM_IMSI_DETACH_INITIATED",
    "MM_PROCESS_CM_SERVICE_PROMPT",
    "MM_WAIT_FOR_NETWORK_COMMAND",
    "MM_LOCATION_UPDATE_REJECTED",
    kUnknown,
    kUnknown,
    "MM_WAIT_FOR_RR_CONNECTION_LU",
    "MM_WAIT_FOR_RR_CONNECTION_MM",
    "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
    kUnknown,
    "MM_REESTABLISHMENT_INITIATED",
    "MM_WAIT_FOR_RR_ACTIVE",
    "MM_IDLE",
    "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
    "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
    "MM_WAIT_FOR_REESTABLISH_DECISION",
    "MM_LOCATION_UPDATING_PENDING",
    kUnknown,
    "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
};
constexpr std::string_view kMobilitySubStates[] = {
    "MM_NULL_SUBSTATE",        "MM_NO_IMSI",
    "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
    "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
    "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
    "MM_NORMAL_SERVICE",
};
constexpr std::string_view kUpdates[] = {"UPDATED", "NOT_UPDATED", "ROAMING_NOT_ALLOWED",
                                         "LOCATION_AREA_NOT_ALLOWED"};
constexpr std::string_view kRegistrations[] = {
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
    "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE"};
constexpr std::string_view kPacketStates[] = {"GMM_NULL",
                                              "GMM_DEREGISTERED",
                                              "GMM_REGISTERED_INITIATED",
                                              "GMM_REGISTERED",
                                              "GMM_DEREGISTERED_INITIATED",
                                              "GMM_ROUTING_AREA_UPDATE_INITIATED",
                                              "GMM_SERVICE_REQUEST_INITIATED"};
constexpr std::string_view kPacketSubStates[] = {"GMM_NORMAL_SERVICE",
                                                 "GMM_LIMITED_SERVICE",
                                                 "GMM_ATTACH_NEEDED",
                                                 "GMM_ATTEMPTING_TO_ATTACH",
                                                 "GMM_NO_IMSI",
                                                 "GMM_NO_CELL_AVAILABLE",
                                                 "GMM_PLMN_SEARCH",
                                                 "GMM_SUSPENDED",
                                                 "GMM_UPDATE_NEEDED",
                                                 "GMM_ATTEMPING_TO_UPDATE",
                                                 "GMM_ATTEMPTING_TO_UPDATE_MM",
                                                 "GMM_IMSI_DETACH_INITIATED",
                                                 "GMM_NULL_SUBSTATE"};
constexpr std::string_view kPacketUpdates[] = {"GMM_GU1_UPDATED", "GMM_GU2_NOT_UPDATED",
                                               "GMM_GU3_PLMN_NOT_ALLOWED",
                                               "GMM_GU3_ROUTING_AREA_NOT_ALLOWED"};
constexpr std::string_view kServices[] = {"NO_SERVICE", "CS_ONLY", "PS_ONLY", "CS_PS_SERVICE",
                                          "LIMITED_SERVICE"};
constexpr std::string_view kSelections[] = {"Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ",
                                            "LIMITED_MANUAL_ACQ"};
constexpr std::string_view kRadioStates[] = {
    "RR_INACTIVE",
    "RR_GOING_ACTIVE",
    "RR_GOING_INACTIVE",
    "RR_CELL_SELECTION",
    "RR_PLMN_LIST_CONSTRUCTION",
    "RR_IDLE",
    "RR_CELL_RESELECTION",
    "RR_CONNECTION_PENDING",
    "RR_CHOOSE_CELL",
    "RR_DATA_TRANSFER",
    "RR_NO_CHANNELS",
    "RR_CONNECTION_RELEASE",
    "RR_EARLY_CAMPED_WAIT_FOR_SI",
    "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
    "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
    "RR_WAIT_FOR_EARLY_PSCAN",
    "GRR51",
    "GRR52",
    "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
    "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
    "RR_CELL_REEST",
    "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS",
};

std::string_view nameAt(const Packet& packet, std::size_t offset,
                        std::span<const std::string_view> names) {
  return nameOf(static_cast<std::uint32_t>(packet.byte(offset)), names, kUnknown);
}

}  // namespace

void GsmUmtsReader::readMobilityManagement(const Packet& packet) {
  const std::string_view state = nameAt(packet, 13, kMobilityStates);
  section("Process CO").set("MM State", state);
  Dictionary shown = section("Process CS");
  shown.set("MM State", state);
  shown.set("MM Sub State", nameAt(packet, 14, kMobilitySubStates));
  shown.set("LU Reject Cause", nameAt(packet, 15, kUpdates));
}

void GsmUmtsReader::readRegistration(const Packet& packet) {
  for (const char* process : {"Process CO", "Process CS", "Process PS"}) {
    section(process).set("MM Service State", nameAt(packet, 13, kRegistrations));
  }
  section("Serving PLMN").set("PLMN Sel Mod", nameAt(packet, 14, kSelections));
}

void GsmUmtsReader::readPacketMobilityManagement(const Packet& packet) {
  Dictionary shown = section("Process PS");
  shown.set("MM State", nameAt(packet, 13, kPacketStates));
  shown.set("MM Sub State", nameAt(packet, 14, kPacketSubStates));
  shown.set("Attach Reject Cause", nameAt(packet, 15, kPacketUpdates));
}

void GsmUmtsReader::readServingNetwork(const Packet& packet) {
  const int b0 = packet.byte(15);
  const int b1 = packet.byte(16);
  const int b2 = packet.byte(17);
  Dictionary shown = section("Serving PLMN");
  shown.set("Mobile Country Code", text("%d%d%d", b0 & 15, b0 >> 4, b1 >> 4));
  shown.set("Mobile Network Code", text("%d%d%d", b2 & 15, b2 >> 4, b1 & 15));
  shown.set("Location Area Code", text("%d", 256 * packet.byte(18) + packet.byte(19)));
  shown.set("Routing Area Code", text("%d", packet.byte(20)));
  shown.set("Service Type", nameAt(packet, 14, kServices));
}

void GsmUmtsReader::readEquivalentNetworks(const Packet& packet) {
  std::vector<Value> rows;
  for (int i = 0; i < packet.byte(16); ++i) {
    const std::size_t at = 17 + 3 * static_cast<std::size_t>(i);
    const int country = packet.byte(at) * 100 + packet.byte(at + 2) * 10 + packet.byte(at + 4);
    const int network = packet.byte(at + 1) * 100 + packet.byte(at + 3) * 10 + packet.byte(at + 5);
    rows.push_back(Dictionary{{"Mobile Country Code", text("%d", country)},
                              {"Mobile Network Code", text("%d", network)}});
  }
  show("Equivalent PLMN List", std::move(rows));
}

void GsmUmtsReader::readRadioResource(const Packet& packet) {
  Dictionary shown = section("GSM RR Info");
  shown.set("RR State", nameAt(packet, 13, kRadioStates));
  shown.set("RR Sub State", text("%d", packet.byte(14)));
  shown.set("RR Status", text("%d", packet.byte(15)));
  shown.set("RR Mode", text("%d", packet.byte(16)));
}

}  // namespace kestro::plain
