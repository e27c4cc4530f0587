// SPDX-License-Identifier: MIT
// Playing sources at their pace, on virtual time.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <deque>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "Platform/Virtual/VirtualMainQueue.h"
#include "TelephonyServer/Playback.h"

namespace kestro {
namespace {

using std::chrono::hours;
using std::chrono::milliseconds;
using std::chrono::seconds;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// What a scripted source yields: a time, a technology and a message, or what is set instead.
struct Scripted {
  std::optional<milliseconds> time;
  std::string message;
  std::string_view technology = "IFX";
  std::string error = {};
  std::optional<Moment> moment = std::nullopt;
};

class ScriptedSource : public LogSource {
 public:
  explicit ScriptedSource(std::vector<Scripted> script) : _script(std::move(script)) {}

  [[nodiscard]] std::string_view technology() const override { return "IFX"; }
  [[nodiscard]] Result<SourceStep> next() override {
    if (_waits) return SourceWaits{};
    if (_position == _script.size()) return SourceEnded{};
    const Scripted& step = _script[_position++];
    if (!step.error.empty()) return failure(step.error);
    _message.assign(step.message.begin(), step.message.end());
    return SourceEvent{.time = step.time,
                       .technology = step.technology,
                       .message = _message,
                       .moment = step.moment};
  }
  [[nodiscard]] Result<void> restart() override {
    ++restarts;
    if (!restartError.empty()) return failure(restartError);
    _position = 0;
    return {};
  }
  void setReadyHandler(std::function<void()> handler) override { _ready = std::move(handler); }

  /// As a live source: nothing until `give`.
  void wait() { _waits = true; }
  void give() {
    _waits = false;
    _ready();
  }

  int restarts = 0;
  std::string restartError;

 private:
  std::vector<Scripted> _script;
  std::size_t _position = 0;
  bool _waits = false;
  Bytes _message;
  std::function<void()> _ready;
};

class PlaybackTest : public ::testing::Test, public PlaybackListener {
 protected:
  void play(std::vector<Scripted> script, PlaybackOptions options = {}) {
    auto source = std::make_unique<ScriptedSource>(std::move(script));
    _source = source.get();
    _playback =
        std::make_unique<Playback>(std::move(source), options, _queue, _clock, *this,
                                   [this](std::string_view line) { _lines.emplace_back(line); });
    _playback->start();
  }

  void technologyChanged(std::string_view technology) override { note(std::string(technology)); }
  void messageDue(ByteView message, Moment time) override {
    note(std::string(message.begin(), message.end()));
    _times.push_back(time);
  }
  void sourceEnded() override { ++_ends; }
  void note(const std::string& what) {
    _heard.push_back(std::to_string(_queue.elapsed() / milliseconds(1)) + " " + what);
  }
  std::vector<std::string> take() { return std::exchange(_heard, {}); }

  VirtualClock _clock;
  VirtualMainQueue _queue{_clock};
  ScriptedSource* _source = nullptr;
  std::unique_ptr<Playback> _playback;
  std::vector<std::string> _heard;
  std::vector<Moment> _times;
  int _ends = 0;
  std::vector<std::string> _lines;
};

TEST_F(PlaybackTest, HandsOverEachMessageWhenItIsDue) {
  play({{milliseconds(0), "a"}, {milliseconds(250), "b"}, {milliseconds(3'000), "c"}});
  EXPECT_THAT(take(), IsEmpty());
  _queue.advance(milliseconds(249));
  EXPECT_THAT(take(), ElementsAre("0 a"));
  _queue.advance(milliseconds(1));
  EXPECT_THAT(take(), ElementsAre("250 b"));
  _queue.advance(seconds(5));
  EXPECT_THAT(take(), ElementsAre("3000 c"));
}

TEST_F(PlaybackTest, TellsWhenTheSourceHadEachMessageAndElseTheTimeItIs) {
  const Moment recorded(seconds(1'330'862'709));
  _clock.setNow(Moment(seconds(1'400'000'000)));
  play({{.time = milliseconds(0), .message = "a", .moment = recorded},
        {.time = milliseconds(250), .message = "b"}});
  _queue.advance(seconds(1));
  EXPECT_THAT(_times, ElementsAre(recorded, Moment(milliseconds(1'400'000'000'250))));
}

TEST_F(PlaybackTest, TellsOnceThatTheSourceHasEnded) {
  play({{milliseconds(0), "a"}});
  EXPECT_EQ(_ends, 0);
  _queue.advance(seconds(5));
  EXPECT_EQ(_ends, 1);
}

TEST_F(PlaybackTest, ASourceThatBeginsAgainHasNotEndedUnlessThatFails) {
  play({{milliseconds(0), "a"}}, {.loop = true});
  _queue.advance(milliseconds(500));
  EXPECT_EQ(_ends, 0);
  _source->restartError = "no more";
  _queue.advance(seconds(5));
  EXPECT_EQ(_ends, 1);
}

TEST_F(PlaybackTest, AHigherSpeedShortensThePauses) {
  play({{milliseconds(0), "a"}, {milliseconds(1'000), "b"}, {milliseconds(60'000), "c"}},
       {.speed = 50});
  _queue.advance(seconds(5));
  EXPECT_THAT(take(), ElementsAre("0 a", "20 b", "1200 c"));
}

TEST_F(PlaybackTest, ALowerSpeedLengthensThePauses) {
  play({{milliseconds(0), "a"}, {milliseconds(1'000), "b"}}, {.speed = 0.25});
  _queue.advance(seconds(5));
  EXPECT_THAT(take(), ElementsAre("0 a", "4000 b"));
}

TEST_F(PlaybackTest, TellsOfAChangeOfTechnologyBeforeItsFirstMessage) {
  play({{milliseconds(0), "a"}, {milliseconds(10), "b", "LTE"}, {milliseconds(20), "c", "LTE"}});
  _queue.advance(seconds(1));
  EXPECT_THAT(take(), ElementsAre("0 a", "10 LTE", "10 b", "20 c"));
}

TEST_F(PlaybackTest, AnEventWithoutMessageChangesTheTechnologyOnly) {
  play({{milliseconds(5), "", "LTE"}, {milliseconds(9), "a", "LTE"}});
  _queue.advance(seconds(1));
  EXPECT_THAT(take(), ElementsAre("5 LTE", "9 a"));
}

TEST_F(PlaybackTest, TheEndIsReportedAndNothingMoreComes) {
  play({{milliseconds(0), "a"}});
  _queue.advance(hours(1));
  EXPECT_THAT(take(), ElementsAre("0 a"));
  EXPECT_THAT(_lines, ElementsAre("the source has ended after 1 messages; clients stay connected"));
  EXPECT_EQ(_queue.pending(), 0U);
}

TEST_F(PlaybackTest, AnErrorIsReportedAfterWhatCameBefore) {
  play({{milliseconds(0), "a"}, {milliseconds(0), "", "IFX", "the file is cut"}});
  _queue.advance(seconds(10));
  EXPECT_THAT(take(), ElementsAre("0 a"));
  EXPECT_THAT(_lines, ElementsAre("the file is cut",
                                  "the source has ended after 1 messages; clients stay connected"));
}

TEST_F(PlaybackTest, ALoopBeginsAgainASecondAfterTheEnd) {
  play({{milliseconds(0), "a"}, {milliseconds(100), "b"}}, {.speed = 1, .loop = true});
  _queue.advance(milliseconds(2'500));
  EXPECT_THAT(take(), ElementsAre("0 a", "100 b", "1100 a", "1200 b", "2200 a", "2300 b"));
  EXPECT_THAT(_lines, IsEmpty());
}

TEST_F(PlaybackTest, ALoopGoesBackToTheFirstTechnology) {
  play({{milliseconds(0), "a"}, {milliseconds(100), "b", "LTE"}}, {.speed = 1, .loop = true});
  _queue.advance(milliseconds(1'100));
  EXPECT_THAT(take(), ElementsAre("0 a", "100 LTE", "100 b", "1100 IFX", "1100 a"));
}

TEST_F(PlaybackTest, ALoopOverNothingEnds) {
  play({}, {.speed = 1, .loop = true});
  _queue.advance(hours(1));
  EXPECT_EQ(_source->restarts, 0);
  EXPECT_THAT(_lines, ElementsAre("the source has ended after 0 messages; clients stay connected"));
}

TEST_F(PlaybackTest, ASourceThatCannotBeginAgainEndsTheLoop) {
  play({{milliseconds(0), "a"}}, {.speed = 1, .loop = true});
  _source->restartError = "the file is gone";
  _queue.advance(hours(1));
  EXPECT_EQ(_source->restarts, 1);
  EXPECT_THAT(_lines, ElementsAre("the file is gone"));
  EXPECT_EQ(_queue.pending(), 0U);
}

TEST_F(PlaybackTest, WhatComesFromALiveSourceIsHandedOverAtOnce) {
  play({{std::nullopt, "a"}, {std::nullopt, "b"}});
  _source->wait();
  _queue.advance(seconds(7));
  EXPECT_THAT(take(), IsEmpty());
  _source->give();
  EXPECT_THAT(take(), ElementsAre("7000 a", "7000 b"));
}

TEST_F(PlaybackTest, ABurstLeavesTheMainThreadToOthersInBetween) {
  std::vector<Scripted> burst(1'000, {milliseconds(0), "x"});
  play(burst);
  _queue.runReady();
  EXPECT_EQ(take().size(), 256U);
  _queue.advance(milliseconds(1));
  EXPECT_EQ(take().size(), 256U);
  _queue.advance(milliseconds(2));
  EXPECT_EQ(take().size(), 1'000U - 2 * 256U);
}

TEST_F(PlaybackTest, ABurstOfLongMessagesIsCutSooner) {
  play(std::vector<Scripted>(10, {milliseconds(0), std::string(400'000, 'x')}));
  _queue.runReady();
  EXPECT_EQ(take().size(), 3U);
}

TEST_F(PlaybackTest, AClockSetBackDelaysByASecondAtMost) {
  play({{milliseconds(0), "a"}, {milliseconds(10'000), "b"}});
  _queue.advance(milliseconds(4'500));
  _clock.setNow(_clock.now() - hours(5));
  _queue.advance(milliseconds(5'500));
  EXPECT_THAT(take(), ElementsAre("0 a"));
  _queue.advance(milliseconds(1'000));
  EXPECT_EQ(take().size(), 1U);
}

TEST_F(PlaybackTest, AClockSetForwardSkipsTenSecondsAtMost) {
  play({{milliseconds(0), "a"}, {milliseconds(12'000), "b"}});
  _queue.advance(milliseconds(500));
  _clock.setNow(_clock.now() + hours(5));
  _queue.advance(milliseconds(500));
  EXPECT_THAT(take(), ElementsAre("0 a"));
  _queue.advance(milliseconds(1'500));
  EXPECT_EQ(take().size(), 1U);
}

TEST_F(PlaybackTest, ALongPauseIsAnnouncedOnce) {
  play({{milliseconds(0), "a"}, {milliseconds(90'000), "b"}, {milliseconds(91'000), "c"}});
  _queue.advance(seconds(80));
  EXPECT_THAT(_lines, ElementsAre("the source pauses: its next message is due in 90 s"));
  _queue.advance(seconds(20));
  EXPECT_THAT(take(), ElementsAre("0 a", "90000 b", "91000 c"));
  EXPECT_EQ(_lines.size(), 2U);  // the other one reports the end
}

TEST_F(PlaybackTest, NothingIsHandedOverAfterItsEnd) {
  play({{milliseconds(0), "a"}, {milliseconds(100), "b"}});
  _queue.advance(milliseconds(50));
  _playback.reset();
  _queue.advance(seconds(1));
  EXPECT_THAT(take(), ElementsAre("0 a"));
}

}  // namespace
}  // namespace kestro
