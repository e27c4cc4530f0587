// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/MobilityManagement.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

PacketBytes states(LogCode code, unsigned first, unsigned second = 0, unsigned third = 0) {
  return packet(code).u8(13, first).u8(14, second).u8(15, third);
}

constexpr const char* kMMStates[] = {"MM_NULL",
                                     "Unknown",
                                     "Unknown",
                                     "MM_LOCATION_UPDATE_INITIATED",
                                     "Unknown",
                                     "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
                                     "MM_CONNECTION_ACTIVE",
                                     "MM_IMSI_DETACH_INITIATED",
                                     "MM_PROCESS_CM_SERVICE_PROMPT",
                                     "MM_WAIT_FOR_NETWORK_COMMAND",
                                     "MM_LOCATION_UPDATE_REJECTED",
                                     "Unknown",
                                     "Unknown",
                                     "MM_WAIT_FOR_RR_CONNECTION_LU",
                                     "MM_WAIT_FOR_RR_CONNECTION_MM",
                                     "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
                                     "Unknown",
                                     "MM_REESTABLISHMENT_INITIATED",
                                     "MM_WAIT_FOR_RR_ACTIVE",
                                     "MM_IDLE",
                                     "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
                                     "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
                                     "MM_WAIT_FOR_REESTABLISH_DECISION",
                                     "MM_LOCATION_UPDATING_PENDING",
                                     "Unknown",
                                     "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
                                     "Unknown"};
constexpr const char* kRegistrationStates[] = {
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",
    "REG_STATE_REGISTERING",   "REG_STATE_DEREGISTERING",
    "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE",       "Unknown"};

// --- ProcessCO -----------------------------------------------------------------------------------

class ProcessCOTest : public DecoderFixture<ProcessCO> {};

TEST_F(ProcessCOTest, ShowsTheMMStateAlone) {
  decode(states(0x7131, 19, 8, 1));
  EXPECT_THAT(entries(), ElementsAre(Pair("MM State", "MM_IDLE")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ProcessCO")));
}

TEST_F(ProcessCOTest, NamesEveryMMState) {
  unsigned value = 0;
  for (const char* name : kMMStates) {
    decode(states(0x7131, value));
    EXPECT_EQ(text("MM State"), name) << value;
    ++value;
  }
  decode(states(0x7131, 200));
  EXPECT_EQ(text("MM State"), "Unknown");
}

TEST_F(ProcessCOTest, NamesEveryServiceState) {
  unsigned value = 0;
  for (const char* name : kRegistrationStates) {
    decode(states(0x7132, value, 1));
    EXPECT_THAT(entries(), ElementsAre(Pair("MM Service State", name))) << value;
    ++value;
  }
}

TEST_F(ProcessCOTest, KeepsWhatAPacketDoesNotCarry) {
  decode(states(0x7132, 1));
  decode(states(0x7131, 19));
  decode(states(0x7132, 6));
  EXPECT_THAT(entries(), ElementsAre(Pair("MM Service State", "REG_STATE_OFFLINE"),
                                     Pair("MM State", "MM_IDLE")));
}

TEST_F(ProcessCOTest, NeedsSixteenBytes) {
  decode(states(0x7131, 19).length(15));
  decode(states(0x7132, 1).length(15));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ProcessCO"), warningLine("ProcessCO")));
}

// --- ProcessCS -----------------------------------------------------------------------------------

class ProcessCSTest : public DecoderFixture<ProcessCS> {};

TEST_F(ProcessCSTest, ShowsStateSubStateAndUpdateStatus) {
  decode(states(0x7131, 19, 8, 1));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("MM State", "MM_IDLE"), Pair("MM Sub State", "MM_NORMAL_SERVICE"),
                          Pair("LU Reject Cause", "NOT_UPDATED")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ProcessCS")));
}

TEST_F(ProcessCSTest, NamesEverySubState) {
  constexpr const char* kNames[] = {"MM_NULL_SUBSTATE",        "MM_NO_IMSI",
                                    "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
                                    "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
                                    "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
                                    "MM_NORMAL_SERVICE",       "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7131, 0, value));
    EXPECT_EQ(text("MM Sub State"), name) << value;
    ++value;
  }
}

TEST_F(ProcessCSTest, NamesEveryUpdateStatus) {
  constexpr const char* kNames[] = {"UPDATED", "NOT_UPDATED", "ROAMING_NOT_ALLOWED",
                                    "LOCATION_AREA_NOT_ALLOWED", "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7131, 0, 0, value));
    EXPECT_EQ(text("LU Reject Cause"), name) << value;
    ++value;
  }
}

TEST_F(ProcessCSTest, ShowsTheServiceStateAlone) {
  decode(states(0x7132, 5, 1));
  EXPECT_THAT(entries(), ElementsAre(Pair("MM Service State", "REG_STATE_AUTOMATIC_SEARCH")));
}

TEST_F(ProcessCSTest, NeedsSixteenBytes) {
  decode(states(0x7131, 19).length(15));
  decode(states(0x7132, 1).length(15));
  EXPECT_THAT(entries(), IsEmpty());
}

// --- ProcessPS -----------------------------------------------------------------------------------

class ProcessPSTest : public DecoderFixture<ProcessPS> {};

TEST_F(ProcessPSTest, ShowsTheGMMStates) {
  decode(states(0x7130, 3, 9, 0));
  EXPECT_THAT(entries(), ElementsAre(Pair("MM State", "GMM_REGISTERED"),
                                     Pair("MM Sub State", "GMM_ATTEMPING_TO_UPDATE"),
                                     Pair("Attach Reject Cause", "GMM_GU1_UPDATED")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ProcessPS")));
}

TEST_F(ProcessPSTest, NamesEveryState) {
  constexpr const char* kNames[] = {"GMM_NULL",
                                    "GMM_DEREGISTERED",
                                    "GMM_REGISTERED_INITIATED",
                                    "GMM_REGISTERED",
                                    "GMM_DEREGISTERED_INITIATED",
                                    "GMM_ROUTING_AREA_UPDATE_INITIATED",
                                    "GMM_SERVICE_REQUEST_INITIATED",
                                    "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7130, value));
    EXPECT_EQ(text("MM State"), name) << value;
    ++value;
  }
}

TEST_F(ProcessPSTest, NamesEverySubState) {
  constexpr const char* kNames[] = {"GMM_NORMAL_SERVICE",
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
                                    "GMM_NULL_SUBSTATE",
                                    "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7130, 0, value));
    EXPECT_EQ(text("MM Sub State"), name) << value;
    ++value;
  }
}

TEST_F(ProcessPSTest, NamesEveryUpdateStatus) {
  constexpr const char* kNames[] = {"GMM_GU1_UPDATED", "GMM_GU2_NOT_UPDATED",
                                    "GMM_GU3_PLMN_NOT_ALLOWED", "GMM_GU3_ROUTING_AREA_NOT_ALLOWED",
                                    "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7130, 0, 0, value));
    EXPECT_EQ(text("Attach Reject Cause"), name) << value;
    ++value;
  }
}

TEST_F(ProcessPSTest, ShowsTheServiceStateAlone) {
  decode(states(0x7132, 4, 1));
  EXPECT_THAT(entries(), ElementsAre(Pair("MM Service State", "REG_STATE_MANUAL_SEARCH")));
}

TEST_F(ProcessPSTest, NeedsSixteenBytes) {
  decode(states(0x7130, 3).length(15));
  decode(states(0x7132, 1).length(15));
  EXPECT_THAT(entries(), IsEmpty());
}

// --- ServingPLMN ---------------------------------------------------------------------------------

class ServingPLMNTest : public DecoderFixture<ServingPLMN> {
 protected:
  static PacketBytes network(unsigned first, unsigned second, unsigned third) {
    return packet(0x7135).u8(15, first).u8(16, second).u8(17, third).length(32);
  }
  static Dictionary serving(std::string_view technology) {
    return {{"kTqCellMonitorCellRadioAccessTechnology", technology},
            {"kTqCellMonitorCellType", "kTqCellMonitorCellTypeServing"},
            {"kTqCellMonitorLAC", Value::integer(4660)},
            {"kTqCellMonitorMNC", Value::integer(2)},
            {"kTqCellMonitorMCC", Value::integer(262)}};
  }
  static Dictionary umts() { return serving("kTqCellMonitorRadioAccessTechnologyUMTS"); }
};

TEST_F(ServingPLMNTest, ShowsTheNetworkAndItsAreas) {
  decode(network(0x13, 0x00, 0x62).u8(14, 3).u8(18, 0x12).u8(19, 0x34).u8(20, 17));
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Mobile Country Code", "310"), Pair("Mobile Network Code", "260"),
                          Pair("Location Area Code", "4660"), Pair("Routing Area Code", "17"),
                          Pair("Service Type", "CS_PS_SERVICE")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN")));
}

TEST_F(ServingPLMNTest, PrintsAFillerAsANumber) {
  decode(network(0x21, 0xF3, 0x54));
  EXPECT_EQ(text("Mobile Country Code"), "1215");
  EXPECT_EQ(text("Mobile Network Code"), "453");
}

TEST_F(ServingPLMNTest, PutsEveryDigitInItsPlace) {
  decode(network(0x21, 0x36, 0x54));
  EXPECT_EQ(text("Mobile Country Code"), "123");
  EXPECT_EQ(text("Mobile Network Code"), "456");
  decode(network(0xFF, 0xFF, 0xFF).u8(18, 0xFF).u8(19, 0xFF).u8(20, 0xFF));
  EXPECT_EQ(text("Mobile Country Code"), "151515");
  EXPECT_EQ(text("Mobile Network Code"), "151515");
  EXPECT_EQ(text("Location Area Code"), "65535");
  EXPECT_EQ(text("Routing Area Code"), "255");
}

TEST_F(ServingPLMNTest, NamesEveryServiceType) {
  constexpr const char* kNames[] = {"NO_SERVICE",    "CS_ONLY",         "PS_ONLY",
                                    "CS_PS_SERVICE", "LIMITED_SERVICE", "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(network(0, 0, 0).u8(14, value));
    EXPECT_EQ(text("Service Type"), name) << value;
    ++value;
  }
}

TEST_F(ServingPLMNTest, NamesEverySelectionMode) {
  constexpr const char* kNames[] = {
      "Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ", "Unknown"};
  unsigned value = 0;
  for (const char* name : kNames) {
    decode(states(0x7132, 6, value));
    EXPECT_THAT(entries(), ElementsAre(Pair("PLMN Sel Mod", name))) << value;
    ++value;
  }
}

TEST_F(ServingPLMNTest, NeedsThirtyTwoBytesOfNetwork) {
  decode(network(0x21, 0x36, 0x54).length(31));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN")));
}

TEST_F(ServingPLMNTest, NeedsSixteenBytesOfSelectionMode) {
  decode(states(0x7132, 0, 1).length(15));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(ServingPLMNTest, ShowsTheFirstListedServingCell) {
  decodeList(0xFF0001, Array{umts(), serving("kTqCellMonitorRadioAccessTechnologyGSM")});
  EXPECT_THAT(entries(),
              ElementsAre(Pair("Mobile Country Code", "262"), Pair("Mobile Network Code", "2"),
                          Pair("Location Area Code", "4660")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN")));
}

TEST_F(ServingPLMNTest, TakesAGSMCellToo) {
  Dictionary gsm = serving("kTqCellMonitorRadioAccessTechnologyGSM");
  gsm.set("kTqCellMonitorMNC", Value::integer(-1));
  decodeList(0xFF0001, Array{serving("kTqCellMonitorRadioAccessTechnologyLTE"), gsm, umts()});
  EXPECT_EQ(text("Mobile Network Code"), "-1");
}

TEST_F(ServingPLMNTest, PassesOverNeighboursAndCellsOfNoKind) {
  Dictionary neighbour = umts();
  neighbour.set("kTqCellMonitorCellType", "kTqCellMonitorCellTypeNeighbor");
  Dictionary untyped = umts();
  untyped.remove("kTqCellMonitorCellType");
  Dictionary unknown = umts();
  unknown.remove("kTqCellMonitorCellRadioAccessTechnology");
  decodeList(0xFF0001, Array{neighbour, untyped, unknown, "no cell"});
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN")));
}

TEST_F(ServingPLMNTest, KeepsWhatAListedCellLacks) {
  decode(network(0x21, 0x36, 0x54));
  takeLines();
  Dictionary cell = umts();
  cell.remove("kTqCellMonitorMCC");
  cell.set("kTqCellMonitorMNC", "2");
  cell.remove("kTqCellMonitorLAC");
  decodeList(0xFF0001, Array{cell});
  EXPECT_EQ(text("Mobile Country Code"), "123");
  EXPECT_EQ(text("Mobile Network Code"), "456");
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN"),
                                       errorLine("ServingPLMN: Failed to retrieve MCC\n"),
                                       errorLine("ServingPLMN: Failed to retrieve MNC\n"),
                                       errorLine("ServingPLMN: Failed to retrieve LAC\n")));
}

TEST_F(ServingPLMNTest, ReportsALostList) {
  decode(packet(0xFF0001).length(30, 'x'));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN"),
                                       errorLine("Cell Info Array data could not be constructed"),
                                       errorLine("Failed to get Cell Array\n")));
  decodeList(0xFF0001, umts());
  EXPECT_THAT(takeLines(),
              ElementsAre(warningLine("ServingPLMN"), errorLine("Failed to get Cell Array\n")));
  EXPECT_THAT(entries(), IsEmpty());
}

TEST_F(ServingPLMNTest, IsSilentAboutAnEmptyList) {
  decodeList(0xFF0001, Array());
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("ServingPLMN")));
}

// --- EquivalentPLMNList --------------------------------------------------------------------------

class EquivalentPLMNListTest : public DecoderFixture<EquivalentPLMNList> {
 protected:
  static PacketBytes networks(unsigned count) { return packet(0x7150).u8(16, count); }
};

TEST_F(EquivalentPLMNListTest, ReadsSixInterleavedDigits) {
  decode(networks(1).u8(17, 2).u8(18, 4).u8(19, 6).u8(20, 5).u8(21, 2).u8(22, 7));
  ASSERT_THAT(list(), SizeIs(1));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Mobile Country Code", "262"), Pair("Mobile Network Code", "457")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("EquivalentPLMNList")));
}

TEST_F(EquivalentPLMNListTest, StepsByThreeBytes) {
  // 1 2 3 4 5 6 7 8 9: the second entry begins with the 4.
  PacketBytes bytes = networks(2);
  for (unsigned i = 0; i < 9; ++i) bytes.u8(17 + i, i + 1);
  decode(bytes);
  EXPECT_THAT(column("Mobile Country Code"), ElementsAre("135", "468"));
  EXPECT_THAT(column("Mobile Network Code"), ElementsAre("246", "579"));
}

TEST_F(EquivalentPLMNListTest, ShowsBytesThatAreNoDigits) {
  decode(networks(1).length(17).length(23, 0xFF));
  EXPECT_THAT(row(0), ElementsAre(Pair("Mobile Country Code", "28305"),
                                  Pair("Mobile Network Code", "28305")));
}

TEST_F(EquivalentPLMNListTest, ReadsZerosPastTheEnd) {
  decode(networks(1).u8(17, 2).u8(18, 4).u8(19, 6));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Mobile Country Code", "260"), Pair("Mobile Network Code", "400")));
}

TEST_F(EquivalentPLMNListTest, IsEmptiedByAPacketWithoutEntries) {
  decode(networks(1).length(23));
  decode(networks(0).length(17));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(EquivalentPLMNListTest, NeedsSeventeenBytes) {
  decode(networks(1).length(23));
  decode(packet(0x7150).length(16));
  EXPECT_THAT(list(), SizeIs(1));
}

}  // namespace
}  // namespace kestro::testing
