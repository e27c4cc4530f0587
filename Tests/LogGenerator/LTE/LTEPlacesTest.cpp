// SPDX-License-Identifier: MIT
// Where the LTE decoders read: every place of every packet, those that are not shown included.
#include "Tests/Support/ExplainedPlaces.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

class LTEPlacesTest : public ExplainedPlacesFixture {
 protected:
  LTEPlacesTest() : ExplainedPlacesFixture("LTE") {}
};

TEST_F(LTEPlacesTest, IntraFrequencyMeasurement) {
  const std::string serving = "Connected mode LTE Intra-frequency Measurement: ";
  EXPECT_THAT(places(allOnes(0xB179, 29)),
              ElementsAre(serving + "E-ARFCN 17[0-15]=65535",
                          serving + "Serving Physical Cell ID 19[0-15]=65535",
                          serving + "Subframe Number 21[0-15]=65535",
                          serving + "Serving Filtered RSRP 23[0-15]=65535",
                          serving + "Serving Filtered RSRQ 25[0-15]=65535",
                          "Measured Neighbor Cells: measured neighbour count 27[0-7]=255",
                          "Detected Cells: detected cell count 28[0-7]=255"));
}

TEST_F(LTEPlacesTest, MeasuredAndDetectedCells) {
  EXPECT_THAT(
      recordPlaces(allOnes(0xB179, 40).u8(27, 1).u8(28, 1)),
      ElementsAre("Measured Neighbor Cells: measured neighbour#0 Physical Cell ID 29[0-15]=65535",
                  "Measured Neighbor Cells: measured neighbour#0 Filtered RSRP 31[0-15]=65535",
                  "Measured Neighbor Cells: measured neighbour#0 Filtered RSRQ 33[0-15]=65535",
                  "Detected Cells: detected cell#0 Physical Cell ID 35[0-15]=65535"));
}

TEST_F(LTEPlacesTest, ServingCellMeasurement) {
  const std::string serving = "Serving Cell Measurements: ";
  EXPECT_THAT(
      places(allOnes(0xB17F, 33)),
      ElementsAre(
          serving + "Version 13[0-7]=255", serving + "E-ARFCN 17[0-15]=65535",
          serving + "Physical Cell ID 19[0-8]=511", serving + "Serving Layer Priority 19[9-12]=15",
          serving + "Measured RSRP 21[0-8]=511", serving + "Average RSRP 21[9-17]=511",
          serving + "Measured RSRQ 21[18-24]=127", serving + "Average RSRQ 21[25-31]=127",
          serving + "Measured RSSI 25[0-8]=511", serving + "Qrxlevmin 25[9-14]=63",
          serving + "P_Max 25[15-21]=127", serving + "Max UE Tx Power 25[22-27]=63",
          serving + "Srxlev 29[0-6]=127",
          serving + "Num of Consecutive DRX Cycles of S < 0 29[7-12]=63",
          serving + "S Intra Search 29[13-18]=63", serving + "S Non Intra Search 29[19-24]=63",
          serving + "Measurement Rules Updated 29[25-25]=1",
          serving + "Measurement Rules 29[26-29]=15"));
}

TEST_F(LTEPlacesTest, NeighborMeasurements) {
  EXPECT_THAT(places(allOnes(0xB180, 21)),
              ElementsAre("Neighbor Measurements: Version 13[0-7]=255",
                          "Neighbor Measurements: E-ARFCN 17[0-15]=65535",
                          "Neighbor Measurements: Qrxlevmin 19[0-5]=63",
                          "Neighbor Cells List: neighbour count 19[6-10]=31"));
}

TEST_F(LTEPlacesTest, NeighborCells) {
  const std::string cell = "Neighbor Cells List: neighbour#0 ";
  // Bits 6 to 10 hold 0, for one record.
  EXPECT_THAT(
      recordPlaces(allOnes(0xB180, 45).u16(19, 0xF83F)),
      ElementsAre(cell + "Physical Cell ID 21[0-8]=511", cell + "Measured RSSI 21[9-16]=255",
                  cell + "Measured RSRP 21[17-25]=511", cell + "Average RSRP 25[0-8]=511",
                  cell + "Measured RSRQ 25[9-15]=127", cell + "Average RSRQ 27[0-6]=127",
                  cell + "Srxlev 27[7-13]=127", cell + "Frequency Offset 29[0-15]=65535",
                  cell + "Ant 0 Frame Offset 33[0-10]=2047",
                  cell + "Ant 0 Sample Offset 33[11-29]=524287",
                  cell + "Ant 1 Frame Offset 33[0-10]=2047",
                  cell + "Ant 1 Sample Offset 33[11-29]=524287"));
}

TEST_F(LTEPlacesTest, ReselectionCandidates) {
  EXPECT_THAT(places(allOnes(0xB186, 21)),
              ElementsAre("Reselection Candidates: Version 13[0-7]=255",
                          "Reselection Candidates: Serving EARFCN 15[0-15]=65535",
                          "Reselection Candidates: Serving Cell ID 17[0-15]=65535",
                          "Reselection Candidates List: candidate count 19[0-7]=255"));
}

TEST_F(LTEPlacesTest, FieldsOfAllTechnologiesOfACandidate) {
  const std::string candidate = "Reselection Candidates List: candidate#0 ";
  EXPECT_THAT(
      recordPlaces(allOnes(0xB186, 35).u16(19, 1)),
      ElementsAre(candidate + "Candidate Priority 21[0-15]=65535",
                  candidate + "Candidate RAT Type 23[0-15]=65535",
                  candidate + "E ARFCN 25[0-15]=65535", candidate + "Cell ID 27[7-15]=511",
                  candidate + "U ARFCN 25[0-15]=65535", candidate + "PSC 27[0-15]=65535",
                  candidate + "ARFCN 25[0-15]=65535", candidate + "Band 27[0-7]=255",
                  candidate + "BSIC ID 28[0-7]=255", candidate + "Band 25[0-7]=255",
                  candidate + "Channel 29[0-15]=65535", candidate + "Pilot 31[0-15]=65535"));
}

TEST_F(LTEPlacesTest, ServingCellInfo) {
  const std::string info = "Serving Cell Info: ";
  EXPECT_THAT(
      places(allOnes(0xB0C2, 38)),
      ElementsAre(
          info + "Physical Cell ID 14[0-15]=65535", info + "Download Frequency 16[0-15]=65535",
          info + "Upload Frequency 18[0-15]=65535", info + "UARFCN",
          info + "Download Bandwidth 20[0-7]=255", info + "Upload Bandwidth 21[0-7]=255",
          info + "Cell Identity 22[0-31]=4294967295", info + "Tracking Area Code 26[0-15]=65535",
          info + "Freq Band Indicator 28[0-31]=4294967295"));
  EXPECT_THAT(places(allOnes(0xB0C1, 22)), ElementsAre(info + "Num Tx Antennas 20[0-7]=255"));
}

}  // namespace
}  // namespace kestro::testing
