// SPDX-License-Identifier: MIT
// Where the GSM decoders read: every place of every packet, those that are not shown included.
#include "Tests/Support/ExplainedPlaces.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class GsmUmtsPlacesTest : public ExplainedPlacesFixture {
 protected:
  GsmUmtsPlacesTest() : ExplainedPlacesFixture("Ondrel_GSM") {}
};

// --- UMTS cells ----------------------------------------------------------------------------------

TEST_F(GsmUmtsPlacesTest, SetInformation) {
  EXPECT_THAT(
      places(allOnes(0x417A, 16)),
      ElementsAre(
          "Active Set: Receive Level 13[0-15]=-1", "Active Set: Cells 15[0-7]=255",
          "Active Set: cell count 15[0-7]=255", "Detected Set: Receive Level 13[0-15]=-1",
          "Detected Set: Cells 15[0-7]=255", "Detected Set: cell count 15[0-7]=255",
          "Monitored Set: Receive Level 13[0-15]=-1", "Monitored Set: Cells 15[0-7]=255",
          "Monitored Set: cell count 15[0-7]=255", "Virtual Active Set: Receive Level 13[0-15]=-1",
          "Virtual Active Set: Cells 15[0-7]=255", "Virtual Active Set: cell count 15[0-7]=255"));
}

TEST_F(GsmUmtsPlacesTest, CellsOfTheActiveSet) {
  // One member cell, of set type 0; its energies are words 8 to 10 of the record behind it, at 31.
  EXPECT_THAT(recordPlaces(allOnes(0x417A, 75).u8(15, 1).u8(24, 0x1F)),
              ElementsAre("Active Set: cell#0 Scrambling Code 23[0-12]=8191",
                          "Active Set: cell#0 Set Type 24[5-7]=0",
                          "Active Set: cell#0 RSCP 13[0-15]=-1 63[0-31]=4294967295 "
                          "67[0-31]=4294967295 71[0-31]=4294967295",
                          "Active Set: cell#0 Energy Per Chip 63[0-31]=4294967295 "
                          "67[0-31]=4294967295 71[0-31]=4294967295"));
}

TEST_F(GsmUmtsPlacesTest, IdleModeRanking) {
  EXPECT_THAT(
      places(allOnes(0x4005, 15)),
      ElementsAre("GSM Set: UMTS Cells 13[0-7]=255", "GSM Set: GSM Cells 14[0-7]=255",
                  "GSM Set: GSM cell count 14[0-7]=255", "UMTS Set: UMTS Cells 13[0-7]=255",
                  "UMTS Set: GSM Cells 14[0-7]=255", "UMTS Set: UMTS cell count 13[0-7]=255"));
  EXPECT_THAT(
      recordPlaces(allOnes(0x4005, 40).u8(13, 1).u8(14, 1)),
      ElementsAre("GSM Set: GSM cell#0 ARFCN 15[0-15]=65535",
                  "GSM Set: GSM cell#0 BSIC 17[0-15]=65535", "GSM Set: GSM cell#0 RSSI 19[0-7]=-1",
                  "GSM Set: GSM cell#0 Ranking Value 20[0-15]=-1",
                  "UMTS Set: UMTS cell#0 Downlink Frequency 15[0-15]=-1",
                  "UMTS Set: UMTS cell#0 Scrambling Code 17[0-15]=65535",
                  "UMTS Set: UMTS cell#0 RSCP 19[0-7]=-1",
                  "UMTS Set: UMTS cell#0 Rank Cell RSCP 20[0-15]=-1",
                  "UMTS Set: UMTS cell#0 Energy Per Chip 22[0-7]=-1",
                  "UMTS Set: UMTS cell#0 Ranking Value 23[0-15]=-1"));
}

// --- GSM cells -----------------------------------------------------------------------------------

TEST_F(GsmUmtsPlacesTest, ServingCellIdentity) {
  EXPECT_THAT(places(allOnes(0x5134, 26)), ElementsAre("GSM Serving Cell: Cell ID 17[0-15]=65535",
                                                       "GSM Serving Cell: ARFCN 13[0-15]=65535",
                                                       "GSM Serving Cell: BSIC 15[0-15]=65535"));
}

TEST_F(GsmUmtsPlacesTest, MeasurementsOfTheServingCell) {
  EXPECT_THAT(
      places(allOnes(0x5137, 29)),
      ElementsAre("GSM Serving Cell: RSSI 15[0-7]=255", "GSM Serving Cell: C1 Value 16[0-15]=65535",
                  "GSM Serving Cell: C2 Value 20[0-15]=65535",
                  "Neighboring Cells: Neighbours 28[0-7]=255",
                  "Neighboring Cells: neighbour count 28[0-7]=255",
                  "GSM RR Info: Serving Rx Level 15[0-7]=255",
                  "GSM RR Info: Rx Quality Full 16[0-31]=4294967295",
                  "GSM RR Info: Rx Quality Sub 20[0-31]=4294967295"));
}

TEST_F(GsmUmtsPlacesTest, MeasuredNeighbours) {
  EXPECT_THAT(recordPlaces(allOnes(0x5137, 43).u8(28, 1)),
              ElementsAre("Neighboring Cells: neighbour#0 ARFCN 29[0-15]=65535",
                          "Neighboring Cells: neighbour#0 RSSI 31[0-7]=255",
                          "Neighboring Cells: neighbour#0 C1 Value 32[0-31]=4294967295",
                          "Neighboring Cells: neighbour#0 BSIC"));
}

TEST_F(GsmUmtsPlacesTest, NeighbourBSICs) {
  EXPECT_THAT(places(allOnes(0x51FF, 15)),
              ElementsAre("Neighboring Cells: Entries 14[0-7]=255",
                          "Neighboring Cells: entry count 14[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0x51FF, 19).u8(14, 1)),
              ElementsAre("Neighboring Cells: entry#0 ARFCN 15[0-15]=65535",
                          "Neighboring Cells: entry#0 BSIC 17[0-7]=255"));
}

TEST_F(GsmUmtsPlacesTest, NeighbourBSICsAreExplainedWithTheirFrequency) {
  std::vector<std::string> texts;
  generator->explainMessage(packet(0x51FF).u8(14, 1).u16(15, 975).u8(17, 62).bytes(),
                            [&](const ExplainedValue& value) {
                              if (value.row) texts.emplace_back(value.text.text());
                            });
  EXPECT_THAT(texts, ElementsAre("975", "62"));
}

TEST_F(GsmUmtsPlacesTest, DedicatedChannelAndMobileAllocation) {
  EXPECT_THAT(places(allOnes(0x5076, 17)),
              ElementsAre("GSM Serving Cell: MA Dedicated ARFCN 13[0-7]=255"));
  EXPECT_THAT(places(allOnes(0x51F8, 15)),
              ElementsAre("Mobile Allocation: HSN 13[0-7]=255",
                          "Mobile Allocation: Frequencies 14[0-7]=255",
                          "Mobile Allocation: ARFCNs count 14[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0x51F8, 17).u8(14, 1)),
              ElementsAre("Mobile Allocation: ARFCNs#0 ARFCN 15[0-15]=65535"));
}

// --- Radio resource ------------------------------------------------------------------------------

TEST_F(GsmUmtsPlacesTest, RadioResource) {
  EXPECT_THAT(
      places(allOnes(0x512C, 17)),
      ElementsAre("GSM RR Info: RR State 13[0-7]=255", "GSM RR Info: RR Sub State 14[0-7]=255",
                  "GSM RR Info: RR Status 15[0-7]=255", "GSM RR Info: RR Mode 16[0-7]=255"));
  EXPECT_THAT(places(allOnes(0x51F6, 24)), ElementsAre("GSM RR Info: DRX Used 16[0-7]=255"));
  EXPECT_THAT(places(allOnes(0x5072, 20)), ElementsAre("GSM RR Info: DTX Used 19[0-7]=255"));
}

// --- Link quality --------------------------------------------------------------------------------

TEST_F(GsmUmtsPlacesTest, BlockErrorRates) {
  EXPECT_THAT(places(allOnes(0x4116, 16)),
              ElementsAre("BLER: Channels 13[0-7]=255", "BLER: Window Size 14[0-15]=65535",
                          "BLER: Transport Channels count 13[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0x4116, 25).u8(13, 1)),
              ElementsAre("BLER: Transport Channels#0 Transport Channel ID 16[0-7]=255",
                          "BLER: Transport Channels#0 CRC Received 17[0-31]=4294967295",
                          "BLER: Transport Channels#0 CRC Received in Error 21[0-31]=4294967295"));
}

TEST_F(GsmUmtsPlacesTest, HSDPAStatistics) {
  EXPECT_THAT(places(allOnes(0x4221, 18)),
              ElementsAre("HSDPA Info: Version 13[0-7]=255", "HSDPA Info: Sub Frames 14[0-9]=1023",
                          "HSDPA Info: Carrier Info 14[10-11]=3",
                          "HSDPA Info: Primary Processes 16[0-7]=255",
                          "HSDPA Info: Secondary Processes 17[0-7]=255",
                          "HSDPA Info: Primary HARQ Process count 16[0-7]=255",
                          "HSDPA Info: Secondary HARQ Process count 17[0-7]=255"));
}

TEST_F(GsmUmtsPlacesTest, HARQProcesses) {
  // The secondary process stands 162 bytes behind the first primary one's place, 18.
  EXPECT_THAT(recordPlaces(allOnes(0x4221, 189).u8(16, 1).u8(17, 1)),
              ElementsAre("HSDPA Info: Primary HARQ Process#0 Process ID 18[0-7]=255",
                          "HSDPA Info: Primary HARQ Process#0 No Rx Bits 19[0-31]=4294967295",
                          "HSDPA Info: Primary HARQ Process#0 New Tx 23[0-15]=65535",
                          "HSDPA Info: Primary HARQ Process#0 Block Errors 25[0-15]=65535",
                          "HSDPA Info: Secondary HARQ Process#0 Process ID 180[0-7]=255",
                          "HSDPA Info: Secondary HARQ Process#0 No Rx Bits 181[0-31]=4294967295",
                          "HSDPA Info: Secondary HARQ Process#0 New Tx 185[0-15]=65535",
                          "HSDPA Info: Secondary HARQ Process#0 Block Errors 187[0-15]=65535"));
}

// --- Mobility management -------------------------------------------------------------------------

TEST_F(GsmUmtsPlacesTest, MobilityManagementStates) {
  EXPECT_THAT(places(allOnes(0x7131, 16)),
              ElementsAre("Process CO: MM State 13[0-7]=255", "Process CS: MM State 13[0-7]=255",
                          "Process CS: MM Sub State 14[0-7]=255",
                          "Process CS: LU Reject Cause 15[0-7]=255"));
  EXPECT_THAT(
      places(allOnes(0x7130, 16)),
      ElementsAre("Process PS: MM State 13[0-7]=255", "Process PS: MM Sub State 14[0-7]=255",
                  "Process PS: Attach Reject Cause 15[0-7]=255"));
  EXPECT_THAT(places(allOnes(0x7132, 16)), ElementsAre("Process PS: MM Service State 13[0-7]=255",
                                                       "Process CO: MM Service State 13[0-7]=255",
                                                       "Serving PLMN: PLMN Sel Mod 14[0-7]=255",
                                                       "Process CS: MM Service State 13[0-7]=255"));
}

TEST_F(GsmUmtsPlacesTest, Networks) {
  EXPECT_THAT(places(allOnes(0x7135, 32)),
              ElementsAre("Serving PLMN: Mobile Country Code 15[0-3]=15 15[4-7]=15 16[4-7]=15",
                          "Serving PLMN: Mobile Network Code 17[0-3]=15 17[4-7]=15 16[0-3]=15",
                          "Serving PLMN: Location Area Code 18[0-15]=65535^",
                          "Serving PLMN: Routing Area Code 20[0-7]=255",
                          "Serving PLMN: Service Type 14[0-7]=255"));
  EXPECT_THAT(places(allOnes(0x7150, 17)),
              ElementsAre("Equivalent PLMN List: PLMNs 16[0-7]=255",
                          "Equivalent PLMN List: PLMN count 16[0-7]=255"));
  EXPECT_THAT(
      recordPlaces(allOnes(0x7150, 23).u8(16, 1)),
      ElementsAre(
          "Equivalent PLMN List: PLMN#0 Mobile Country Code 17[0-7]=255 19[0-7]=255 21[0-7]=255",
          "Equivalent PLMN List: PLMN#0 Mobile Network Code 18[0-7]=255 20[0-7]=255 22[0-7]=255"));
}

TEST_F(GsmUmtsPlacesTest, NothingOfAPacketThatIsTooShort) {
  EXPECT_THAT(places(allOnes(0x417A, 15)), IsEmpty());
  EXPECT_THAT(places(allOnes(0x512C, 16)), IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
