// SPDX-License-Identifier: MIT
// What an hour of updates leaves behind: nothing.
#include <gtest/gtest.h>
#include <malloc.h>

#include "Tests/App/AppFixture.h"

namespace kestro {
namespace {

class MemoryTest : public testing::AppFixture {
 protected:
  /// So many refreshes, each with another value, served and painted.
  void pass(int refreshes) {
    for (int i = 0; i < refreshes; ++i) {
      const std::string level = "-" + std::to_string(70 + i % 30) + ".25 dBm";
      show(Dictionary{{"Serving", Dictionary{{"RSCP", level}, {"Band", "1"}}},
                      {"Cells", Array{"header", Dictionary{{"ARFCN", "62"}, {"RxLev", level}}}}});
      QCoreApplication::processEvents();
      static_cast<void>(platform.systemLog().take());
      commands.clear();
    }
  }
  static std::size_t heapInUse() { return ::mallinfo2().uordblks; }
};

TEST_F(MemoryTest, AnHourOfUpdatesLeavesNothingBehind) {
  constexpr int kHour = 60 * 60 / 2;
  constexpr std::size_t kTolerance = 64 * 1024;  // caches that fill up as they please
  launchConnected();
  pass(200);
  open(0);
  pass(200);
  const std::size_t before = heapInUse();
  pass(kHour);
  EXPECT_LT(heapInUse(), before + kTolerance);
}

}  // namespace
}  // namespace kestro
