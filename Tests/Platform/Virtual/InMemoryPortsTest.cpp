// SPDX-License-Identifier: MIT
// What tests that run on in-memory ports may rely on.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Platform/Virtual/InMemoryPorts.h"
#include "Platform/Virtual/VirtualMainQueue.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;

class InMemoryPortsTest : public ::testing::Test {
 protected:
  VirtualClock clock;
  VirtualMainQueue queue{clock};
  InMemoryPorts ports{queue};
  std::vector<std::string> messages;
  std::shared_ptr<LocalPort> local =
      ports.createLocalPort("A", [this](std::int32_t, ByteView message) -> std::optional<Bytes> {
        messages.emplace_back(message.begin(), message.end());
        return Bytes{'y'};
      });
  std::shared_ptr<RemotePort> remote = ports.createRemotePort("A");
};

TEST_F(InMemoryPortsTest, ARequestThatIsAnsweredTakesNoTime) {
  EXPECT_EQ(remote->request(0, {}, 1s, 1s).data, Bytes{'y'});
  EXPECT_EQ(queue.elapsed(), 0s);
}

TEST_F(InMemoryPortsTest, AStalledReceiverDoesNotAnswerInTime) {
  ports.setStalled("A", true);
  EXPECT_EQ(remote->request(0, {}, 1s, 3s).error, SendError::ReceiveTimeout);
  EXPECT_EQ(queue.elapsed(), 3s);
  EXPECT_TRUE(remote->isValid());
}

TEST_F(InMemoryPortsTest, AReplyInTimeIsTakenAndALateOneIsNot) {
  ports.failures().replyDelay = 3s;
  EXPECT_EQ(remote->request(0, {}, 1s, 3s).data, Bytes{'y'});
  EXPECT_EQ(queue.elapsed(), 3s);
  ports.failures().replyDelay = 3s + 1ns;
  EXPECT_EQ(remote->request(0, {}, 1s, 3s).error, SendError::ReceiveTimeout);
  EXPECT_EQ(queue.elapsed(), 6s);
}

TEST_F(InMemoryPortsTest, ASendThatIsNotTakenWaitsAndLeavesTheConnection) {
  ports.setStalled("A", true);
  EXPECT_EQ(remote->post(0, Bytes(4 * 1024 * 1024)), SendError::None);
  EXPECT_EQ(remote->send(0, Bytes(1), 2s), SendError::SendTimeout);
  EXPECT_EQ(queue.elapsed(), 2s);
  EXPECT_TRUE(remote->isValid());
  EXPECT_EQ(remote->post(0, Bytes(1)), SendError::Transport);
  EXPECT_FALSE(remote->isValid());
}

TEST_F(InMemoryPortsTest, TimeoutsThatAreAskedForTakeTheirTime) {
  ports.failures().send = SendError::SendTimeout;
  EXPECT_EQ(remote->send(0, {}, 2s), SendError::SendTimeout);
  EXPECT_EQ(queue.elapsed(), 2s);
  ports.failures().request = RemotePort::Reply{SendError::SendTimeout, {}};
  EXPECT_EQ(remote->request(0, {}, 3s, 9s).error, SendError::SendTimeout);
  EXPECT_EQ(queue.elapsed(), 5s);
  ports.failures().request = RemotePort::Reply{SendError::ReceiveTimeout, {}};
  EXPECT_EQ(remote->request(0, {}, 9s, 4s).error, SendError::ReceiveTimeout);
  EXPECT_EQ(queue.elapsed(), 9s);
}

TEST_F(InMemoryPortsTest, PortsTellOfWhichProcessTheyAre) {
  const auto other = ports.portsOf(7);
  const auto mine =
      ports.createLocalPort("Mine", [](std::int32_t, ByteView) { return std::optional<Bytes>(); });
  std::vector<ProcessNumber> senders;
  std::shared_ptr<LocalPort> others;
  others = other->createLocalPort("Others", [&](std::int32_t, ByteView) -> std::optional<Bytes> {
    senders.push_back(others->sender());
    return std::nullopt;
  });
  EXPECT_EQ(other->createRemotePort("Mine")->owner(), InMemoryPorts::kOwnProcess);
  EXPECT_EQ(ports.createRemotePort("Others")->owner(), 7);
  static_cast<void>(ports.createRemotePort("Others")->request(0, {}, 1s, 1s));
  static_cast<void>(other->createRemotePort("Others")->post(0, {}));
  queue.runReady();
  EXPECT_THAT(senders, ElementsAre(InMemoryPorts::kOwnProcess, 7));
  EXPECT_EQ(others->sender(), kUnknownProcess);
}

TEST_F(InMemoryPortsTest, NothingRunsWhileARequestWaits) {
  std::vector<std::string> events;
  queue.postAfter(1s, [&] { events.emplace_back("block"); });
  const auto timer = queue.scheduleRepeating(2s, [&] { events.emplace_back("tick"); });
  ports.setStalled("A", true);
  static_cast<void>(remote->request(0, {}, 0s, 7s));
  EXPECT_THAT(events, ElementsAre());
  queue.runReady();
  EXPECT_THAT(events, ElementsAre("block", "tick"));
  queue.advance(2s);  // ticks that were missed are not made up for
  EXPECT_THAT(events, ElementsAre("block", "tick", "tick"));
}

}  // namespace
}  // namespace kestro
