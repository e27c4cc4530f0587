// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/Reselection.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::SizeIs;

/// One candidate of a technology; its fields begin at byte 25.
PacketBytes candidate(unsigned technology) {
  return packet(0xB186)
      .u8(13, 3)
      .u16(15, 1300)
      .u16(17, 301)
      .u16(19, 1)
      .u16(21, 6)
      .u16(23, technology)
      .u16(25, 0x1234)
      .u16(27, 0xABCD)
      .u16(29, 0x0102)
      .u16(31, 0x0304);
}

class ReselectionCandidatesMiscTest : public DecoderFixture<ReselectionCandidatesMisc> {};

TEST_F(ReselectionCandidatesMiscTest, ShowsTheHeader) {
  decode(candidate(0));
  EXPECT_THAT(entries(), ElementsAre(Pair("Version", "3"), Pair("Serving EARFCN", "1300"),
                                     Pair("Serving Cell ID", "301")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Reselection Candidates")));
}

TEST_F(ReselectionCandidatesMiscTest, NeedsTwentyOneBytes) {
  decode(candidate(0).length(20));
  EXPECT_THAT(entries(), IsEmpty());
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Reselection Candidates")));
  decode(candidate(0).length(21));
  EXPECT_EQ(text("Version"), "3");
}

class ReselectionCandidatesListTest : public DecoderFixture<ReselectionCandidatesList> {};

TEST_F(ReselectionCandidatesListTest, ShowsAnLTECandidate) {
  decode(candidate(0));
  ASSERT_THAT(list(), SizeIs(1));
  // 0xABCD >> 7 = 343
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "LTE"),
                          Pair("E ARFCN", "4660"), Pair("Cell ID", "343")));
  EXPECT_THAT(takeLines(), ElementsAre(warningLine("Reselection Candidates List")));
}

TEST_F(ReselectionCandidatesListTest, ShowsAUTRANCandidate) {
  decode(candidate(1));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "UTRAN"),
                          Pair("U ARFCN", "4660"), Pair("PSC", "43981")));
}

TEST_F(ReselectionCandidatesListTest, ShowsAGeranCandidate) {
  decode(candidate(2));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "GERAN"),
                          Pair("ARFCN", "4660"), Pair("Band", "205"), Pair("BSIC ID", "171")));
}

TEST_F(ReselectionCandidatesListTest, ShowsBothKindsOfCDMAAlike) {
  decode(candidate(3));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "CDMA1XRTT"),
                          Pair("Band", "52"), Pair("Channel", "258"), Pair("Pilot", "772")));
  decode(candidate(4));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "CDMAHRPD"),
                          Pair("Band", "52"), Pair("Channel", "258"), Pair("Pilot", "772")));
}

TEST_F(ReselectionCandidatesListTest, ShowsBothKindsOfCDMAInOnePacket) {
  // The second candidate's header, at byte 25, is where the first one's fields begin.
  decode(packet(0xB186)
             .u16(19, 2)
             .u16(21, 6)
             .u16(23, 3)
             .u16(25, 0x0107)
             .u16(27, 4)
             .u16(29, 0x0209)
             .u16(31, 300)
             .u16(33, 400)
             .u16(35, 500));
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "CDMA1XRTT"),
                          Pair("Band", "7"), Pair("Channel", "521"), Pair("Pilot", "300")));
  EXPECT_THAT(row(1),
              ElementsAre(Pair("Candidate Priority", "263"), Pair("Candidate RAT Type", "CDMAHRPD"),
                          Pair("Band", "9"), Pair("Channel", "400"), Pair("Pilot", "500")));
}

TEST_F(ReselectionCandidatesListTest, ShowsNoFieldsOfOtherTechnologies) {
  for (const unsigned technology : {5U, 7U, 255U, 256U, 65535U}) {
    decode(candidate(technology));
    EXPECT_THAT(row(0),
                ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "??")))
        << technology;
  }
}

TEST_F(ReselectionCandidatesListTest, ReadsSixteenBitsOfTheTechnology) {
  for (const unsigned technology : {0x0100U, 0x0101U, 0x0102U, 0x0103U, 0x0200U, 0x0300U}) {
    decode(candidate(technology));
    EXPECT_THAT(row(0),
                ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "??")))
        << technology;
  }
}

TEST_F(ReselectionCandidatesListTest, CandidatesStandFourBytesApart) {
  decode(candidate(1).u16(19, 2).u16(27, 2).u16(25, 4));
  ASSERT_THAT(list(), SizeIs(2));
  EXPECT_THAT(row(0),
              ElementsAre(Pair("Candidate Priority", "6"), Pair("Candidate RAT Type", "UTRAN"),
                          Pair("U ARFCN", "4"), Pair("PSC", "2")));
  EXPECT_THAT(row(1),
              ElementsAre(Pair("Candidate Priority", "4"), Pair("Candidate RAT Type", "GERAN"),
                          Pair("ARFCN", "258"), Pair("Band", "4"), Pair("BSIC ID", "3")));
}

TEST_F(ReselectionCandidatesListTest, IsAsLongAsTheLowByteOfTheCountSays) {
  decode(candidate(0));
  decode(candidate(0).u16(19, 0x0100));
  EXPECT_THAT(list(), IsEmpty());
  decode(candidate(0).u16(19, 0x0103));
  EXPECT_THAT(list(), SizeIs(3));
}

TEST_F(ReselectionCandidatesListTest, IsEmptiedByACountOfZero) {
  decode(candidate(0));
  decode(candidate(0).u16(19, 0));
  EXPECT_THAT(list(), IsEmpty());
}

TEST_F(ReselectionCandidatesListTest, CandidatesPastTheEndReadAsZero) {
  decode(candidate(0).u16(19, 255).length(21));
  ASSERT_THAT(list(), SizeIs(255));
  EXPECT_THAT(row(254),
              ElementsAre(Pair("Candidate Priority", "0"), Pair("Candidate RAT Type", "LTE"),
                          Pair("E ARFCN", "0"), Pair("Cell ID", "0")));
}

TEST_F(ReselectionCandidatesListTest, NeedsTwentyOneBytes) {
  decode(candidate(0));
  decode(candidate(0).u16(19, 0).length(20));
  EXPECT_THAT(list(), SizeIs(1));
}

}  // namespace
}  // namespace kestro::testing
