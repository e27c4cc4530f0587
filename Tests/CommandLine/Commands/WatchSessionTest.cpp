// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CommandLine/Commands/WatchSession.h"
#include "LogGenerator/InternalConsistencyFailure.h"
#include "Tests/Support/ModelFixture.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// Keeps what it is told to show: "=" for a refresh, "-" for a change.
class RecordingView : public WatchView {
 public:
  void refreshed(const WatchState& state) override {
    shown.push_back("= " + state.status + " | " + valueOf(state.previous) + " > " +
                    valueOf(state.tree));
  }
  void changed(const WatchState& state) override {
    shown.push_back("- " + state.status + " | " + valueOf(state.tree));
  }
  [[nodiscard]] std::string_view failureMessage() const override { return failure; }

  std::vector<std::string> take() { return std::exchange(shown, {}); }

  std::vector<std::string> shown;
  std::string failure;

 private:
  static std::string valueOf(const NodePointer& tree) {
    return tree == nullptr ? "none" : *tree->childNodes()->front()->value();
  }
};

class WatchSessionTest : public testing::ModelFixture {
 protected:
  WatchSessionTest() {
    platform.clock().setNow(Moment(1'330'866'000s));  // 2012-03-04 13:00:00 UTC
  }

  void start(std::optional<std::uint64_t> limit = std::nullopt) {
    session.emplace(platform, view, limit, [this] { ++ends; });
    session->start();
  }
  void sendValue(std::string_view value) { sendLog(Dictionary{{"k", value}}); }

  RecordingView view;
  std::optional<WatchSession> session;
  int ends = 0;
};

TEST_F(WatchSessionTest, ConnectsAndShowsTheDataOfEachTick) {
  start();
  EXPECT_THAT(view.take(), ElementsAre("- Connecting... | none"));
  sendValue("1");
  queue().advance(2s);
  EXPECT_THAT(view.take(), ElementsAre("= Updated 2012-03-04 at 13:00:02 | none > 1"));
  sendValue("2");
  queue().advance(2s);
  EXPECT_THAT(view.take(), ElementsAre("= Updated 2012-03-04 at 13:00:04 | 1 > 2"));
}

TEST_F(WatchSessionTest, WithoutNewDataNothingIsShownAnew) {
  start();
  sendValue("1");
  queue().advance(2s);
  view.take();
  queue().advance(60s);
  EXPECT_THAT(view.take(), IsEmpty());
}

TEST_F(WatchSessionTest, ALostConnectionShowsWithoutNewDataAndKeepsTheDisplay) {
  start();
  sendValue("1");
  queue().advance(2s);
  view.take();
  loseServer();
  queue().advance(2s);
  EXPECT_THAT(view.take(), ElementsAre("- Connecting... | 1"));
}

TEST_F(WatchSessionTest, AfterReconnectingTheOldUpdateShowsUntilNewData) {
  start();
  sendValue("1");
  queue().advance(2s);
  loseServer();
  queue().advance(3s);
  view.take();
  bringServerBack();
  queue().advance(5s);
  EXPECT_THAT(view.take(), ElementsAre("- Updated 2012-03-04 at 13:00:02 | 1"));
  sendValue("2");
  queue().advance(2s);
  EXPECT_THAT(view.take(), ElementsAre(::testing::EndsWith("| 1 > 2")));
}

TEST_F(WatchSessionTest, AConnectionThatIsReplacedAtOnceShowsNoChange) {
  start();
  sendValue("1");
  queue().advance(2s);
  view.take();
  channel->invalidate();
  openChannel();
  queue().advance(2s);
  EXPECT_THAT(channelRequests, ::testing::SizeIs(2));
  EXPECT_THAT(view.take(), IsEmpty());
}

TEST_F(WatchSessionTest, ATechnologyThatNobodyDecodesKeepsTheDisplay) {
  start();
  sendValue("1");
  queue().advance(2s);
  view.take();
  sendValue("2");
  answerTechnology("Another");
  channel.reset();
  openChannel();
  queue().advance(2s);
  EXPECT_THAT(view.take(), ElementsAre("- Connecting... | 1"));
}

TEST_F(WatchSessionTest, WithoutAServerItGoesOnConnecting) {
  platform.telephonyService().setReachable(false);
  start();
  queue().advance(60s);
  EXPECT_THAT(view.take(), ElementsAre("- Connecting... | none"));
}

TEST_F(WatchSessionTest, EndsAfterItsCountOfRefreshes) {
  start(2);
  for (const char* value : {"1", "2", "3"}) {
    sendValue(value);
    queue().advance(2s);
  }
  EXPECT_EQ(ends, 1);
  EXPECT_THAT(view.take(),
              ElementsAre("- Connecting... | none", "= Updated 2012-03-04 at 13:00:02 | none > 1",
                          "= Updated 2012-03-04 at 13:00:04 | 1 > 2"));
}

TEST_F(WatchSessionTest, EndsWhenTheViewFails) {
  start();
  view.failure = "full";
  sendValue("1");
  queue().advance(10s);
  EXPECT_EQ(ends, 1);
}

TEST_F(WatchSessionTest, ARedrawShowsTheSameAgain) {
  start();
  sendValue("1");
  queue().advance(2s);
  view.take();
  session->redraw();
  EXPECT_THAT(view.take(), ElementsAre("- Updated 2012-03-04 at 13:00:02 | 1"));
}

TEST_F(WatchSessionTest, AFailureOfTheGeneratorPassesThrough) {
  start();
  const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
  ASSERT_EQ(port->post(0, testing::bytesOf("garbage")), SendError::None);
  EXPECT_THROW(queue().runReady(), InternalConsistencyFailure);
}

TEST_F(WatchSessionTest, AQueuedRedrawThatOutlivesItTouchesNothing) {
  start();
  sendValue("1");
  view.take();
  platform.telephonyService().notify();
  session.reset();
  queue().runReady();
  EXPECT_THAT(view.take(), IsEmpty());
}

TEST_F(WatchSessionTest, ARetryThatOutlivesItEndsWithoutAChannel) {
  platform.telephonyService().setReachable(false);
  start();
  session.reset();
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_THAT(platform.messagePorts().names(), ElementsAre("Channel"));
}

/// Keeps what it is told of the display's origin.
class OriginView : public RecordingView {
 public:
  void noticed(const WatchState& state) override {
    origins.push_back(state.technology + "|" + state.source + "|" + state.notice + "|" +
                      (state.isRenewed ? "renewed" : "kept"));
  }
  std::vector<std::string> origins;
};

class WatchOriginTest : public WatchSessionTest {
 protected:
  void start() {
    session.emplace(
        platform, originView, std::nullopt, [] {}, "Other");
    session->start();
  }
  std::string lastOrigin() { return originView.origins.empty() ? "" : originView.origins.back(); }

  OriginView originView;
};

TEST_F(WatchOriginTest, TellsTheTechnologyAndTheSource) {
  channelReply.source = {.kind = "capture", .name = "/x/a.pcap", .isSimulated = false};
  start();
  EXPECT_EQ(lastOrigin(), "IFX|capture a.pcap||renewed");
}

TEST_F(WatchOriginTest, TellsThatTheSourceHasEnded) {
  channelReply.source = {.kind = "capture", .name = "/x/a.pcap"};
  start();
  LogSourceState ended = channelReply.source;
  ended.hasEnded = true;
  platform.telephonyService().notifySource(ended);
  EXPECT_EQ(lastOrigin(), "IFX|capture a.pcap|the recording has ended|kept");
}

TEST_F(WatchOriginTest, TellsWhatIsMissingAfterTheFirstAttempt) {
  platform.telephonyService().setReachable(false);
  start();
  EXPECT_EQ(lastOrigin(),
            "||no telephony server \"Other\" is running: start kestro-telephonyd --name=Other, or "
            "use --demo|kept");
  originView.origins.clear();
  queue().advance(60s);
  EXPECT_THAT(originView.origins, IsEmpty());
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_EQ(lastOrigin(), "IFX|||renewed");
}

TEST_F(WatchOriginTest, ALostConnectionKeepsTheOriginAndRenewsNothing) {
  channelReply.source = {.kind = "simulation", .isSimulated = true};
  start();
  loseServer();
  queue().advance(2s);
  EXPECT_THAT(lastOrigin(), ::testing::StartsWith("IFX|simulation|no telephony server"));
  EXPECT_THAT(lastOrigin(), ::testing::EndsWith("|kept"));
}

}  // namespace
}  // namespace kestro
