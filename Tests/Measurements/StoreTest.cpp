// SPDX-License-Identifier: MIT
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>

#include "Measurements/Digest.h"
#include "Measurements/Store.h"
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"
#include "Tests/Measurements/LTEPackets.h"
#include "Tests/Measurements/StoreRows.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::string bytesOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

const std::string kSha(64, 'a');

/// A drive of six seconds from cell 700 to cell 800, written into a store.
class StoreTest : public DriveFixture {
 public:
  StoreTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_LTE) { beginWatch(); }

  void beginWatch() {
    watch.emplace(std::vector<Rule>(), [this](const Event& event) { store->add(event); });
  }

  void openStore() {
    auto opened = Store::open(file.path());
    ASSERT_TRUE(opened) << opened.error().message;
    store = std::move(*opened);
  }

  void add(const PacketBytes& packet) {
    const MeasuredMessage message{.time = now,
                                  .number = ++number,
                                  .technology = technology,
                                  .measured = measurer.measure(technology, packet.bytes())};
    watch->take(message);
    store->add(message, watch->cellValues());
  }

  void drive() {
    store->beginRecording();
    at(0);
    add(lteCell(700, 14));
    add(lteServing(14, -100, -12));
    store->add(now, {.latitude = 51.5, .longitude = -8.25}, 30.0);
    at(500);
    add(lteServing(14, -101, -13));
    store->add(now, {.latitude = 0, .longitude = 0});
    at(1'000);
    add(lteConnected(14, -102, 15, -95));
    at(1'500);
    add(lteCell(800, 15, 602));
    add(lteServing(15, -94));
    at(2'500);
    add(lteNeighbour(14, -110));
    at(6'500);
    add(lteServing(15, -99));
  }

  void driveInto(const std::string& sha256, const std::string& name) {
    openStore();
    beginWatch();
    drive();
    const auto finished =
        store->finishRecording({.sha256 = sha256, .name = name}, measurer.series(), watch->cells());
    ASSERT_TRUE(finished) << finished.error().message;
    const auto committed = store->commit();
    ASSERT_TRUE(committed) << committed.error().message;
    store.reset();
  }

  [[nodiscard]] std::vector<std::string> rows(const std::string& query) const {
    return rowsOf(file.path(), query);
  }

  TemporaryFile file{"drive.sqlite"};
  std::unique_ptr<Store> store;
};

TEST_F(StoreTest, MeasurementsHaveTheirSeriesTimeAndCell) {
  driveInto(kSha, "drive.pcap");
  EXPECT_THAT(rows("SELECT name, made_up, messages, last_time_us - first_time_us FROM recording"),
              ElementsAre("drive.pcap||8|6500000"));
  EXPECT_THAT(
      rows("SELECT time_us - 1700000000000000, value, text, message, name, serving, "
           "measurement.assumed "
           "FROM measurement JOIN series ON series.id = series LEFT JOIN cell ON cell.id = cell "
           "WHERE series.section = 'Serving Cell Measurements' AND key = 'Measured RSRP'"),
      ElementsAre("0|-100.0||2|700|1|0", "500000|-101.0||3|700|1|0", "1500000|-94.0||6|800|1|0",
                  "6500000|-99.0||8|800|1|0"));
  EXPECT_THAT(rows("SELECT DISTINCT value, text, kind, unit FROM measurement JOIN series "
                   "ON series.id = series WHERE key = 'Measurement Rules Updated'"),
              ElementsAre("0.0|False|state|"));
}

TEST_F(StoreTest, ServingHasOneRowASecond) {
  driveInto(kSha, "drive.pcap");
  // The last level of each second that has one: -101 of cell 700, then -94 of cell 800.
  EXPECT_THAT(rows("SELECT second - 1700000000, time, latitude, longitude, technology, name, "
                   "level, quality FROM serving"),
              ElementsAre("0|2023-11-14 22:13:20|51.5|-8.25|LTE|700|-101.0|-13.0",
                          "1|2023-11-14 22:13:21|||LTE|800|-94.0|-10.0",
                          "6|2023-11-14 22:13:26|||LTE|800|-99.0|-10.0"));
}

TEST_F(StoreTest, OfMessagesAtOneTimeTheLastOneCounts) {
  openStore();
  store->beginRecording();
  at(0);
  add(lteCell(700, 14));
  add(lteConnected(14, -95, 15, -88));
  add(lteServing(14, -90));
  ASSERT_TRUE(store->finishRecording({.sha256 = kSha, .name = "drive.pcap"}, measurer.series(),
                                     watch->cells()));
  ASSERT_TRUE(store->commit());
  EXPECT_THAT(rows("SELECT level FROM serving"), ElementsAre("-90.0"));
}

TEST_F(StoreTest, NeighboursHaveLevelAndQuality) {
  driveInto(kSha, "drive.pcap");
  // -12 = 64 / 8 - 20 of the first; the second says no quality but its format's zero, -30.
  EXPECT_THAT(rows("SELECT time_us - 1700000000000000, name, assumed, level, quality "
                   "FROM neighbours ORDER BY time_us"),
              ElementsAre("1000000|1300/15|0|-95.0|-12.0", "2500000|700|1|-110.0|-30.0"));
}

TEST_F(StoreTest, CellsAndEventsAreRows) {
  driveInto(kSha, "drive.pcap");
  EXPECT_THAT(
      rows("SELECT technology, name, channel, physical_identity, band, frequency_mhz, area, "
           "level_last, level_least, level_median, level_greatest, level_count, serving_s, assumed "
           "FROM cell ORDER BY id"),
      ElementsAre("LTE|700|1300|14|3|1815.0|601|-110.0|-110.0|-102.0|-100.0|4|1.5|1",
                  "LTE|1300/15|1300|15|3|1815.0||-95.0|-95.0|-95.0|-95.0|1|0.0|0",
                  "LTE|800|1300|15|3|1815.0|602|-99.0|-99.0|-99.0|-94.0|2|5.0|0"));
  EXPECT_THAT(rows("SELECT kind, subject, from_text, to_text, f.name, t.name, from_level, told_by, "
                   "connected_by, message FROM event LEFT JOIN cell f ON f.id = from_cell "
                   "LEFT JOIN cell t ON t.id = to_cell ORDER BY event.id"),
              ElementsAre("handover||700|800|700|800|-102.0|0xB0C2|0xB179|5",
                          "area|tracking area|601|602||||0xB0C2||5"));
}

TEST_F(StoreTest, TheFirstPositionOfASecondIsKept) {
  driveInto(kSha, "drive.pcap");
  EXPECT_THAT(rows("SELECT time_us - 1700000000000000, latitude, longitude, speed_kmh "
                   "FROM position"),
              ElementsAre("0|51.5|-8.25|30.0"));
}

TEST_F(StoreTest, TheSameRecordingReplacesItself) {
  driveInto(kSha, "first.pcap");
  driveInto(std::string(64, 'b'), "other.pcap");
  const auto counts =
      "SELECT (SELECT count(*) FROM measurement), (SELECT count(*) FROM series), "
      "(SELECT count(*) FROM cell), (SELECT count(*) FROM event), "
      "(SELECT count(*) FROM position)";
  const auto before = rows(counts);
  driveInto(kSha, "again.pcap");
  EXPECT_EQ(rows(counts), before);
  EXPECT_THAT(rows("SELECT name FROM recording ORDER BY id"),
              ElementsAre("other.pcap", "again.pcap"));
  EXPECT_THAT(rows("SELECT count(*) FROM measurement WHERE series NOT IN (SELECT id FROM series)"),
              ElementsAre("0"));
}

TEST_F(StoreTest, IndexesAreThereAfterEveryRun) {
  for (const char* sha : {"a", "b"}) {
    driveInto(sha, "drive.pcap");
    EXPECT_EQ(
        rows("SELECT name FROM sqlite_schema WHERE type = 'index' AND sql IS NOT NULL").size(), 6u);
  }
}

TEST_F(StoreTest, ARunThatIsNotFinishedLeavesTheFileAsItWas) {
  driveInto(kSha, "first.pcap");
  const std::string before = bytesOf(file.path());
  openStore();
  drive();
  store.reset();
  EXPECT_TRUE(bytesOf(file.path()) == before);
}

TEST_F(StoreTest, ARunThatIsNotFinishedLeavesNoNewFile) {
  openStore();
  drive();
  store.reset();
  EXPECT_NE(access(file.path().c_str(), F_OK), 0);
}

TEST_F(StoreTest, ARunThatIsKilledLeavesTheFileAsItWas) {
  driveInto(kSha, "first.pcap");
  const pid_t child = fork();
  if (child == 0) {
    auto opened = Store::open(file.path());
    if (!opened) _exit(1);
    store = std::move(*opened);
    // More than the cache holds, so that the file itself has been written to.
    for (int i = 0; i < 3'000; ++i) drive();
    _exit(store->finishRecording({.sha256 = kSha, .name = "broken"}, measurer.series(),
                                 watch->cells())
              ? 0
              : 2);
  }
  int status = 0;
  waitpid(child, &status, 0);
  ASSERT_EQ(status, 0);
  EXPECT_THAT(rows("SELECT name, messages FROM recording"), ElementsAre("first.pcap|8"));
  EXPECT_THAT(rows("PRAGMA integrity_check"), ElementsAre("ok"));
  EXPECT_THAT(rows("SELECT count(*) FROM sqlite_schema WHERE name = 'measurement_by_series'"),
              ElementsAre("1"));
}

std::string openingError(const std::string& path) {
  const auto store = Store::open(path);
  return store ? "no error" : store.error().message;
}

TEST_F(StoreTest, WhatIsNoStoreIsRefusedAndStaysAsItIs) {
  std::ofstream(file.path()) << "time,series,value\n" << std::string(2'000, 'x');
  const std::string before = bytesOf(file.path());
  EXPECT_EQ(openingError(file.path()), file.path() + ": file is not a database");
  EXPECT_EQ(bytesOf(file.path()), before);
}

TEST_F(StoreTest, ADatabaseOfOthersIsRefused) {
  std::ofstream(file.path()).close();
  ASSERT_THAT(rows("CREATE TABLE mine (x)"), IsEmpty());
  EXPECT_EQ(openingError(file.path()), file.path() + ": not a store of measurements");
  EXPECT_THAT(rows("SELECT name FROM sqlite_schema"), ElementsAre("mine"));
}

TEST_F(StoreTest, AStoreOfAnotherVersionIsRefused) {
  driveInto(kSha, "drive.pcap");
  ASSERT_THAT(rows("PRAGMA user_version = 7"), IsEmpty());
  EXPECT_EQ(openingError(file.path()),
            file.path() + ": a store of version 7, this program writes version 1");
}

TEST_F(StoreTest, AFileThatCannotBeMadeIsAnError) {
  EXPECT_EQ(openingError("/nowhere/drive.sqlite"),
            "/nowhere/drive.sqlite: unable to open database file");
}

// The digest of "abc", FIPS 180-4's own example.
TEST(DigestTest, IsThatOfTheStandard) {
  constexpr std::string_view kAbc =
      "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad";
  Sha256 digest;
  digest.add(Bytes{'a'});
  digest.add(Bytes{'b', 'c'});
  EXPECT_EQ(digest.finish(), kAbc);
  const TemporaryFile file;
  std::ofstream(file.path()) << "abc";
  EXPECT_EQ(sha256OfFile(file.path()), std::string(kAbc));
  EXPECT_THAT(sha256OfFile("/nowhere/x").error().message, HasSubstr("/nowhere/x: "));
}

}  // namespace
}  // namespace kestro::testing
