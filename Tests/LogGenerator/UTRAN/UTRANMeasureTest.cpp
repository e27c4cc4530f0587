// SPDX-License-Identifier: MIT
// What the UTRAN packets say as numbers.
#include "LogGenerator/Ondrel/CellMonitor.h"
#include "Platform/TelephonyService.h"
#include "Tests/Support/MeasureFixture.h"

namespace kestro::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class UTRANMeasureTest : public MeasureFixture {
 protected:
  UTRANMeasureTest() : MeasureFixture(kTqLogChannelTechnology_Ondrel_UTRAN2) {}
};

TEST_F(UTRANMeasureTest, AModeThatIsNotValidIsNone) {
  EXPECT_THAT(lines(packet(0xD0E0).u8(13, 1).u8(14, 3).length(15)),
              ElementsAre("RRC Info/State 3|Cell DCH"));
  EXPECT_THAT(lines(packet(0xD0E0).u8(13, 0).u8(14, 3).length(15)), IsEmpty());
  EXPECT_THAT(lines(packet(0xD0E0)), IsEmpty());
}

TEST_F(UTRANMeasureTest, EachElementOfAnArrayIsASeries) {
  const auto channels = packet(0xD00C).u8(15, 0x10).length(289).u8(289, 7).u8(290, 2).u8(296, 55);
  EXPECT_THAT(lines(channels), Contains("CCTRCH SIR/SIR 5 [7/2] 55|55"));
  EXPECT_THAT(lines(channels), Contains("CCTRCH SIR/SIR 0 [7/2] 0|0"));
}

TEST_F(UTRANMeasureTest, RowsThatTheDisplayDropsSayNothing) {
  EXPECT_THAT(lines(packet(0xD00E).u8(16, 1).length(25, 0x11)), IsEmpty());
}

TEST_F(UTRANMeasureTest, OfSeveralServingCellsTheLastNumbersCount) {
  const auto cell = [](std::string_view key, int number) {
    return Dictionary{
        {kTqCellMonitorCellRadioAccessTechnology, kTqCellMonitorRadioAccessTechnologyUTRAN2},
        {kTqCellMonitorCellType, kTqCellMonitorCellTypeServing},
        {key, Value::integer(number)}};
  };
  const Array cells = {cell(kTqCellMonitorLAC, 1), cell(kTqCellMonitorLAC, 2),
                       cell(kTqCellMonitorCellId, 3)};
  EXPECT_THAT(
      linesOfList(kCellMonitorCode, cells),
      ElementsAre("Serving Cell Info/Local Area Code 2|2", "Serving Cell Info/Cell ID 3|3"));
}

}  // namespace
}  // namespace kestro::testing
