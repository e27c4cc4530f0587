// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/UnfilledSections.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;

// --- Sections that want packets of which nothing is known ----------------------------------------

class GPRSInformationTest : public DecoderFixture<GPRSInformation> {};

TEST_F(GPRSInformationTest, AcceptsItsPacketsInSilence) {
  section().set("kept", "text");
  for (const LogCode code : {0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137}) {
    decode(packet(code).length(60, 0xFF));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine("GPRSInformation"))) << code;
  }
  EXPECT_THAT(keysOf(section()), ElementsAre("kept"));
}

class UMTSRRInfoTest : public DecoderFixture<UMTSRRInfo> {};

TEST_F(UMTSRRInfoTest, AcceptsItsPacketsInSilence) {
  section().set("kept", "text");
  for (const LogCode code : {0x4125, 0x4031, 0x4127, 0x4157, 0xFF0001}) {
    decode(packet(code).length(60, 0xFF));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSRRInfo"))) << code;
  }
  EXPECT_THAT(keysOf(section()), ElementsAre("kept"));
}

}  // namespace
}  // namespace kestro::testing
