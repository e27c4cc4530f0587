// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "CommandLine/Formats/JsonWriter.h"

namespace kestro {
namespace {

std::string jsonText(std::string_view text) {
  std::string output;
  JsonWriter(output).text(text);
  return output;
}

void writeSample(JsonWriter& writer) {
  writer.beginObject();
  writer.key("a");
  writer.text("x");
  writer.key("b");
  writer.beginArray();
  writer.number(1);
  writer.beginObject();
  writer.endObject();
  writer.endArray();
  writer.key("c");
  writer.beginArray();
  writer.endArray();
  writer.endObject();
}

TEST(JsonWriter, CompactFormIsOneLine) {
  std::string output;
  JsonWriter writer(output);
  writeSample(writer);
  EXPECT_EQ(output, R"({"a":"x","b":[1,{}],"c":[]})");
}

TEST(JsonWriter, WritesNumbersAndNames) {
  std::string output;
  JsonWriter writer(output);
  writer.beginArray();
  writer.number(18446744073709551615U);
  writer.integer(-9223372036854775807 - 1);
  writer.boolean(true);
  writer.boolean(false);
  writer.endArray();
  EXPECT_EQ(output, "[18446744073709551615,-9223372036854775808,true,false]");
}

TEST(JsonWriter, WritesFractionsInAsFewDigitsAsTheyNeed) {
  std::string output;
  JsonWriter writer(output);
  writer.beginArray();
  for (const double value : {-88.25, 0.1, 15.0, -0.5, 1e300}) writer.real(value);
  writer.endArray();
  EXPECT_EQ(output, "[-88.25,0.1,15,-0.5,1e+300]");
}

TEST(JsonWriter, WritesOneValueAfterTheOther) {
  std::string output;
  JsonWriter writer(output);
  writeSample(writer);
  output += '\n';
  writeSample(writer);
  EXPECT_EQ(output, R"({"a":"x","b":[1,{}],"c":[]})"
                    "\n"
                    R"({"a":"x","b":[1,{}],"c":[]})");
}

TEST(JsonWriter, IndentedFormHasALineForEachMember) {
  std::string output;
  JsonWriter writer(output, JsonWriter::Form::Indented);
  writeSample(writer);
  EXPECT_EQ(output, R"({
  "a": "x",
  "b": [
    1,
    {}
  ],
  "c": []
})");
}

TEST(JsonWriter, QuotesBackslashesAndControlsAreEscaped) {
  EXPECT_EQ(jsonText("say \"hi\" \\ \n\r\t\x01\x1F"), R"("say \"hi\" \\ \n\r\t\u0001\u001f")");
}

TEST(JsonWriter, BytesThatAreNoUtf8BecomeReplacementCharacters) {
  EXPECT_EQ(jsonText("a\xFFz"), "\"a\uFFFDz\"");
}

TEST(JsonWriter, EveryByteInATextCanBeReadBack) {
  std::string ascii;
  for (int byte = 0; byte < 0x80; ++byte) ascii += static_cast<char>(byte);
  EXPECT_EQ(nlohmann::json::parse(jsonText(ascii)).get<std::string>(), ascii);
}

TEST(JsonWriter, LargeNumbersKeepTheirDigits) {
  std::string output;
  JsonWriter(output).number(18446744073709551615U);
  EXPECT_EQ(output, "18446744073709551615");
}

}  // namespace
}  // namespace kestro
