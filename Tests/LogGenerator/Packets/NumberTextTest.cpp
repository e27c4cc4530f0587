// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gtest/gtest.h>

#include <string>

#include "LogGenerator/Packets/NumberText.h"

namespace kestro {
namespace {

std::string read(std::string_view text) {
  const auto number = numberWithUnit(text);
  return number ? fmt::format("{}|{}", number->number, number->unit) : "no";
}

TEST(NumberTextTest, ReadsANumberAndItsUnit) {
  EXPECT_EQ(read("-93 dBm"), "-93|dBm");
  EXPECT_EQ(read("12"), "12|");
  EXPECT_EQ(read("001"), "1|");
  EXPECT_EQ(read("+0.5 kbit/s"), "0.5|kbit/s");
  EXPECT_EQ(read("40%"), "40|%");
  EXPECT_EQ(read("0.5 %"), "0.5|%");
  EXPECT_EQ(read("123456789012345"), "123456789012345|");
}

TEST(NumberTextTest, ReadsNothingElse) {
  for (const std::string_view text : {"",
                                      "-",
                                      "-dBm",
                                      "4G",
                                      "0x12",
                                      "1e5",
                                      "12 ",
                                      "12  dB",
                                      "MCS-9",
                                      "2100 (I) x",
                                      "2-4",
                                      "1.",
                                      ".5",
                                      "1.2.3",
                                      "12 34",
                                      "2026-11-22 08:00:00",
                                      "1234567890123456",
                                      "nan",
                                      "inf",
                                      "--1"}) {
    EXPECT_EQ(read(text), "no") << text;
  }
}

}  // namespace
}  // namespace kestro
