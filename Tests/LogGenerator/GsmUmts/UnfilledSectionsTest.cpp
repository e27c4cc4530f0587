// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/UnfilledSections.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

// --- Sections that want no packet ----------------------------------------------------------------

struct Names {
  const char* section;
  const char* className;
  SectionKind kind;
};

template <class Decoder>
class UnwantingSectionTest : public DecoderFixture<Decoder> {
 protected:
  static Names names();
};
template <>
Names UnwantingSectionTest<CodingScheme>::names() {
  return {"Coding Scheme", "CodingScheme", SectionKind::Dictionary};
}
template <>
Names UnwantingSectionTest<UMTSRRMeasurement>::names() {
  return {"UMTS RR Measurement", "UMTSRRMeasurement", SectionKind::Dictionary};
}
template <>
Names UnwantingSectionTest<CellChangeCounters>::names() {
  return {"Cell Change Counters", "CellChangeCounters", SectionKind::Dictionary};
}
template <>
Names UnwantingSectionTest<NonRankedGSMSet>::names() {
  return {"Non-Ranked GSM Set", "NonRankedGSMSet", SectionKind::List};
}
template <>
Names UnwantingSectionTest<NonRankedUMTSSet>::names() {
  return {"Non-Ranked UMTS Set", "NonRankedUMTSSet", SectionKind::List};
}
using UnwantingSections = ::testing::Types<CodingScheme, UMTSRRMeasurement, CellChangeCounters,
                                           NonRankedGSMSet, NonRankedUMTSSet>;
TYPED_TEST_SUITE(UnwantingSectionTest, UnwantingSections);

TYPED_TEST(UnwantingSectionTest, WantsNoPacket) {
  EXPECT_EQ(this->decoder.getSectionName(), this->names().section);
  EXPECT_EQ(this->decoder.sectionKind(), this->names().kind);
  EXPECT_THAT(this->decoder.getLogCodeArray(), IsEmpty());
}

TYPED_TEST(UnwantingSectionTest, LeavesItsNameWhateverTheCode) {
  this->list().append("kept");
  this->section().set("kept", "text");
  for (const LogCode code : {0x417AU, 0x4005U, 0xFF0001U}) {
    this->decode(packet(code).length(200, 0xFF));
    EXPECT_THAT(this->takeLines(), ElementsAre(warningLine(this->names().className)));
  }
  EXPECT_EQ(this->list().size() + this->section().size(), 1U);
}

// --- Sections that want packets of which nothing is known ----------------------------------------

class GPRSInformationTest : public DecoderFixture<GPRSInformation> {};

TEST_F(GPRSInformationTest, HasItsNameAndCodes) {
  EXPECT_EQ(decoder.getSectionName(), "GPRS Information");
  EXPECT_EQ(decoder.sectionKind(), SectionKind::Dictionary);
  EXPECT_THAT(decoder.getLogCodeArray(),
              ElementsAre(0x51F5U, 0x7135U, 0x51F6U, 0x51FBU, 0x51FDU, 0x51F4U, 0x5137U));
}

TEST_F(GPRSInformationTest, AcceptsItsPacketsInSilence) {
  section().set("kept", "text");
  for (const LogCode code : {0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137}) {
    decode(packet(code).length(60, 0xFF));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine("GPRSInformation"))) << code;
  }
  EXPECT_THAT(keysOf(section()), ElementsAre("kept"));
}

TEST_F(GPRSInformationTest, ReportsOtherCodes) {
  decode(packet(0x51F8).length(60));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("GPRSInformation"),
                                       errorLine("Received an unknown log message: 20984")));
}

class UMTSRRInfoTest : public DecoderFixture<UMTSRRInfo> {};

TEST_F(UMTSRRInfoTest, HasItsNameAndCodes) {
  EXPECT_EQ(decoder.getSectionName(), "UMTS RR Info");
  EXPECT_EQ(decoder.sectionKind(), SectionKind::Dictionary);
  EXPECT_THAT(decoder.getLogCodeArray(),
              ElementsAre(0x4125U, 0x4031U, 0x4127U, 0x4157U, 0xFF0001U));
}

TEST_F(UMTSRRInfoTest, AcceptsItsPacketsInSilence) {
  section().set("kept", "text");
  for (const LogCode code : {0x4125, 0x4031, 0x4127, 0x4157, 0xFF0001}) {
    decode(packet(code).length(60, 0xFF));
    EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSRRInfo"))) << code;
  }
  EXPECT_THAT(keysOf(section()), ElementsAre("kept"));
}

TEST_F(UMTSRRInfoTest, ReportsOtherCodes) {
  decode(packet(0xFF0002));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("UMTSRRInfo"),
                                       errorLine("Received an unknown log message: 16711682")));
}

}  // namespace
}  // namespace kestro::testing
