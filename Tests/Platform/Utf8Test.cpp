// SPDX-License-Identifier: MIT
// Which texts are valid UTF-8 without a NUL.
#include <gtest/gtest.h>

#include <string>

#include "Platform/Utf8.h"

namespace kestro {
namespace {

using namespace std::string_view_literals;

TEST(Utf8Test, TextsOfEveryLengthOfCharacterAreValid) {
  for (const std::string_view text :
       {""sv, "a"sv, "\x7F"sv, "\xC2\x80"sv, "\xDF\xBF"sv, "\xE0\xA0\x80"sv, "\xED\x9F\xBF"sv,
        "\xEE\x80\x80"sv, "\xEF\xBF\xBF"sv, "\xF0\x90\x80\x80"sv, "\xF4\x8F\xBF\xBF"sv,
        "long plain text, \xC3\xA9\xE4\xB8\xAD\xF0\x9F\x98\x80 and more plain text after it"sv}) {
    EXPECT_EQ(validTextPrefix(text), text.size()) << text;
  }
}

TEST(Utf8Test, WhatIsNoCharacterEndsThePrefix) {
  for (const std::string_view text :
       {"\x80"sv, "\xBF"sv, "\xC0\x80"sv, "\xC1\xBF"sv, "\xC2"sv, "\xC2\x7F"sv, "\xC2\xC0"sv,
        "\xE0\x9F\xBF"sv, "\xE0\xA0"sv, "\xE1\x80\x7F"sv, "\xED\xA0\x80"sv, "\xF0\x8F\xBF\xBF"sv,
        "\xF0\x90\x80"sv, "\xF4\x90\x80\x80"sv, "\xF5\x80\x80\x80"sv, "\xFF"sv, "\0"sv}) {
    EXPECT_EQ(validTextPrefix(text), 0U);
  }
}

TEST(Utf8Test, ThePrefixEndsAtTheFirstBadByteWhereverItIs) {
  for (std::size_t at = 0; at < 40; ++at) {
    for (const char bad : {'\0', '\x80', '\xFF'}) {
      std::string text(40, 'x');
      text[at] = bad;
      EXPECT_EQ(validTextPrefix(text), at);
      EXPECT_FALSE(isPlainAscii(text)) << at;
    }
  }
}

TEST(Utf8Test, PlainAsciiHasNoNulAndNoByteAbove127) {
  EXPECT_TRUE(isPlainAscii(""));
  EXPECT_TRUE(isPlainAscii("\x01 to \x7F, all of it"));
  EXPECT_FALSE(isPlainAscii("caf\xC3\xA9"));
}

}  // namespace
}  // namespace kestro
