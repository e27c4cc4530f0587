// SPDX-License-Identifier: MIT
// Where the UTRAN decoders read: every place of every packet, those that are not shown included.
#include "Tests/Support/ExplainedPlaces.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

class UTRANPlacesTest : public ExplainedPlacesFixture {
 protected:
  UTRANPlacesTest() : ExplainedPlacesFixture("UTRAN2") {
    platform.bundle().setResource("UTRAN.plist", {});  // it has no decoders without a template
    generator = LogGenerator::generatorFromTechnology(generatorServices(platform), "UTRAN2");
  }
};

TEST_F(UTRANPlacesTest, RRCState) {
  EXPECT_THAT(places(allOnes(0xD0E0, 15)),
              ElementsAre("RRC Info: Mode Valid 13[0-7]=255", "RRC Info: State 14[0-7]=255"));
  EXPECT_THAT(places(allOnes(0xD0E0, 14)), ElementsAre("RRC Info: State 14[0-7]=0"));
}

TEST_F(UTRANPlacesTest, SystemInformation) {
  const std::string info = "Serving Cell Info: ";
  EXPECT_THAT(
      places(allOnes(0xD0E2, 26)),
      ElementsAre(info + "Cell Access Restrictions 14[0-7]=255",
                  info + "Cell ID 21[0-31]=4294967295", info + "Downlink UARFCN 19[0-15]=65535",
                  info + "Uplink UARFCN 17[0-15]=65535", info + "URA ID 15[0-7]=255",
                  info + "Allowed Access 25[0-0]=1"));
}

TEST_F(UTRANPlacesTest, Neighbors) {
  const std::string neighbor = "Neighbor Cell List: UTRAN neighbour#0 ";
  EXPECT_THAT(places(allOnes(0xD00A, 21)),
              ElementsAre("Neighbor Cell List: UTRAN neighbour count 16[1-7]=127"));
  // Bits 1 to 7 hold 1.
  EXPECT_THAT(recordPlaces(allOnes(0xD00A, 184).u8(16, 3)),
              ElementsAre(neighbor + "UARFCN 168[0-13]=16383", neighbor + "Cell ID 169[6-12]=127",
                          neighbor + "Filter RSCP 170[5-12]=255", neighbor + "Status 171[5-6]=3",
                          neighbor + "inJDCS 171[7-7]=1"));
}

TEST_F(UTRANPlacesTest, GSMNeighbors) {
  const std::string neighbor = "GSM Neighbor Cell List: GSM neighbour#0 ";
  EXPECT_THAT(places(allOnes(0xD00E, 17)),
              ElementsAre("GSM Neighbor Cell List: GSM neighbour count 16[0-7]=255"));
  EXPECT_THAT(recordPlaces(allOnes(0xD00E, 25).u8(16, 1)),
              ElementsAre(neighbor + "Cell ID 17[0-13]=16383",
                          neighbor + "Band Indicator 18[6-6]=1", neighbor + "BSIC Valid 18[7-7]=1",
                          neighbor + "NCC 19[0-7]=255", neighbor + "BCC 20[0-7]=255",
                          neighbor + "ARFCN 21[0-15]=65535", neighbor + "RSSI 23[0-15]=-1"));
}

TEST_F(UTRANPlacesTest, TransportChannels) {
  EXPECT_THAT(places(allOnes(0xD00C, 17)),
              ElementsAre("TRCH BLER: transport channel count 14[6-11]=63",
                          "CCTRCH SIR: coded composite transport channel count 15[4-7]=15"));
  // Bits 6 to 11 and 12 to 15 of the word hold 1 each: the second kind begins at 289 + 34.
  const std::string composite = "CCTRCH SIR: coded composite transport channel#0 ";
  EXPECT_THAT(recordPlaces(allOnes(0xD00C, 331).u16(14, 0x107F)),
              ElementsAre("TRCH BLER: transport channel#0 TRCH ID 17[0-7]=255",
                          "TRCH BLER: transport channel#0 TRCH BLER Measurement 18[0-7]=255",
                          composite + "CCTRCH ID 323[0-7]=255", composite + "TSNUM 324[0-7]=255",
                          composite + "SIR 325[0-7]=255 326[0-7]=255 327[0-7]=255 328[0-7]=255 "
                                      "329[0-7]=255 330[0-7]=255"));
}

}  // namespace
}  // namespace kestro::testing
