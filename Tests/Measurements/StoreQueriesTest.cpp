// SPDX-License-Identifier: MIT
// The queries and columns of Documentation/measurements.md, on a drive by hand.
#include <gmock/gmock.h>

#include <fstream>
#include <sstream>

#include "Measurements/Store.h"
#include "Platform/TelephonyService.h"
#include "Tests/Measurements/DriveFixture.h"
#include "Tests/Measurements/LTEPackets.h"
#include "Tests/Measurements/StoreRows.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

std::string measurementsPage() {
  const std::ifstream file(KESTRO_DOCUMENTATION_DIRECTORY "/measurements.md");
  std::ostringstream text;
  text << file.rdbuf();
  return text.str();
}

std::vector<std::string> documentedQueries() {
  std::vector<std::string> queries;
  const std::string page = measurementsPage();
  constexpr std::string_view kBegin = "```sql\n";
  for (std::size_t at = page.find(kBegin); at != std::string::npos; at = page.find(kBegin, at)) {
    at += kBegin.size();
    queries.push_back(page.substr(at, page.find("```", at) - at));
  }
  return queries;
}

/// From cell 700 to cell 800 and back in three seconds, then a gap and a bad stretch.
class StoreQueriesTest : public DriveFixture {
 public:
  StoreQueriesTest() : DriveFixture(kTqLogChannelTechnology_Ondrel_LTE) {
    auto opened = Store::open(file.path());
    if (!opened) return;
    store = std::move(*opened);
    watch.emplace(*parseRules("Measured RSRP < -110 dBm", "rules"),
                  [this](const Event& event) { store->add(event); });
    store->beginRecording();
    drive();
    const StoredRecording recording{.sha256 = "a", .name = "drive.pcapng"};
    isStored =
        store->finishRecording(recording, measurer.series(), watch->cells()) && store->commit();
    store.reset();
  }

  void add(const PacketBytes& packet) {
    const MeasuredMessage message{.time = now,
                                  .number = ++number,
                                  .technology = technology,
                                  .measured = measurer.measure(technology, packet.bytes())};
    watch->take(message);
    store->add(message, watch->cellValues());
  }
  void addAt(std::int64_t milliseconds, const PacketBytes& packet) {
    at(milliseconds);
    add(packet);
  }

  void drive() {
    addAt(0, lteCell(700, 14));
    add(lteServing(14, -90));
    store->add(now, {.latitude = 51.501, .longitude = -8.251});
    addAt(1'000, lteServing(14, -92));
    store->add(now, {.latitude = 51.502, .longitude = -8.252});
    addAt(2'000, lteConnected(14, -95, 15, -88));
    addAt(2'500, lteCell(800, 15));
    addAt(3'000, lteServing(15, -88));
    store->add(now, {.latitude = 51.531, .longitude = -8.252});
    addAt(4'000, lteServing(15, -96));
    addAt(5'000, lteConnected(15, -97, 14, -91));
    addAt(5'500, lteCell(700, 14));
    addAt(6'000, lteServing(14, -89));
    addAt(16'000, lteServing(14, -112));
    addAt(17'000, lteServing(14, -113));
    addAt(18'000, lteServing(14, -100));
  }

  [[nodiscard]] std::vector<std::string> rows(const std::string& query) const {
    return rowsOf(file.path(), query);
  }

  TemporaryFile file{"drive.sqlite"};
  std::unique_ptr<Store> store;
  bool isStored = false;
};

TEST_F(StoreQueriesTest, EveryQueryAnswersAsThePageSays) {
  ASSERT_TRUE(isStored);
  const std::vector<std::string> queries = documentedQueries();
  ASSERT_EQ(queries.size(), 10u);
  // Levels of the ten seconds: -113 -112 -100 -97 -96 -95 -92 -90 -89 -88.
  EXPECT_THAT(rows(queries[0]), ElementsAre("10|-113.0", "50|-96.0", "90|-89.0"));
  EXPECT_THAT(rows(queries[1]), ElementsAre("2023-11-14 22:13:25|700|800|3.0"));
  // 2.5 s, then 0.5 and 2 s around the gap; 3 s.
  EXPECT_THAT(rows(queries[2]), ElementsAre("LTE|700|5.0|62.5", "LTE|800|3.0|37.5"));
  EXPECT_THAT(rows(queries[3]), ElementsAre("2023-11-14 22:13:28|2023-11-14 22:13:37|-112.5|2"));
  EXPECT_THAT(rows(queries[4]), ElementsAre("LTE|handover|2"));
  EXPECT_THAT(rows(queries[5]), ElementsAre("1300/15|1|7.0", "700|1|6.0"));
  EXPECT_THAT(rows(queries[6]), ElementsAre("2023-11-14 22:13:26|10.0"));
  EXPECT_THAT(rows(queries[7]), ElementsAre("51.5|-8.25|-91.0|2", "51.53|-8.25|-88.0|1"));
  EXPECT_THAT(rows(queries[8]), ElementsAre("Measured RSRP < -110 dBm|1|2.0"));
  // 780 / 8 = 97.5.
  EXPECT_THAT(rows(queries[9]),
              Contains("Serving Cell Measurements|Measured RSRP||dBm|8|-113.0|-97.5|-88.0"));
}

TEST_F(StoreQueriesTest, ThePageNamesEveryColumn) {
  const std::string page = measurementsPage();
  const std::string described = page.substr(page.find("## The store"));
  for (const std::string& table :
       rows("SELECT name FROM sqlite_schema WHERE type IN ('table', 'view')")) {
    const std::size_t begin = described.find("**" + table + "**");
    ASSERT_NE(begin, std::string::npos) << table;
    const std::size_t end =
        std::min(described.find("\n**", begin), described.find("\n### ", begin));
    const std::string part = described.substr(begin, end - begin);
    const auto columns = rows("SELECT name FROM pragma_table_info('" + table + "')");
    EXPECT_FALSE(columns.empty());
    for (const std::string& column : columns) {
      EXPECT_THAT(part, HasSubstr("`" + column + "`")) << table;
    }
  }
}

}  // namespace
}  // namespace kestro::testing
