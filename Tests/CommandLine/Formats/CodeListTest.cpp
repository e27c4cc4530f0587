// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Formats/CodeList.h"
#include "CommandLine/OfflineServices.h"
#include "Tests/CommandLine/Formats/CatalogueGenerator.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

class CodeListTest : public ::testing::Test {
 protected:
  std::vector<ListedCode> list(std::vector<CatalogueEntry> entries) {
    return listCodes(CatalogueGenerator(services.forGenerator(), std::move(entries)));
  }

  OfflineServices services;
};

TEST_F(CodeListTest, IsInTheOrderOfTheCodes) {
  const auto codes =
      list({{.code = 9, .section = "A"}, {.code = 7, .section = "B"}, {.code = 9, .section = "C"}});
  ASSERT_THAT(codes, SizeIs(2));
  EXPECT_EQ(codes[0].code, 7U);
  EXPECT_EQ(codes[1].code, 9U);
  ASSERT_THAT(codes[1].entries, SizeIs(2));
  EXPECT_EQ(codes[1].entries[0].section, "A");
  EXPECT_EQ(codes[1].entries[1].section, "C");
}

TEST_F(CodeListTest, HasTheNameAndTheLeastLengthOfWhoeverKnowsThePacket) {
  const auto codes = list({{.code = 7, .section = "A"},
                           {.code = 7, .packetName = "level", .minimumLength = 20, .section = "B"},
                           {.code = 7, .packetName = "level", .minimumLength = 16, .section = "C"},
                           {.code = 9, .section = "D"}});
  ASSERT_THAT(codes, SizeIs(2));
  EXPECT_EQ(codes[0].name, "level");
  EXPECT_EQ(codes[0].minimumLength, 16U);
  EXPECT_EQ(codes[1].name, "");
  EXPECT_EQ(codes[1].minimumLength, 0U);
}

std::vector<std::string_view> familyNames(const TechnologyCodes& technology) {
  std::vector<std::string_view> names;
  for (const CodeFamily& family : technology.families) names.push_back(family.name);
  return names;
}

TEST_F(CodeListTest, FamiliesAreTheDisplaysGroupsInItsOrder) {
  const TechnologyCodes lte = codesOfTechnology(services.forGenerator(), "LTE");
  EXPECT_EQ(lte.technology, "LTE");
  EXPECT_THAT(familyNames(lte),
              ElementsAre("Serving Cell", "Neighbors", "Reselection", "Extra Packets"));
  ASSERT_THAT(lte.families[0].codes, SizeIs(4));
  EXPECT_EQ(lte.families[0].codes[0].code, 0xB0C1U);
  EXPECT_EQ(lte.families[0].codes[3].code, 0xB17FU);
  EXPECT_EQ(lte.families[3].codes[0].code, 0xFF0000U);
}

/// Section GPRS Information wants 0x7135 before Serving PLMN does, and shows nothing of it.
TEST_F(CodeListTest, ACodeBelongsToTheFirstSectionThatShowsSomethingOfIt) {
  const TechnologyCodes gsm = codesOfTechnology(services.forGenerator(), "Ondrel_GSM");
  EXPECT_THAT(familyNames(gsm), ElementsAre("Network", "UMTS Cells", "UMTS Link", "GSM Cells",
                                            "GSM Link", "Extra Packets"));
  const auto& network = gsm.families[0].codes;
  EXPECT_TRUE(std::ranges::any_of(network, [](const auto& code) { return code.code == 0x7135; }));
}

TEST_F(CodeListTest, AChannelWithoutPacketsHasNone) {
  EXPECT_THAT(codesOfTechnology(services.forGenerator(), "IFX").families, IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
