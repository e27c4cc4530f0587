// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "LogGenerator/InternalConsistencyFailure.h"
#include "Model/Replay.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// Shows the last messages' texts; "!" ends the application.
class EchoGenerator : public LogGenerator {
 public:
  explicit EchoGenerator(const GeneratorServices& services) : LogGenerator(services) {}

  void updateStateWithData(Dictionary& state, ByteView data) override {
    const std::string text(data.begin(), data.end());
    if (text == "!") throw InternalConsistencyFailure("No good", "Echo", 7);
    if (text == "?") throw 42;
    state.set(kStateDisplay, text);
    state.set("All", std::string(state["All"].isText() ? state["All"].text() : "") + text);
  }
  Value generateLogUsingState(Dictionary& state) override { return state[kStateDisplay]; }
  [[nodiscard]] Dictionary getStartCommand() const override { return {}; }
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary&) override { return {}; }
};

class ReplayTest : public ::testing::Test {
 protected:
  void start(const ReplayOptions& options) {
    replay = std::make_unique<Replay>(
        [this](std::string_view technology) {
          made.emplace_back(technology);
          return technology == "none"
                     ? nullptr
                     : std::make_unique<EchoGenerator>(generatorServices(platform));
        },
        clock, options,
        [this](const ReplayRefresh& r) {
          const auto time = std::chrono::duration_cast<std::chrono::milliseconds>(r.time - kStart);
          EXPECT_EQ(clock.now(), r.time);
          EXPECT_EQ(r.technology, made.back());
          refreshes.push_back(std::to_string(time.count()) + " " + std::to_string(r.message) + " " +
                              std::string(r.display.text()));
        });
  }

  Result<void> feed(std::chrono::milliseconds time, std::string_view text,
                    std::string_view technology = "echo") {
    const Bytes bytes(text.begin(), text.end());
    return replay->feed(
        {.number = ++number, .time = kStart + time, .technology = technology, .bytes = bytes});
  }

  static constexpr Moment kStart{1'330'866'309'000'000us};

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  ReplayClock clock{platform.clock()};
  std::unique_ptr<Replay> replay;
  std::uint64_t number = 0;
  std::vector<std::string> made;       ///< technologies that a generator was asked for
  std::vector<std::string> refreshes;  ///< "milliseconds message display"
};

TEST_F(ReplayTest, RefreshesEveryTwoSecondsOfTheRecording) {
  start({});
  for (const int second : {0, 1, 2, 3, 4}) {
    EXPECT_TRUE(feed(second * 1s, "at " + std::to_string(second)));
  }
  EXPECT_THAT(refreshes, ElementsAre("2000 2 at 1", "4000 4 at 3"));
}

TEST_F(ReplayTest, FinishRefreshesWhatIsLeft) {
  start({});
  EXPECT_TRUE(feed(0ms, "a"));
  EXPECT_TRUE(feed(500ms, "b"));
  replay->finish();
  EXPECT_THAT(refreshes, ElementsAre("500 2 b"));
  EXPECT_EQ(replay->display(), Value("b"));
}

TEST_F(ReplayTest, FinishWithoutNewMessagesDoesNothing) {
  start({.refreshInterval = 0us});
  EXPECT_TRUE(feed(0ms, "a"));
  replay->finish();
  EXPECT_THAT(refreshes, ElementsAre("0 1 a"));
}

TEST_F(ReplayTest, AnIntervalOfZeroRefreshesAfterEveryMessage) {
  start({.refreshInterval = 0us});
  EXPECT_TRUE(feed(0ms, "a"));
  EXPECT_TRUE(feed(0ms, "b"));
  EXPECT_THAT(refreshes, ElementsAre("0 1 a", "0 2 b"));
}

TEST_F(ReplayTest, TicksWithoutMessagesRefreshNothing) {
  start({});
  EXPECT_TRUE(feed(0ms, "a"));
  EXPECT_TRUE(feed(9500ms, "b"));
  EXPECT_TRUE(feed(10s, "c"));
  EXPECT_THAT(refreshes, ElementsAre("2000 1 a", "10000 2 b"));
}

TEST_F(ReplayTest, RefreshesWhenTooManyBytesWereCollected) {
  start({.refreshBytes = 4});
  EXPECT_TRUE(feed(0ms, "abc"));
  EXPECT_TRUE(feed(1ms, "d"));
  EXPECT_TRUE(feed(2ms, "efg"));
  EXPECT_THAT(refreshes, ElementsAre("1 2 d"));
}

TEST_F(ReplayTest, TimeThatRunsBackwardsStartsTheTicksAnew) {
  start({});
  EXPECT_TRUE(feed(100s, "a"));
  EXPECT_TRUE(feed(1s, "b"));
  EXPECT_TRUE(feed(3s, "c"));
  EXPECT_THAT(refreshes, ElementsAre("3000 2 b"));
}

TEST_F(ReplayTest, AMessageThatEndsTheApplicationIsLeftOut) {
  start({});
  EXPECT_TRUE(feed(0ms, "a"));
  const auto outcome = feed(1ms, "!");
  ASSERT_FALSE(outcome);
  EXPECT_EQ(outcome.error().message, "No good (Echo, line 7)");
  replay->finish();
  EXPECT_THAT(refreshes, ElementsAre("1 1 a"));
}

TEST_F(ReplayTest, AMessageThatRaisesWhateverIsLeftOut) {
  start({});
  EXPECT_EQ(feed(0ms, "?").error().message, "an exception of unknown type");
  EXPECT_TRUE(feed(1ms, "b"));
  replay->finish();
  EXPECT_THAT(refreshes, ElementsAre("1 2 b"));
}

TEST_F(ReplayTest, WithoutMessagesThereIsNoDisplay) {
  start({});
  replay->finish();
  EXPECT_THAT(refreshes, IsEmpty());
  EXPECT_TRUE(replay->display().isNull());
}

TEST_F(ReplayTest, AnotherTechnologyStartsItsOwnDisplayAndItsOwnTicks) {
  start({});
  EXPECT_TRUE(feed(0s, "a"));
  EXPECT_TRUE(feed(1s, "b", "other"));  // what no tick has seen of "a" is gone
  EXPECT_TRUE(feed(2s, "c", "other"));
  EXPECT_TRUE(feed(3s, "d", "other"));  // 2 s after the change
  replay->finish();
  EXPECT_THAT(refreshes, ElementsAre("3000 3 c", "3000 4 d"));
  EXPECT_THAT(made, ElementsAre("echo", "other"));
}

TEST_F(ReplayTest, ATickBeforeTheChangeStillShowsTheOldDisplay) {
  start({});
  EXPECT_TRUE(feed(0s, "a"));
  EXPECT_TRUE(feed(2s, "b", "other"));
  replay->finish();
  // The tick of the old display is due when the change comes.
  EXPECT_THAT(refreshes, ElementsAre("2000 1 a", "2000 2 b"));
}

TEST_F(ReplayTest, AChangeTakesTheDisplayOutOfTheStateAndKeepsTheRest) {
  start({});
  EXPECT_TRUE(feed(0s, "a"));
  EXPECT_FALSE(feed(1s, "!", "other"));
  EXPECT_TRUE(replay->state()[kStateDisplay].isNull());
  EXPECT_EQ(replay->state()["All"], Value("a"));
}

TEST_F(ReplayTest, AMessageWithoutAGeneratorIsLeftOut) {
  start({});
  EXPECT_TRUE(feed(0s, "a"));
  EXPECT_EQ(feed(1s, "b", "none").error().message, "nothing here decodes the technology none");
  EXPECT_TRUE(feed(1s, "c"));
}

TEST_F(ReplayTest, BeginsWithAGeneratorWhereThereIsNoMessage) {
  start({});
  EXPECT_EQ(replay->generator(), nullptr);
  EXPECT_FALSE(replay->begin("none"));
  EXPECT_TRUE(replay->begin("echo"));
  EXPECT_NE(replay->generator(), nullptr);
  EXPECT_TRUE(feed(0s, "a"));
  EXPECT_THAT(made, ElementsAre("none", "echo"));
}

TEST_F(ReplayTest, TheClockKeepsTheZoneOfTheOtherOne) {
  platform.clock().setTimeZone(3600s, true);
  EXPECT_EQ(clock.timeZoneOffset(kStart), 3600s);
  EXPECT_TRUE(clock.isDaylightSaving(kStart));
}

}  // namespace
}  // namespace kestro
