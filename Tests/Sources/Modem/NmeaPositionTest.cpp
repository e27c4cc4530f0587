// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>

#include "Sources/Modem/NmeaPosition.h"

namespace kestro {
namespace {

/// A sentence with its checksum, the exclusive or of all between "$" and "*".
std::string sentence(std::string_view body) {
  unsigned sum = 0;
  for (const char c : body) sum ^= static_cast<unsigned char>(c);
  return fmt::format("${}*{:02X}\r\n", body, sum);
}

TEST(NmeaPosition, RMCHasSpeedAndCourse) {
  const auto fix =
      nmeaPosition(sentence("GPRMC,123519,A,4807.500,N,01130.000,W,010.0,084.4,230394,003.1,W"));
  ASSERT_TRUE(fix);
  EXPECT_DOUBLE_EQ(fix->latitude, 48.125);
  EXPECT_DOUBLE_EQ(fix->longitude, -11.5);
  EXPECT_DOUBLE_EQ(fix->speed.value(), 18.52);
  EXPECT_DOUBLE_EQ(fix->course.value(), 84.4);
}

TEST(NmeaPosition, GGAHasTheAltitude) {
  const auto fix =
      nmeaPosition(sentence("GNGGA,1,4807.500,S,01130.000,E,1,08,0.9,545.4,M,46.9,M,,"));
  ASSERT_TRUE(fix);
  EXPECT_DOUBLE_EQ(fix->latitude, -48.125);
  EXPECT_DOUBLE_EQ(fix->altitude.value(), 545.4);
}

TEST(NmeaPosition, BothAreJoined) {
  const auto fix =
      nmeaPosition(sentence("GPGGA,1,4807.500,N,01130.000,E,1,08,0.9,545.4,M,46.9,M,,") +
                   sentence("GPRMC,1,A,4807.500,N,01130.000,E,1.0,2.0,230394,,"));
  ASSERT_TRUE(fix);
  EXPECT_TRUE(fix->altitude && fix->speed);
}

TEST(NmeaPosition, WhatIsInvalidIsNone) {
  EXPECT_FALSE(nmeaPosition(""));
  EXPECT_FALSE(nmeaPosition("$GPRMC,1,A,4807.500,N,01130.000,E,1.0,2.0,230394,,*00"));
  EXPECT_FALSE(nmeaPosition(sentence("GPRMC,1,V,4807.500,N,01130.000,E,1.0,2.0,230394,,")));
  EXPECT_FALSE(nmeaPosition(sentence("GPRMC,1,V,,,,,,,030136,,,N")));
  EXPECT_FALSE(nmeaPosition(sentence("GPGGA,1,,,,,0,00,0.5,,M,0.0001999,M,0.0000099,0000")));
  EXPECT_FALSE(nmeaPosition(sentence("GPRMC,1,A,9107.500,N,01130.000,E,1.0,2.0,230394,,")));
  EXPECT_FALSE(nmeaPosition(sentence("GPRMC,1,A,4860.000,N,01130.000,E,1.0,2.0,230394,,")));
  EXPECT_FALSE(nmeaPosition(sentence("GPRMC,1,A")));
  EXPECT_FALSE(nmeaPosition("$*00\r\n*\r$"));
}

}  // namespace
}  // namespace kestro
