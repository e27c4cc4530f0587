// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <variant>

#include "CommandLine/Commands/Command.h"

namespace kestro {
namespace {

/// What the row says of a text.
std::string problem(const OptionRow& row, const std::string& text) {
  return std::get<ValueReader>(row.target)(text);
}

TEST(MessageOptionTest, TakesANumberOrTwo) {
  std::optional<MessageNumbers> numbers;
  const OptionRow row = messageOption(numbers);
  EXPECT_EQ(problem(row, "12"), "");
  EXPECT_EQ(numbers->first, 12U);
  EXPECT_EQ(numbers->last, 12U);
  EXPECT_EQ(problem(row, "1-18446744073709551615"), "");
  EXPECT_EQ(numbers->first, 1U);
  EXPECT_EQ(numbers->last, 18446744073709551615U);
  EXPECT_TRUE(numbers->contains(1));
}

TEST(MessageOptionTest, RefusesWhatIsNoSuch) {
  std::optional<MessageNumbers> numbers;
  const OptionRow row = messageOption(numbers);
  for (const char* text : {"", "0", "0-3", "3-2", "-3", "3-", "1-2-3", "+1", " 1", "1.5", "x",
                           "18446744073709551616"}) {
    EXPECT_EQ(
        problem(row, text),
        "'" + std::string(text) + "' is no number of a message, such as 12, nor two, such as 3-7");
  }
}

TEST(MessageNumbersTest, HoldBothTheirEnds) {
  const MessageNumbers numbers{.first = 3, .last = 7};
  EXPECT_FALSE(numbers.contains(2));
  EXPECT_TRUE(numbers.contains(3));
  EXPECT_TRUE(numbers.contains(7));
  EXPECT_FALSE(numbers.contains(8));
}

TEST(CodeOptionTest, TakesHexadecimalNumbers) {
  std::optional<LogCode> code;
  const OptionRow row = codeOption(code);
  for (const auto& [text, expected] :
       {std::pair("0xB179", 0xB179U), std::pair("b179", 0xB179U), std::pair("0X7135", 0x7135U),
        std::pair("7135", 0x7135U), std::pair("FFFFFF", 0xFFFFFFU), std::pair("0", 0U)}) {
    EXPECT_EQ(problem(row, text), "") << text;
    EXPECT_EQ(code, expected) << text;
  }
}

TEST(CodeOptionTest, RefusesWhatIsNoCode) {
  std::optional<LogCode> code;
  const OptionRow row = codeOption(code);
  for (const char* text : {"", "0x", "x", "0xG", "1000000", "-1", "0x0x1", "B179 "}) {
    EXPECT_EQ(problem(row, text), "'" + std::string(text) +
                                      "' is no log code, such as 0xB179 (hexadecimal, 0 to "
                                      "FFFFFF)");
  }
}

}  // namespace
}  // namespace kestro
