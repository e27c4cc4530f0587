// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "CommandLine/Formats/LuaWriter.h"

namespace kestro {
namespace {

class LuaWriterTest : public ::testing::Test {
 protected:
  std::string output;
  LuaWriter writer{output};
};

TEST_F(LuaWriterTest, WritesTablesOfAllKinds) {
  writer.beginObject();
  writer.key("name");
  writer.text("a");
  writer.key("numbers");
  writer.beginArray();
  writer.number(18446744073709551615U);
  writer.integer(-1);
  writer.real(0.125);
  writer.boolean(true);
  writer.endArray();
  writer.endObject();
  EXPECT_EQ(output, R"({name="a",numbers={18446744073709551615,-1,0.125,true}})");
}

TEST_F(LuaWriterTest, BeginsALineForTablesInTables) {
  writer.beginArray();
  for (int i = 0; i < 2; ++i) {
    writer.beginObject();
    writer.endObject();
  }
  writer.endArray();
  EXPECT_EQ(output, "{\n{},\n{}}");
}

TEST_F(LuaWriterTest, AWordOfTheLanguageIsNoPlainKey) {
  writer.beginObject();
  writer.key("function");
  writer.text("");
  writer.key("functions");
  writer.text("");
  writer.endObject();
  EXPECT_EQ(output, R"({["function"]="",functions=""})");
}

TEST_F(LuaWriterTest, EscapesWhatATextCannotHold) {
  writer.text("a\"b\\c\n" + std::string(1, '\0') + "7×");
  EXPECT_EQ(output, R"("a\"b\\c\010\0007×")");
}

}  // namespace
}  // namespace kestro
