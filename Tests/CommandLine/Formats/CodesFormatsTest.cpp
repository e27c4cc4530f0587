// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <nlohmann/json.hpp>

#include "CommandLine/Formats/CodesFormats.h"

namespace kestro {
namespace {

using ::testing::HasSubstr;

constexpr Field kHeader[] = {
    {"Version", u8(13), decimal()},
    {"State|Mode", u8(14).bits(0, 3), decimal("%d dB", -2)},
};
constexpr Field kCell[] = {{"Level", s8(0), decimal()}};
constexpr RecordTable kCells = {
    .name = "cell", .count = u8(15), .base = 16, .stride = 1, .fields = kCell};

CatalogueEntry describedEntry() {
  CatalogueEntry entry{.code = 0x1234,
                       .packetName = "Cells",
                       .minimumLength = 16,
                       .section = "Serving",
                       .keys = catalogueFields(kHeader),
                       .group = "01;Radio"};
  entry.keys.push_back(catalogueFields(kCell, "Cells", &kCells)[0]);
  return entry;
}

/// One described code with two sections, and one that nobody knows.
std::vector<TechnologyCodes> sample() {
  const CatalogueEntry emptied{.code = 0x1234,
                               .packetName = "Cells",
                               .minimumLength = 16,
                               .section = "Detected",
                               .kind = SectionKind::List};
  const CatalogueEntry unknown{.code = 0x2000, .section = "Other"};
  std::vector<TechnologyCodes> technologies(2);
  technologies[0].technology = "IFX";
  technologies[1].technology = "LTE";
  technologies[1].families = {
      {"01;Radio",
       "Radio",
       {{0x1234, "Cells", 16, {describedEntry(), emptied}}, {0x2000, "", 0, {unknown}}}}};
  return technologies;
}

std::string text(std::string_view format, const std::vector<TechnologyCodes>& technologies) {
  return std::ranges::find(codesFormats(), format, &CodesFormat::name)->text(technologies);
}

TEST(CodesTable, HasCodeNameLengthSectionsAndKeys) {
  EXPECT_EQ(text("table", sample()),
            "IFX\n"
            "  no log codes: its messages are property lists, shaped for display\n"
            "\n"
            "LTE: Radio\n"
            "  0x1234    Cells, from 16 bytes\n"
            "    Serving\n"
            "      Version, State|Mode, Cells: Level\n"
            "    Detected\n"
            "  0x2000    (contents not known)\n"
            "    Other\n");
}

TEST(CodesTable, BreaksLongListsOfKeys) {
  std::vector<TechnologyCodes> technologies = sample();
  auto& keys = technologies[1].families[0].codes[0].entries[0].keys;
  keys.assign(3, {.key = "a key of thirty-six characters in all"});
  const std::string table = text("table", technologies);
  EXPECT_THAT(table, HasSubstr("      a key of thirty-six characters in all, "
                               "a key of thirty-six characters in all,\n"
                               "      a key of thirty-six characters in all\n"));
}

TEST(CodesJson, HasEverything) {
  const auto json = nlohmann::json::parse(text("json", sample()));
  EXPECT_EQ(json[0].dump(), R"({"codes":[],"technology":"IFX"})");
  const auto& code = json[1]["codes"][0];
  EXPECT_EQ(code["code"], "0x1234");
  EXPECT_EQ(code["name"], "Cells");
  EXPECT_EQ(code["minimumLength"], 16);
  const auto& section = code["sections"][0];
  EXPECT_EQ(section["section"], "Serving");
  EXPECT_EQ(section["group"], "Radio");
  EXPECT_EQ(section["kind"], "dictionary");
  EXPECT_EQ(section["keys"][1].dump(),
            R"({"from":"u8 at 14, bits 0-3","key":"State|Mode","shown":"x - 2 as %d dB"})");
  EXPECT_EQ(section["keys"][2].dump(),
            R"({"from":"s8 at +0","key":"Level","list":"Cells","shown":"%d"})");
  EXPECT_EQ(code["sections"][1]["kind"], "list");
}

TEST(CodesMarkdown, HasAnOverviewAndEveryKey) {
  const std::string document = text("markdown", sample());
  EXPECT_THAT(document, ::testing::StartsWith("# Log codes\n"));
  EXPECT_THAT(document, HasSubstr("\n## IFX\n\nNo log codes: "));
  EXPECT_THAT(document, HasSubstr("\n## LTE\n"
                                  "\n"
                                  "| Code | Packet | At least | Sections |\n"
                                  "|---|---|---|---|\n"
                                  "| 0x1234 | Cells | 16 bytes | Serving, Detected |\n"
                                  "| 0x2000 | (contents not known) |  | Other |\n"
                                  "\n"
                                  "### LTE: Radio\n"
                                  "\n"
                                  "#### 0x1234 Cells\n"
                                  "\n"
                                  "From 16 bytes.\n"
                                  "\n"
                                  "**Serving**\n"
                                  "\n"
                                  "| Key | From | Shown as |\n"
                                  "|---|---|---|\n"
                                  "| Version | u8 at 13 | %d |\n"
                                  "| State\\|Mode | u8 at 14, bits 0-3 | x - 2 as %d dB |\n"
                                  "\n"
                                  "Cells: rows, one for each cell; count: u8 at 15; from byte 16, "
                                  "1 byte each.\n"
                                  "\n"
                                  "| Key | From | Shown as |\n"
                                  "|---|---|---|\n"
                                  "| Level | s8 at +0 | %d |\n"
                                  "\n"
                                  "**Detected**: is emptied by it\n"
                                  "\n"
                                  "#### 0x2000 (contents not known)\n"
                                  "\n"
                                  "**Other**: takes nothing from it\n"));
}

}  // namespace
}  // namespace kestro
