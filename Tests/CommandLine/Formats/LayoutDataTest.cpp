// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "CommandLine/Formats/LayoutData.h"

namespace kestro {
namespace {

using ::testing::SizeIs;
using Json = nlohmann::ordered_json;

constexpr NamedValue kStateNames[] = {{0, "Idle"}, {3, "Busy"}};

std::int64_t sumOfPlaces(std::span<const std::int64_t> raw) { return raw[0] + raw[1]; }

Json takersJson(const Outline& outline) {
  std::string text;
  JsonWriter writer(text);
  writeTakers(writer, {&outline, 1});
  return Json::parse(text);
}

/// A reading of one field.
Json fieldJson(const Field& field) {
  Outline outline{.code = 1};
  outline.readings.emplace_back();
  outline.readings[0].parts.emplace_back(outlinedValue("Serving", field.key, field));
  return takersJson(outline)[0][0]["parts"][0];
}

TEST(LayoutData, APlaceIsNumbers) {
  const Json value = fieldJson({"Level", u32(21).bits(9, 17), scaled("%4.2f dBm", -140, 0.25)});
  EXPECT_EQ(value.dump(),
            R"({"part":"value","section":"Serving","key":"Level","places":[{"offset":21,)"
            R"("width":4,"firstBit":9,"bits":9,"signed":false,"order":"little",)"
            R"("origin":"record"}],"shown":{"kind":"scaled","format":"%4.2f dBm","unit":"dBm",)"
            R"("scale":0.25,"offset":-140}})");
  const Json odd = fieldJson({"Code", s16(2).bigEndian().ofPacket(), decimal("0x%06x")});
  EXPECT_EQ(odd["places"][0].dump(),
            R"({"offset":2,"width":2,"firstBit":0,"bits":16,"signed":true,"order":"big",)"
            R"("origin":"packet"})");
  EXPECT_FALSE(odd["shown"].contains("unit"));
  EXPECT_EQ(fieldJson({"Twin", u8(3).ofTwin(), decimal()})["places"][0]["origin"], "twin");
}

TEST(LayoutData, HowAValueIsShown) {
  EXPECT_EQ(fieldJson({"State", u8(1), named(kStateNames, "Unknown")})["shown"].dump(),
            R"({"kind":"named","names":[{"value":0,"text":"Idle"},{"value":3,"text":"Busy"}],)"
            R"("otherName":"Unknown"})");
  EXPECT_EQ(fieldJson({"State", u8(1), namedElse(kStateNames, "[Bad %d]")})["shown"]["format"],
            "[Bad %d]");
  const Json integer =
      fieldJson({"Power", u8(1), decimal("%d dBm", -30, 2).absentAt(64, "Not Present")})["shown"];
  EXPECT_EQ(integer.dump(), R"({"kind":"integer","format":"%d dBm","unit":"dBm","scale":2,)"
                            R"("offset":-30,"absentValue":64,"absentText":"Not Present"})");
  const Json computed = fieldJson({"Sum", {u8(1), u8(2)}, decimal().of(sumOfPlaces, "sum")});
  EXPECT_EQ(computed["shown"]["function"], "sum");
  EXPECT_THAT(computed["places"], SizeIs(2));
  EXPECT_EQ(fieldJson({"Count", u8(1), hidden()})["shown"].dump(), R"({"kind":"hidden"})");
  EXPECT_EQ(fieldJson({"All", {u8(1), u8(2)}, eachDecimal()})["shown"].dump(),
            R"({"kind":"each"})");
  EXPECT_EQ(fieldJson({"Old", removed()})["shown"].dump(), R"({"kind":"removed"})");
  EXPECT_EQ(fieldJson({"Other", supplied()})["shown"].dump(), R"({"kind":"supplied"})");
}

TEST(LayoutData, WhenAValueIsShown) {
  const Json value =
      fieldJson({"Rx", u8(1), decimal(), when(between(u8(2), 3, 4)).elseText("N/A")});
  EXPECT_EQ(value["when"]["place"]["offset"], 2);
  EXPECT_EQ(value["when"]["lowest"], 3);
  EXPECT_EQ(value["when"]["highest"], 4);
  EXPECT_EQ(value["otherwise"], "N/A");
  EXPECT_FALSE(fieldJson({"Rx", u8(1), decimal()}).contains("when"));
}

TEST(LayoutData, ATableOfRecords) {
  static constexpr Field kFields[] = {{"Level", s8(0), decimal()}};
  static constexpr RecordTable kTable = {.name = "cell",
                                         .count = u8(15),
                                         .countAddend = 1,
                                         .base = 16,
                                         .perCount = 6,
                                         .counted = u8(14),
                                         .stride = 5,
                                         .fields = kFields,
                                         .keep = equals(u8(1), 0),
                                         .twinBase = 40,
                                         .twinPerCount = 7,
                                         .twinStride = 8};
  Outline outline{.code = 1};
  outline.readings.emplace_back().minimumLength = 16;
  outline.readings[0].parts.emplace_back(OutlinedTable{"Cells", "cell", &kTable});
  const Json reading = takersJson(outline)[0][0];
  EXPECT_EQ(reading["minimumLength"], 16);
  const Json& table = reading["parts"][0];
  const std::pair<const char*, unsigned> numbers[] = {
      {"countAddend", 1}, {"base", 16},      {"perCount", 6},    {"stride", 5},
      {"twinBase", 40},   {"twinStride", 8}, {"twinPerCount", 7}};
  for (const auto& [key, number] : numbers) EXPECT_EQ(table[key], number) << key;
  EXPECT_EQ(table["part"], "table");
  EXPECT_EQ(table["count"]["offset"], 15);
  EXPECT_EQ(table["counted"]["offset"], 14);
  EXPECT_EQ(table["boundsCount"]["offset"], 15);
  EXPECT_EQ(table["keep"]["place"]["offset"], 1);
  EXPECT_FALSE(table.contains("keepsNone"));
  EXPECT_EQ(table["fields"][0]["key"], "Level");
}

TEST(LayoutData, WhatAPacketMustHave) {
  static constexpr std::uint8_t kIdentifiers[] = {1, 11};
  static constexpr Requirement kRequirements[] = {
      {Requirement::Kind::ExactLength, ""},
      {.kind = Requirement::Kind::Number, .line = "", .condition = between(u8(13), 2, 255)},
      {.kind = Requirement::Kind::SubPackets, .line = "", .subPackets = kIdentifiers}};
  Outline outline{.code = 1};
  outline.readings.emplace_back().requirements = kRequirements;
  outline.readings[0].packetLength = 42;
  const Json requirements = takersJson(outline)[0][0]["requirements"];
  EXPECT_EQ(requirements[0].dump(), R"({"kind":"exactLength","length":42})");
  EXPECT_EQ(requirements[1]["condition"]["lowest"], 2);
  EXPECT_EQ(requirements[2].dump(), R"({"kind":"subPackets","identifiers":[1,11]})");
}

}  // namespace
}  // namespace kestro
