// SPDX-License-Identifier: MIT
#include <fmt/format.h>
#include <gtest/gtest.h>

#include <fstream>

#include "Measurements/GpxReader.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;

// 2023-11-14T22:13:20Z
constexpr Moment kGpxStart{1'700'000'000s};

constexpr std::string_view kGpx = R"(<?xml version="1.0" encoding="UTF-8"?>
<gpx version="1.1" creator="hand" xmlns="http://www.topografix.com/GPX/1/1">
 <metadata><time>2001-01-01T00:00:00Z</time></metadata>
 <wpt lat="1" lon="2"><time>2023-11-14T22:13:20Z</time></wpt>
 <trk><name>A drive</name><trkseg>
  <trkpt lat="51.5" lon="-8.25"><ele>12.5</ele><time>2023-11-14T22:13:20Z</time></trkpt>
  <trkpt lat="52.5" lon="-8.75"><time> 2023-11-14T23:13:22.500+01:00 </time></trkpt>
 </trkseg></trk>
</gpx>
)";

Result<Track> read(std::string_view text) {
  GpxReader reader;
  auto taken = reader.take(text);
  if (!taken) return tl::unexpected(taken.error());
  return reader.finish();
}

std::string gpxErrorOf(std::string_view text) {
  const auto track = read(text);
  return track ? "no error" : track.error().message;
}

std::string withPoint(std::string_view point) {
  return fmt::format("<gpx><trk><trkseg>{}</trkseg></trk></gpx>", point);
}

TEST(GpxReaderTest, TrackPointsBecomeFixes) {
  const auto track = read(kGpx);
  ASSERT_TRUE(track) << track.error().message;
  ASSERT_EQ(track->fixes().size(), 2u);
  EXPECT_EQ(track->fixes()[0].time, kGpxStart);
  EXPECT_EQ(track->fixes()[0].position, (Coordinates{.latitude = 51.5, .longitude = -8.25}));
  EXPECT_EQ(track->fixes()[1].time, kGpxStart + 2'500ms);
}

TEST(GpxReaderTest, AFileMayComeByteByByte) {
  GpxReader reader;
  for (const char c : kGpx) ASSERT_TRUE(reader.take({&c, 1}));
  const auto track = reader.finish();
  ASSERT_TRUE(track);
  EXPECT_EQ(track->fixes().size(), 2u);
}

TEST(GpxReaderTest, PointsThatSayNoPlaceOrTimeAreLeftOutAndCounted) {
  GpxReader reader;
  ASSERT_TRUE(reader.take(withPoint(R"(
    <trkpt lat="51" lon="8"/>
    <trkpt lat="91" lon="8"><time>2023-11-14T22:13:20Z</time></trkpt>
    <trkpt lat="51" lon="nan"><time>2023-11-14T22:13:20Z</time></trkpt>
    <trkpt lat="51"><time>2023-11-14T22:13:20Z</time></trkpt>
    <trkpt lat="51" lon="8"><time>yesterday</time></trkpt>
    <trkpt lat="51" lon="8"><time>2023-11-14T22:13:20Z</time></trkpt>)")));
  const auto track = reader.finish();
  ASSERT_TRUE(track);
  EXPECT_EQ(track->fixes().size(), 1u);
  EXPECT_EQ(reader.leftOutCount(), 5u);
}

TEST(GpxReaderTest, WhatIsNoGpxIsRefused) {
  EXPECT_EQ(gpxErrorOf("<kml/>"), "not a GPX file: its outermost element is not <gpx>");
  EXPECT_EQ(gpxErrorOf("<gpx>\n <trk></gpx>"), "line 2, column 9: mismatched tag");
  EXPECT_EQ(gpxErrorOf(""), "line 1, column 1: no element found");
  EXPECT_EQ(gpxErrorOf("<gpx><trk>"), "line 1, column 11: no element found");
  EXPECT_EQ(gpxErrorOf("<gpx/>"), "no track point with a place and a time");
}

TEST(GpxReaderTest, EntitiesThatGrowWithoutEndAreRefused) {
  std::string text = "<!DOCTYPE gpx [<!ENTITY a0 \"aaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaa\">\n";
  for (int i = 1; i < 40; ++i) {
    text += fmt::format("<!ENTITY a{} \"&a{};&a{};\">\n", i, i - 1, i - 1);
  }
  text += "]><gpx><name>&a39;</name></gpx>";
  EXPECT_NE(gpxErrorOf(text).find("amplification"), std::string::npos) << gpxErrorOf(text);
}

TEST(GpxReaderTest, TooManyPointsAreRefused) {
  GpxReader reader;
  ASSERT_TRUE(reader.take("<gpx><trk><trkseg>"));
  constexpr std::string_view kPoint =
      R"(<trkpt lat="51" lon="8"><time>2023-11-14T22:13:20Z</time></trkpt>)";
  std::string many;
  for (int i = 0; i < 1'000; ++i) many += kPoint;
  for (std::size_t i = 0; i < Track::kMaximumFixes / 1'000; ++i) ASSERT_TRUE(reader.take(many));
  const auto taken = reader.take(kPoint);
  ASSERT_FALSE(taken);
  EXPECT_EQ(taken.error().message, "more than 2000000 points");
}

TEST(GpxReaderTest, AFileIsReadWhole) {
  const testing::TemporaryFile file("drive.gpx");
  std::ofstream(file.path()) << kGpx;
  std::uint64_t leftOut = 0;
  const auto track = readGpxFile(file.path(), leftOut);
  ASSERT_TRUE(track) << track.error().message;
  EXPECT_EQ(track->fixes().size(), 2u);
  const auto missing = readGpxFile("/nowhere/drive.gpx", leftOut);
  ASSERT_FALSE(missing);
  EXPECT_EQ(missing.error().message, "/nowhere/drive.gpx: No such file or directory");
}

TEST(GpxReaderTest, TimesHaveAZone) {
  EXPECT_EQ(momentOfIsoText("2023-11-14T22:13:20Z"), kGpxStart);
  EXPECT_EQ(momentOfIsoText("2023-11-14T22:13:20.1234567Z"), kGpxStart + 123'456us);
  EXPECT_EQ(momentOfIsoText("2023-11-14T17:43:20-0430"), kGpxStart);
  EXPECT_EQ(momentOfIsoText("2023-11-14T22:13:20"), std::nullopt);
  EXPECT_EQ(momentOfIsoText("2023-02-29T22:13:20Z"), std::nullopt);
  EXPECT_EQ(momentOfIsoText("2023-11-14T24:13:20Z"), std::nullopt);
  EXPECT_EQ(momentOfIsoText("2023-11-14T22:13:20.Z"), std::nullopt);
  EXPECT_EQ(momentOfIsoText("2023-11-14T22:13:20Zx"), std::nullopt);
  EXPECT_EQ(momentOfIsoText("2023-11--4T22:13:20Z"), std::nullopt);
}

}  // namespace
}  // namespace kestro
