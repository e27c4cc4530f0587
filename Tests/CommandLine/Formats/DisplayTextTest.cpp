// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {
namespace {

TEST(DisplayText, OrdinaryTextStaysAsItIs) {
  EXPECT_EQ(displayText("RSRP -71.25 dBm"), "RSRP -71.25 dBm");
  EXPECT_EQ(displayText("Zürich 東京"), "Zürich 東京");
}

TEST(DisplayText, ControlCharactersBecomePictures) {
  EXPECT_EQ(displayText("a\033[2Jb"), "a␛[2Jb");
  EXPECT_EQ(displayText("a\nb\tc\x7F"), "a␊b␉c␡");
  EXPECT_EQ(displayText(std::string_view("\0", 1)), "␀");
}

TEST(DisplayText, EightBitControlsBecomeReplacementCharacters) {
  EXPECT_EQ(displayText("a\xC2\x9B"
                        "2Jb"),
            "a\uFFFD"
            "2Jb");
}

TEST(DisplayText, BytesThatAreNoUtf8BecomeReplacementCharacters) {
  EXPECT_EQ(displayText("a\xFF\xFE"
                        "b"),
            "a\uFFFD\uFFFDb");
  EXPECT_EQ(displayText("cut \xE6\x9D"), "cut \uFFFD\uFFFD");
}

TEST(DisplayText, TextDirectionAndLineSeparatorsBecomeReplacementCharacters) {
  EXPECT_EQ(displayText("\u202Eabc\u2028"), "\uFFFDabc\uFFFD");
}

TEST(TextWidth, CountsCellsNotBytes) {
  EXPECT_EQ(textWidth("abc"), 3U);
  EXPECT_EQ(textWidth("Zürich"), 6U);
  EXPECT_EQ(textWidth("東京"), 4U);
  EXPECT_EQ(textWidth("e\u0301"), 1U);
}

TEST(FitText, TextThatFitsStays) { EXPECT_EQ(fitText("12345", 5), "12345"); }

TEST(FitText, LongTextEndsWithAnEllipsis) { EXPECT_EQ(fitText("123456", 5), "1234…"); }

TEST(FitText, AWideCharacterIsNotCutInHalf) { EXPECT_EQ(fitText("東京都", 4), "東…"); }

TEST(FitText, NoCellsHoldNothing) { EXPECT_EQ(fitText("abc", 0), ""); }

TEST(ValidUtf8, ControlCharactersStay) { EXPECT_EQ(validUtf8("a\033\n"), "a\033\n"); }

TEST(ValidUtf8, EveryWrongByteIsReplaced) {
  EXPECT_EQ(validUtf8("\x80ok\xC3"), "\uFFFDok\uFFFD");
  EXPECT_EQ(validUtf8("\xED\xA0\x80"), "\uFFFD\uFFFD\uFFFD");  // a surrogate is no character
}

TEST(ValidUtf8Prefix, EndsBeforeTheFirstWrongByte) {
  EXPECT_EQ(validUtf8Prefix("ü\xFFü"), 2U);
  EXPECT_EQ(validUtf8Prefix("üü"), 4U);
}

}  // namespace
}  // namespace kestro
