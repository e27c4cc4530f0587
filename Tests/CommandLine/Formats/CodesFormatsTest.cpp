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

TEST(CodesFormats, SayWhatAPacketMustHaveBesidesItsLength) {
  static constexpr Requirement kRequirements[] = {
      kMinimumLength, {Requirement::Kind::HoldsRecords, ""}, {Requirement::Kind::ExactLength, ""}};
  std::vector<TechnologyCodes> technologies = sample();
  technologies[1].families[0].codes[0].entries[0].requirements = kRequirements;
  const std::string said = "long enough for all its records, exactly that long";
  EXPECT_THAT(text("table", technologies), HasSubstr("Cells, from 16 bytes, " + said + "\n"));
  EXPECT_THAT(text("markdown", technologies), HasSubstr("\nFrom 16 bytes, " + said + ".\n"));
  const auto codes = nlohmann::json::parse(text("json", technologies))[1]["codes"];
  EXPECT_EQ(codes[0]["requirements"],
            nlohmann::json({"long enough for all its records", "exactly that long"}));
  EXPECT_FALSE(codes[1].contains("requirements"));
}

constexpr Field kOddFields[] = {{"Old Channel", removed()}, {"State", u8(14), decimal()}};
constexpr Field kShorterFields[] = {{"State", u8(14), named({}, "Unknown")}};

/// A key that is taken out, a list of plain texts, rows that are kept, and a key of short packets.
std::vector<TechnologyCodes> oddSample() {
  CatalogueEntry entry{.code = 0x1234,
                       .packetName = "Odd",
                       .minimumLength = 16,
                       .section = "Serving",
                       .keys = catalogueFields(kOddFields),
                       .shorterKeys = catalogueFields(kShorterFields)};
  static constexpr RecordTable kFrequencies = kCells;
  static constexpr RecordTable kEntries = kCells;
  entry.keys.push_back(catalogueFields(kCell, "Channels", &kFrequencies)[0]);
  entry.keys.back().key = {};
  entry.keys.push_back(catalogueFields(kCell, "", &kEntries)[0]);
  entry.keys.back().isKept = true;
  std::vector<TechnologyCodes> technologies(1);
  technologies[0].technology = "LTE";
  technologies[0].families = {{"01;Radio", "Radio", {{0x1234, "Odd", 16, {entry}}}}};
  return technologies;
}

TEST(CodesTable, SaysWhatIsNotSimplyShown) {
  EXPECT_EQ(text("table", oddSample()),
            "LTE: Radio\n"
            "  0x1234    Odd, from 16 bytes\n"
            "    Serving\n"
            "      Old Channel (taken out), State, Channels, kept: Level\n"
            "      from a shorter packet: State\n");
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

TEST(CodesTable, BreaksALineThatIsExactlyFull) {
  std::vector<TechnologyCodes> technologies = sample();
  auto& keys = technologies[1].families[0].codes[0].entries[0].keys;
  // Six blanks, the keys, and a comma and a blank between them.
  keys = {{.key = "a key of forty-seven characters, with its blanks"},
          {.key = "another key, of forty-five characters in all"},
          {.key = "the next"}};
  ASSERT_EQ(keys[0].key.size() + 2 + keys[1].key.size(), 94U);
  EXPECT_THAT(text("table", technologies),
              HasSubstr("      a key of forty-seven characters, with its blanks, "
                        "another key, of forty-five characters in all,\n"
                        "      the next\n"));
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

TEST(CodesJson, SaysWhatIsNotSimplyShown) {
  const auto json = nlohmann::json::parse(text("json", oddSample()));
  const auto& section = json[0]["codes"][0]["sections"][0];
  EXPECT_EQ(section["keys"][0].dump(),
            R"({"from":"","key":"Old Channel","shown":"taken out of the section"})");
  EXPECT_EQ(section["keys"][2].dump(),
            R"({"from":"s8 at +0","key":"","list":"Channels","shown":"%d"})");
  EXPECT_EQ(section["keys"][3].dump(),
            R"({"from":"s8 at +0","kept":true,"key":"Level","shown":"%d"})");
  EXPECT_EQ(section["shorterKeys"].dump(),
            R"([{"from":"u8 at 14","key":"State","shown":"Unknown"}])");
}

TEST(CodesMarkdown, SaysWhatIsNotSimplyShown) {
  EXPECT_THAT(
      text("markdown", oddSample()),
      HasSubstr("**Serving**\n"
                "\n"
                "| Key | From | Shown as |\n"
                "|---|---|---|\n"
                "| Old Channel |  | taken out of the section |\n"
                "| State | u8 at 14 | %d |\n"
                "\n"
                "Channels: texts, one for each cell; count: u8 at 15; from byte 16, 1 byte each.\n"
                "\n"
                "| Key | From | Shown as |\n"
                "|---|---|---|\n"
                "| (no key) | s8 at +0 | %d |\n"
                "\n"
                "Not shown, but kept for the rows that other packets make, one for each cell; "
                "count: u8 at 15; from byte 16, 1 byte each.\n"
                "\n"
                "| Key | From | Shown as |\n"
                "|---|---|---|\n"
                "| Level | s8 at +0 | %d |\n"
                "\n"
                "From a shorter packet:\n"
                "\n"
                "| Key | From | Shown as |\n"
                "|---|---|---|\n"
                "| State | u8 at 14 | Unknown |\n"));
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
