// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "CommandLine/Formats/DisplayFormats.h"
#include "CommandLine/Formats/TimeText.h"
#include "Tests/CommandLine/Formats/DisplayTrees.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using testing::treeOf;

/// 2012-03-04 12:05:09.000250 UTC
constexpr Moment kTime{1'330'862'709'000'250us};

std::string json(const Value& display) {
  std::string output;
  JsonWriter writer(output);
  writeDisplayJson(writer, *treeOf(display));
  return output;
}

std::string csv(const Value& display) {
  std::string output;
  appendCsvLines(output, {.time = kTime, .message = 7}, *treeOf(display));
  return output;
}

std::string plain(const Value& display) {
  std::string output;
  appendPlainTree(output, *treeOf(display));
  return output;
}

TEST(TimeText, IsUtcToTheMicrosecond) {
  EXPECT_EQ(isoTimeText(kTime), "2012-03-04T12:05:09.000250Z");
  EXPECT_EQ(isoTimeText(Moment(999'999us)), "1970-01-01T00:00:00.999999Z");
}

TEST(DisplayJson, KeepsTheDisplaysOrder) {
  EXPECT_EQ(json(Dictionary{{"z", "1"}, {"a", Dictionary{{"k", "v"}}}}),
            R"({"z":"1","a":{"k":"v"}})");
}

TEST(DisplayJson, ArraysAreArraysAlsoWhenEmpty) {
  EXPECT_EQ(json(Dictionary{{"a", Array{"x", Array()}}, {"d", Dictionary()}}),
            R"({"a":["x",[]],"d":{}})");
}

TEST(DisplayJson, SiblingsOfOneNameAreToldApart) {
  EXPECT_EQ(json(Dictionary{{"_sorted", "yes"}, {"01;B", "x"}, {"02;B", "y"}}),
            "{\"B\":\"x\",\"B (2)\":\"y\"}");
}

TEST(DisplayJson, NoDisplayIsUnknown) { EXPECT_EQ(json(Value()), "\"(unknown)\""); }

TEST(DisplayNdjson, HasTimeMessageAndDisplay) {
  std::string output;
  appendNdjsonLine(output, {.time = kTime, .message = 7}, *treeOf(Dictionary{{"k", "v"}}));
  EXPECT_EQ(output, R"({"time":"2012-03-04T12:05:09.000250Z","message":7,"display":{"k":"v"}})"
                    "\n");
}

TEST(DisplayNdjson, LeavesTheMessageOutWhereThereIsNoNumber) {
  std::string output;
  appendNdjsonLine(output, {.time = kTime}, *treeOf(Dictionary()));
  EXPECT_EQ(output, "{\"time\":\"2012-03-04T12:05:09.000250Z\",\"display\":{}}\n");
}

TEST(DisplayCsv, HasALineForEachLeaf) {
  EXPECT_EQ(csv(Dictionary{{"Cell", Dictionary{{"ARFCN", "62"}}}, {"List", Array{"a", "b"}}}),
            "2012-03-04T12:05:09.000250Z,7,/Cell/ARFCN,62\n"
            "2012-03-04T12:05:09.000250Z,7,/List/0,a\n"
            "2012-03-04T12:05:09.000250Z,7,/List/1,b\n");
}

TEST(DisplayCsv, CommasQuotesAndLineBreaksAreQuoted) {
  EXPECT_EQ(csv(Dictionary{{"a,b", "say \"hi\""}, {"c", "x\ny\r"}}),
            "2012-03-04T12:05:09.000250Z,7,\"/a,b\",\"say \"\"hi\"\"\"\n"
            "2012-03-04T12:05:09.000250Z,7,/c,\"x\ny\r\"\n");
}

TEST(DisplayCsv, SiblingsOfOneNameHaveDifferentPaths) {
  EXPECT_EQ(csv(Dictionary{{"_sorted", "yes"}, {"01;B", "x"}, {"02;B", "y"}}),
            "2012-03-04T12:05:09.000250Z,7,/B,x\n"
            "2012-03-04T12:05:09.000250Z,7,/B (2),y\n");
}

TEST(DisplayCsv, BytesThatAreNoUtf8AreReplaced) {
  EXPECT_EQ(csv(Dictionary{{"k", "a\xFF,"}}), "2012-03-04T12:05:09.000250Z,7,/k,\"a\uFFFD,\"\n");
}

TEST(PlainTree, HasAnEmptyLineBetweenSections) {
  EXPECT_EQ(plain(Dictionary{{"Mode", "Idle"}, {"Cell", Dictionary{{"ARFCN", "62"}}}}),
            "Mode  Idle\n"
            "\n"
            "Cell\n"
            "  ARFCN  62\n");
}

TEST(PlainTree, LinesAreNotCut) {
  const std::string value(500, 'v');
  EXPECT_EQ(plain(Dictionary{{"k", value}}), "k  " + value + "\n");
}

}  // namespace
}  // namespace kestro
