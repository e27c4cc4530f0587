// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "LogGenerator/Bands.h"

namespace kestro {
namespace {

ChannelBand at(std::string band, std::uint32_t kHz) {
  return {.band = std::move(band), .downlinkKHz = kHz};
}
ChannelBand without(std::string band) { return {.band = std::move(band), .downlinkKHz = {}}; }

// F = F_low + 0.1 (N - N_offset), TS 36.104, 5.7.3: band 3 has F_low 1805 and N_offset 1200.
TEST(BandsTest, EUTRAChannelHasItsBandsLowEdgeAndSteps) {
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 1300), at("3", 1'815'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 0), at("1", 2'110'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 599), at("1", 2'169'900));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 600), at("2", 1'930'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 6300), at("20", 806'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 9919), at("31", 467'400));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 38950), at("40", 2'330'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 66786), at("66", 2'145'000));
}

TEST(BandsTest, ChannelsBetweenBandsHaveNone) {
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 4950), ChannelBand{});
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 65535), ChannelBand{});
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 900), ChannelBand{});
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 0xFFFFFFFF), ChannelBand{});
}

// UARFCN = 5 F, TS 25.104, 5.4.3; band V and VI share channels and frequencies.
TEST(BandsTest, UTRAFDDChannelIsFiveTimesTheFrequency) {
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRAFDD, 10613), at("I", 2'122'600));
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRAFDD, 10838), at("I", 2'167'600));
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRAFDD, 2937), at("VIII", 927'400));
}

TEST(BandsTest, BandsThatAgreeOnTheFrequencyAreAllNamedWithIt) {
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRAFDD, 4400), at("V, VI", 880'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRAFDD, 4400, 6), at("VI", 880'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRATDD, 9500), at("a low, b low, f", 1'900'000));
}

TEST(BandsTest, UTRATDDChannelIsFiveTimesTheFrequency) {
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRATDD, 10054), at("a high", 2'010'800));
  EXPECT_EQ(bandOfChannel(RadioSystem::UTRATDD, 12850), at("d", 2'570'000));
}

// TS 45.005, 2: uplink 890 + 0.2 n and the downlink 45 MHz above it; 1710.2 + 0.2 (n - 512) and
// 95 MHz; 1850.2 + 0.2 (n - 512) and 80 MHz; 824.2 + 0.2 (n - 128) and 45 MHz.
TEST(BandsTest, GSMChannelFollowsItsBandsFormula) {
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 1), at("P-GSM 900", 935'200));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 124), at("P-GSM 900", 959'800));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 0), at("E-GSM 900", 935'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 975), at("E-GSM 900", 925'200));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 1023), at("E-GSM 900", 934'800));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 128), at("GSM 850", 869'200));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 885), at("DCS 1800", 1'879'800));
}

TEST(BandsTest, WhereSeveralBandsFitAndDifferThePacketsOwnDecides) {
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 512), without("DCS 1800, PCS 1900"));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 512, 0), at("DCS 1800", 1'805'200));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 661, 1), at("PCS 1900", 1'960'000));
}

TEST(BandsTest, AnOwnBandThatDoesNotFitIsPassedOver) {
  EXPECT_EQ(bandOfChannel(RadioSystem::EUTRA, 1300, 20), at("3", 1'815'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 512, 7), without("DCS 1800, PCS 1900"));
  EXPECT_EQ(bandOfChannel(RadioSystem::GSM, 1, 0xFFFFFFFF), at("P-GSM 900", 935'200));
}

// C.S0057: class 0 has 870 + 0.03 N up to 799, and 870 + 0.03 (N - 1023) above; class 1 has
// 1930 + 0.05 N; class 6 has 2110 + 0.05 N.
TEST(BandsTest, CDMA2000ChannelFollowsItsBandClass) {
  EXPECT_EQ(bandOfChannel(RadioSystem::CDMA2000, 283, 0), at("0", 878'490));
  EXPECT_EQ(bandOfChannel(RadioSystem::CDMA2000, 1013, 0), at("0", 869'700));
  EXPECT_EQ(bandOfChannel(RadioSystem::CDMA2000, 25, 1), at("1", 1'931'250));
  EXPECT_EQ(bandOfChannel(RadioSystem::CDMA2000, 100, 6), at("6", 2'115'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::CDMA2000, 25), without("0, 1, 4, 6, 8, 9, 13, 14, 15"));
}

// TS 38.104, 5.4.2.1: 5 kHz steps from 0; 15 kHz from 3000 MHz; 60 kHz from 24250.08 MHz.
TEST(BandsTest, NRChannelLiesOnTheGlobalRaster) {
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 361000), at("n3", 1'805'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 599999), at("", 2'999'995));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 600000), at("", 3'000'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 2016667), at("n258", 24'250'080));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 660000), at("n77", 3'900'000));
}

TEST(BandsTest, NRBandIsSaidOnlyWhereOneFits) {
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 640000), at("", 3'600'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 640000, 78), at("n78", 3'600'000));
  EXPECT_EQ(bandOfChannel(RadioSystem::NR, 3279166), ChannelBand{});
}

}  // namespace
}  // namespace kestro
