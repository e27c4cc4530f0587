// SPDX-License-Identifier: MIT
// What the model tells of its source and of attempts to connect that have failed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Tests/Support/ModelFixture.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;

class KestroModelNewsTest : public testing::ModelFixture {
 protected:
  KestroModelNewsTest() {
    model->setNewsHandler([this] { ++news; });
  }
  int news = 0;
};

TEST_F(KestroModelNewsTest, TheSourceIsWhatTheServerSays) {
  channelReply.source = {.kind = "capture", .name = "a.pcap", .hasEnded = false};
  model->startMonitor();
  EXPECT_EQ(model->source(), channelReply.source);
  EXPECT_EQ(model->technology(), "IFX");
  news = 0;
  LogSourceState ended = channelReply.source;
  ended.hasEnded = true;
  platform.telephonyService().notifySource(ended);
  EXPECT_EQ(model->source(), ended);
  EXPECT_EQ(news, 1);
  platform.telephonyService().notifySource(ended);
  EXPECT_EQ(news, 1);
}

TEST_F(KestroModelNewsTest, WithoutAServerThatIsTheProblem) {
  platform.telephonyService().setReachable(false);
  model->startMonitor();
  EXPECT_EQ(model->problem(), ConnectionProblem{ConnectionProblem::Kind::NoServer});
  EXPECT_EQ(news, 1);
  queue().advance(20s);
  EXPECT_EQ(news, 1);
  platform.telephonyService().setReachable(true);
  queue().advance(5s);
  EXPECT_EQ(model->problem(), std::nullopt);
  EXPECT_GT(news, 1);
}

TEST_F(KestroModelNewsTest, AnUnusablePortDirectoryIsTheProblem) {
  platform.telephonyService().setReachable(false);
  platform.messagePorts().setProblem("port directory /x: its mode is 0755");
  model->startMonitor();
  EXPECT_EQ(model->problem(), (ConnectionProblem{ConnectionProblem::Kind::Ports,
                                                 "port directory /x: its mode is 0755"}));
}

TEST_F(KestroModelNewsTest, ARefusedChannelIsTheProblem) {
  channelReply = {3, std::nullopt};
  model->startMonitor();
  EXPECT_EQ(model->problem(), (ConnectionProblem{ConnectionProblem::Kind::NoChannel, "3"}));
}

TEST_F(KestroModelNewsTest, AnUnknownTechnologyIsTheProblem) {
  answerTechnology("Semaphore");
  model->startMonitor();
  EXPECT_EQ(model->problem(),
            (ConnectionProblem{ConnectionProblem::Kind::Technology, "Semaphore"}));
  EXPECT_EQ(model->technology(), "");
}

TEST_F(KestroModelNewsTest, AServerThatDoesNotSayWhatItSpeaksIsTheProblem) {
  technologyReply.reset();
  model->startMonitor();
  EXPECT_EQ(model->problem(), ConnectionProblem{ConnectionProblem::Kind::NoAnswer});
}

TEST_F(KestroModelNewsTest, NobodyIsToldOfAModelThatIsGone) {
  model->startMonitor();
  news = 0;
  model.reset();
  platform.telephonyService().notifySource({.kind = "stream"});
  queue().advance(10s);
  EXPECT_EQ(news, 0);
}

}  // namespace
}  // namespace kestro
