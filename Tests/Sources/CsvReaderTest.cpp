// SPDX-License-Identifier: MIT
// Comma-separated values: quotes, line ends, and what is malformed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "Sources/CsvReader.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

/// Reads a whole text: each record as its line and its fields, each malformed one as its message.
std::vector<std::string> readAll(const std::string& text) {
  std::istringstream input(text);
  CsvReader reader(input);
  std::vector<std::string> result;
  while (true) {
    const auto record = reader.next();
    if (!record) {
      result.push_back("malformed, " + record.error().message);
      continue;
    }
    if (!record->has_value()) return result;
    std::string shown = std::to_string((*record)->line) + ":";
    for (const auto& field : (*record)->fields) shown += "[" + field + "]";
    result.push_back(shown);
  }
}

TEST(CsvReaderTest, SeparatesFieldsByCommasAndRecordsByLineEnds) {
  EXPECT_THAT(readAll("a,b\nc,d\n"), ElementsAre("1:[a][b]", "2:[c][d]"));
}

TEST(CsvReaderTest, TakesCarriageReturnsBeforeLineEnds) {
  EXPECT_THAT(readAll("a,b\r\nc,d\r\n"), ElementsAre("1:[a][b]", "2:[c][d]"));
}

TEST(CsvReaderTest, TheLastLineNeedsNoEnd) {
  EXPECT_THAT(readAll("a,b\nc,d"), ElementsAre("1:[a][b]", "2:[c][d]"));
}

TEST(CsvReaderTest, KeepsEmptyFieldsAndBlanks) {
  EXPECT_THAT(readAll(",\n a , b\n"), ElementsAre("1:[][]", "2:[ a ][ b]"));
}

TEST(CsvReaderTest, PassesOverEmptyLines) {
  EXPECT_THAT(readAll("\n\na\n\r\n\nb\n\n"), ElementsAre("3:[a]", "6:[b]"));
}

TEST(CsvReaderTest, AnEmptyTextHasNoRecord) {
  EXPECT_THAT(readAll(""), ElementsAre());
  EXPECT_THAT(readAll("\n\n"), ElementsAre());
}

TEST(CsvReaderTest, QuotesHideCommasLineEndsAndDoubledQuotes) {
  EXPECT_THAT(readAll("\"a,b\",\"c\nd\",\"say \"\"hi\"\"\"\ne\n"),
              ElementsAre("1:[a,b][c\nd][say \"hi\"]", "3:[e]"));
}

TEST(CsvReaderTest, AnEmptyQuotedFieldIsARecord) {
  EXPECT_THAT(readAll("\"\"\n"), ElementsAre("1:[]"));
}

TEST(CsvReaderTest, AByteOrderMarkIsNoPartOfTheFirstField) {
  EXPECT_THAT(readAll("\xEF\xBB\xBF"
                      "a,b\n"),
              ElementsAre("1:[a][b]"));
}

TEST(CsvReaderTest, AQuoteInsideAnUnquotedFieldSpoilsItsLineOnly) {
  EXPECT_THAT(readAll("a\"b\",c\nd\n"),
              ElementsAre("malformed, line 1: a quote stands inside an unquoted field", "2:[d]"));
}

TEST(CsvReaderTest, TextBehindAQuotedFieldSpoilsItsLineOnly) {
  EXPECT_THAT(readAll("\"a\"b,c\nd\n"),
              ElementsAre("malformed, line 1: text follows a quoted field", "2:[d]"));
}

TEST(CsvReaderTest, AQuoteThatNothingClosesSpoilsTheRest) {
  EXPECT_THAT(readAll("a\n\"b,c\nd\n"),
              ElementsAre("1:[a]", "malformed, line 2: a quoted field does not end"));
}

TEST(CsvReaderTest, AQuoteThatSwallowsALongTextIsLeftAtTheNextLineEnd) {
  std::string text = "\"a\n";
  text += std::string(CsvReader::kMaximumRecordSize, 'x');
  text += "\nb,c\n";
  EXPECT_THAT(readAll(text),
              ElementsAre("malformed, line 1: the record is longer than 16384 bytes", "3:[b][c]"));
}

TEST(CsvReaderTest, TheLongestRecordIsRead) {
  const std::string longest(CsvReader::kMaximumRecordSize, 'x');
  EXPECT_THAT(readAll(longest + "\n" + longest + "x\n"),
              ElementsAre("1:[" + longest + "]",
                          "malformed, line 2: the record is longer than 16384 bytes"));
}

TEST(CsvReaderTest, EveryPrefixOfATextIsReadToItsEnd) {
  const std::string text = "a,\"b\"\"\n\",c\r\n\"d\"x\ne,f";
  for (std::size_t length = 0; length <= text.size(); ++length) {
    EXPECT_LE(readAll(text.substr(0, length)).size(), 3U) << length;
  }
}

}  // namespace
}  // namespace kestro
