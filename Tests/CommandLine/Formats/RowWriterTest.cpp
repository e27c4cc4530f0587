// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "CommandLine/Formats/CellRows.h"
#include "CommandLine/Formats/RowTable.h"
#include "CommandLine/Formats/RowWriter.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

constexpr RowColumn kSampleColumns[] = {
    {"name", "Name"}, {"hidden", ""}, {"level", "Level"}, {"empty", "Empty"}, {"count", "No."}};

using RowFields = std::vector<RowField>;

std::string written(std::string_view format, const std::vector<RowFields>& rows) {
  const testing::TemporaryFile file;
  auto output = Output::create(file.path());
  const auto writer = makeRowWriter(format, *output);
  writer->begin(kSampleColumns);
  for (const RowFields& row : rows) writer->row(row);
  writer->finish();
  output->flush();
  return file.contents();
}

const std::vector<RowFields> kSampleRows = {
    {std::string("a,\"b\""), std::int64_t{1}, -88.25, {}, std::int64_t{7}},
    {std::string("c"), {}, {}, {}, std::int64_t{12}},
};

TEST(RowWriter, CsvHasAllColumnsAndQuotesWhatNeedsIt) {
  EXPECT_EQ(written("csv", kSampleRows),
            "name,hidden,level,empty,count\n"
            "\"a,\"\"b\"\"\",1,-88.25,,7\n"
            "c,,,,12\n");
}

TEST(RowWriter, JsonIsAnArrayWithAnObjectARow) {
  EXPECT_EQ(nlohmann::json::parse(written("json", kSampleRows)),
            nlohmann::json::parse(R"([{"name":"a,\"b\"","hidden":1,"level":-88.25,"count":7},
                                      {"name":"c","count":12}])"));
  EXPECT_EQ(nlohmann::json::parse(written("json", {})), nlohmann::json::array());
}

TEST(RowWriter, TableLeavesOutWhatIsEmptyOrHasNoHeading) {
  EXPECT_EQ(written("table", kSampleRows),
            "Name    Level  No.\n"
            "a,\"b\"  -88.25    7\n"
            "c               12\n");
  EXPECT_EQ(written("table", {}), "");
}

TEST(RowWriter, TableShowsNoControlCharacters) {
  EXPECT_EQ(written("table", {{std::string("x\x1b[2J"), {}, {}, {}, {}}}),
            "Name\nx\xE2\x90\x9B[2J\n");
}

TEST(RowWriter, TableWritesRowsBeforeTheEnd) {
  const testing::TemporaryFile file;
  auto output = Output::create(file.path());
  RowTable table(*output);
  table.begin(kSampleColumns);
  for (std::size_t i = 0; i <= RowTable::kRowsThatCount; ++i) {
    table.row(RowFields{std::string("row"), {}, {}, {}, std::int64_t{5}});
  }
  output->flush();
  EXPECT_EQ(std::ranges::count(file.contents(), '\n'), 1 + 1'001);
}

TEST(CellRows, ACellAndAnEventHaveAFieldForEveryColumn) {
  EXPECT_EQ(fieldsOfCell(Cell{}, "").size(), cellColumns().size());
  EXPECT_EQ(fieldsOfEvent(Event{}, "").size(), eventColumns().size());
  EXPECT_EQ(fieldsOfEvent(Event{}, "a.pcap").back(), RowField(std::string("a.pcap")));
}

}  // namespace
}  // namespace kestro
