// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <limits>
#include <string>

#include "LogGenerator/Packets/NumberFormat.h"

namespace kestro {
namespace {

std::string print(const NumberFormat& format, std::int64_t number) {
  TextBuffer text;
  text.append(format, number);
  return std::string(text.text());
}

std::string print(const NumberFormat& format, double number) {
  TextBuffer text;
  text.append(format, number);
  return std::string(text.text());
}

TEST(NumberFormatTest, PrintsWholeNumbers) {
  EXPECT_EQ(print("%d", 0L), "0");
  EXPECT_EQ(print("%d", -140L), "-140");
  EXPECT_EQ(print("%u", 7L), "7");
  EXPECT_EQ(print("%x", 0xABCL), "abc");
}

TEST(NumberFormatTest, TakesTheLowThirtyTwoBits) {
  EXPECT_EQ(print("%d", 4294967295L), "-1");
  EXPECT_EQ(print("%d", 2147483648L), "-2147483648");
  EXPECT_EQ(print("%u", -1L), "4294967295");
  EXPECT_EQ(print("%x", -1L), "ffffffff");
  EXPECT_EQ(print("%d", 0x1'0000'0005L), "5");
}

TEST(NumberFormatTest, KeepsTheTextAroundTheConversion) {
  EXPECT_EQ(print("%d dBm", -95L), "-95 dBm");
  EXPECT_EQ(print("[Reserved %d]", 9L), "[Reserved 9]");
  EXPECT_EQ(print("0x%06x", 0x1A2BL), "0x001a2b");
  EXPECT_EQ(print("%d%%", 12L), "12%");
}

TEST(NumberFormatTest, KnowsWidthsAndFlags) {
  EXPECT_EQ(print("%5d", 42L), "   42");
  EXPECT_EQ(print("%05d", 42L), "00042");
  EXPECT_EQ(print("%05d", -42L), "-0042");
  EXPECT_EQ(print("%2d", 12345L), "12345");
  EXPECT_EQ(print("%+d", 5L), "+5");
  EXPECT_EQ(print("%+d", 0L), "+0");
  EXPECT_EQ(print("%+d", -5L), "-5");
  EXPECT_EQ(print("%+04d", 5L), "+005");
  EXPECT_EQ(print("%+u", 5L), "5");
}

TEST(NumberFormatTest, RoundsTiesToTheEvenDigit) {
  EXPECT_EQ(print("%4.2f", -19.625), "-19.62");
  EXPECT_EQ(print("%4.2f", -19.375), "-19.38");
  EXPECT_EQ(print("%4.2f", 0.125), "0.12");
  EXPECT_EQ(print("%4.2f", 0.375), "0.38");
  EXPECT_EQ(print("%.0f", 0.5), "0");
  EXPECT_EQ(print("%.0f", 1.5), "2");
  EXPECT_EQ(print("%.0f", 2.5), "2");
}

TEST(NumberFormatTest, RoundsWhatOnlyLooksLikeATie) {
  EXPECT_EQ(print("%4.2f", 2.675), "2.67");  // the nearest double lies below
  EXPECT_EQ(print("%4.2f", 1.005), "1.00");
}

TEST(NumberFormatTest, PrintsNegativeZero) {
  EXPECT_EQ(print("%4.2f", -0.0), "-0.00");
  EXPECT_EQ(print("%4.2f", -0.001), "-0.00");
  EXPECT_EQ(print("%4.2f", 0.0), "0.00");
}

TEST(NumberFormatTest, PrintsSixDecimalsUnlessToldOtherwise) {
  EXPECT_EQ(print("%f dB", -7.5), "-7.500000 dB");
  EXPECT_EQ(print("%.1f", 3.25), "3.2");
  EXPECT_EQ(print("%.f", 3.75), "4");
}

TEST(NumberFormatTest, PadsRealNumbers) {
  EXPECT_EQ(print("%8.2f|", -1.5), "   -1.50|");
  EXPECT_EQ(print("%08.2f", -1.5), "-0001.50");
  EXPECT_EQ(print("%+.2f", 1.5), "+1.50");
}

TEST(NumberFormatTest, PrintsNumbersThatAreNone) {
  EXPECT_EQ(print("%4.2f", std::numeric_limits<double>::infinity()), " inf");
  EXPECT_EQ(print("%06.2f", -std::numeric_limits<double>::infinity()), "  -inf");
  EXPECT_EQ(print("%4.2f", std::nan("")), " nan");
}

TEST(NumberFormatTest, AWholeNumberMayBePrintedAsARealOneAndTheOtherWayRound) {
  EXPECT_EQ(print("%4.2f", std::int64_t{3}), "3.00");
  EXPECT_EQ(print("%d", 3.9), "3");
  EXPECT_EQ(print("%d", -3.9), "-3");
}

TEST(NumberFormatTest, AgreesWithTheCLibrary) {
  char expected[64];
  for (int raw = -4096; raw <= 4096; ++raw) {
    const double eighths = raw * 0.125;
    std::snprintf(expected, sizeof(expected), "%4.2f dB", eighths);
    ASSERT_EQ(print("%4.2f dB", eighths), expected);
    const double tenths = raw * 0.1;
    std::snprintf(expected, sizeof(expected), "%.1f", tenths);
    ASSERT_EQ(print("%.1f", tenths), expected);
    const std::int64_t wide = std::int64_t{raw} * 1'000'003;
    std::snprintf(expected, sizeof(expected), "%d", static_cast<int>(wide));
    ASSERT_EQ(print("%d", wide), expected);
  }
}

TEST(NumberFormatTest, AgreesWithTheCLibraryAroundHalvesAndAtTheEndOfTheQuickWay) {
  char expected[64];
  const auto check = [&](double number) {
    std::snprintf(expected, sizeof(expected), "%+.2f", number);
    ASSERT_EQ(print("%+.2f", number), expected);
    std::snprintf(expected, sizeof(expected), "%.0f", number);
    ASSERT_EQ(print("%.0f", number), expected);
    std::snprintf(expected, sizeof(expected), "%.6f", number);
    ASSERT_EQ(print("%.6f", number), expected);
    std::snprintf(expected, sizeof(expected), "%.7f", number);
    ASSERT_EQ(print("%.7f", number), expected);
  };
  constexpr double kInfinity = std::numeric_limits<double>::infinity();
  for (int raw = -3000; raw <= 3000; ++raw) {
    const double half = (raw + 0.5) / 100;
    for (const double number :
         {half, std::nextafter(half, kInfinity), std::nextafter(half, -kInfinity), half + 1e-9,
          half - 1e-9, half + 9e-9, half - 1.1e-8, raw / 1e6 + 5e-7}) {
      check(number);
    }
  }
  for (const double limit : {1073741824.0, 10737418.24, 1073.741824}) {
    for (const double number : {limit, limit - 0.005, limit - 0.015, limit + 0.005, limit - 0.4995,
                                std::nextafter(limit, 0), 4 * limit, 1e15 * limit}) {
      check(number);
      check(-number);
    }
  }
}

TEST(TextBufferTest, AppendsAndBeginsAnew) {
  TextBuffer text;
  text.append("a");
  text.append("%d", std::int64_t{1});
  text.append("");
  EXPECT_EQ(text.text(), "a1");
  text.clear();
  EXPECT_EQ(text.text(), "");
}

TEST(TextBufferTest, CutsOffWhatDoesNotFit) {
  TextBuffer text;
  const std::string half(300, 'x');
  text.append(half);
  text.append(half);
  EXPECT_EQ(text.text(), std::string(512, 'x'));
  text.append("more");
  EXPECT_EQ(text.text().size(), 512U);
}

TEST(TextBufferTest, HoldsTheLongestNumber) {
  const std::string text = print("%f", -std::numeric_limits<double>::max());
  EXPECT_EQ(text.size(), 1U + 309U + 7U);
  EXPECT_EQ(text.substr(0, 6), "-17976");
}

}  // namespace
}  // namespace kestro
