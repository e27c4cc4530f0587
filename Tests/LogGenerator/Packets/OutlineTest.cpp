// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "LogGenerator/Packets/Outline.h"
#include "Tests/Support/ExplainedPlaces.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;

/// "Section: list Key 16[0-7]": a value and the bits of its places, wherever they begin.
std::string textOf(std::string_view section, std::string_view list, std::string_view key,
                   std::span<const Place> places) {
  std::string text = std::string(section) + ": " + std::string(list) + " " + std::string(key);
  for (const Place& place : places) {
    text += fmt::format(" {}[{}-{}]{}", place.width, place.firstBit,
                        place.firstBit + place.bitCount - 1, place.isBigEndian ? "^" : "");
  }
  return text;
}

std::string lineOf(const ExplainedValue& value) {
  std::vector<Place> places;
  for (const ExplainedSource& source : value.sources) {
    places.push_back({.width = static_cast<std::uint8_t>(source.width),
                      .firstBit = static_cast<std::uint8_t>(source.firstBit),
                      .bitCount = static_cast<std::uint8_t>(source.bitCount),
                      .isBigEndian = source.isBigEndian});
  }
  return textOf(value.section, value.list, value.key, places);
}

/// What the outline says of a part: the packet's own value or count, and the fields of records.
struct PartLines {
  std::string own{};
  std::vector<std::string> records{};
};

PartLines linesOf(const OutlinedValue& value) {
  return {textOf(value.section, "", value.key, value.places)};
}

PartLines linesOf(const OutlinedTable& part) {
  PartLines lines{textOf(part.section, part.list, "count", {&part.table->count, 1})};
  for (const Field& field : part.table->fields) {
    lines.records.push_back(textOf(part.section, part.list, field.key, field.allPlaces()));
  }
  return lines;
}

PartLines linesOf(const OutlinedSizedRecords& part) {
  PartLines lines;
  for (const Field& field : part.records->fields) {
    lines.records.push_back(textOf(part.section, part.list, field.key, field.allPlaces()));
  }
  return lines;
}

class OutlineTest : public ExplainedPlacesFixture,
                    public ::testing::WithParamInterface<const char*> {
 protected:
  OutlineTest() : ExplainedPlacesFixture(GetParam()) {}

  /// What is explained of a packet: the packet's own values, in order, and those of records.
  void explain(const PacketBytes& packet) {
    generator->explainMessage(packet.bytes(), [&](const ExplainedValue& value) {
      if (value.row) {
        recordLines.insert(lineOf(value));
      } else {
        ownLines.push_back(lineOf(value));
      }
    });
  }

  /// What the outline says of packets of this length.
  void outline(LogCode code, std::size_t length) {
    generator->outline([&](const Outline& outline) {
      if (outline.code != code) return;
      for (const OutlinedReading& reading : outline.readings) {
        if (length < reading.minimumLength) continue;
        for (const OutlinedPart& part : reading.parts) add(part);
        return;
      }
    });
  }
  void add(const OutlinedPart& part) {
    PartLines lines = std::visit([](const auto& known) { return linesOf(known); }, part);
    if (!lines.own.empty()) outlinedOwnLines.push_back(lines.own);
    outlinedRecordLines.insert(lines.records.begin(), lines.records.end());
  }

  std::vector<std::string> ownLines;
  std::set<std::string> recordLines;
  std::vector<std::string> outlinedOwnLines;
  std::set<std::string> outlinedRecordLines;
};

INSTANTIATE_TEST_SUITE_P(Technologies, OutlineTest,
                         ::testing::Values("Ondrel_GSM", "LTE", "UTRAN2"));

TEST_P(OutlineTest, HasWhatIsExplained) {
  std::set<LogCode> codes;
  generator->outline([&](const Outline& outline) { codes.insert(outline.code); });
  for (const LogCode code : codes) {
    for (const std::size_t length : {std::size_t{14}, std::size_t{4000}}) {
      ownLines.clear(), recordLines.clear(), outlinedOwnLines.clear(), outlinedRecordLines.clear();
      explain(allOnes(code, length));
      outline(code, length);
      EXPECT_THAT(outlinedOwnLines, ElementsAreArray(ownLines)) << code;
      for (const std::string& line : recordLines) {
        EXPECT_THAT(outlinedRecordLines, Contains(line)) << code;
      }
    }
  }
}

/// Every field with a function of ours is found by the function's name.
TEST(Outline, NamesEveryFunction) {
  const auto coding = createPropertyListCoding();
  VirtualPlatform platform(*coding);
  std::vector<std::string> nameless;
  const auto look = [&](const Field& field) {
    const bool isComputed =
        field.text.kind == TextRule::Kind::Computed || field.text.number != nullptr;
    if (isComputed == field.text.functionName.empty()) nameless.emplace_back(field.key);
  };
  for (const std::string_view technology : LogGenerator::technologies()) {
    const auto generator =
        LogGenerator::generatorFromTechnology(generatorServices(platform), technology);
    generator->outline([&](const Outline& outline) {
      for (const OutlinedReading& reading : outline.readings) {
        for (const OutlinedPart& part : reading.parts) {
          if (const auto* value = std::get_if<OutlinedValue>(&part)) look(value->field);
          if (const auto* table = std::get_if<OutlinedTable>(&part))
            std::ranges::for_each(table->table->fields, look);
          if (const auto* sized = std::get_if<OutlinedSizedRecords>(&part))
            std::ranges::for_each(sized->records->fields, look);
        }
      }
    });
  }
  EXPECT_THAT(nameless, IsEmpty());
}

}  // namespace
}  // namespace kestro::testing
