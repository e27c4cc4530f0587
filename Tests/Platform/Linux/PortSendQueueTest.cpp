// SPDX-License-Identifier: MIT
#include <fcntl.h>
#include <sys/socket.h>

#include "Platform/Linux/PortSendQueue.h"
#include "Tests/Platform/Linux/PortFixture.h"

namespace kestro::testing {
namespace {

using FlushStatus = PortSendQueue::FlushStatus;

class PortSendQueueTest : public ::testing::Test {
 protected:
  PortSendQueueTest() {
    int pair[2] = {-1, -1};
    EXPECT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, pair), 0);
    _socket = FileDescriptor(pair[0]);
    EXPECT_EQ(::fcntl(_socket.get(), F_SETFL, O_NONBLOCK), 0);
    peer.emplace(FileDescriptor(pair[1]));
  }

  PortSendQueue::Position append(std::string_view body) {
    return queue.append({.kind = PortFrameKind::Message, .messageId = 1}, bytesOf(body));
  }
  FlushStatus flush() { return queue.flush(_socket.get()); }

  std::optional<RawPeer> peer;
  PortSendQueue queue;

 private:
  FileDescriptor _socket;
};

const std::string kLongBody(1024 * 1024, 'x');

TEST_F(PortSendQueueTest, WritesWhatWasQueuedInOrder) {
  append("one");
  append("two");
  EXPECT_EQ(queue.size(), 2 * (16 + 3));
  EXPECT_EQ(flush(), FlushStatus::Empty);
  EXPECT_TRUE(queue.empty());
  EXPECT_EQ(peer->receiveAvailable(), joined({frame(1, 1, 0, "one"), frame(1, 1, 0, "two")}));
}

TEST_F(PortSendQueueTest, WhatTheSystemDoesNotTakeWaits) {
  append(kLongBody);
  EXPECT_EQ(flush(), FlushStatus::Blocked);
  append("after");
  Bytes received;
  while (flush() == FlushStatus::Blocked) received = joined({received, peer->receiveAvailable()});
  received = joined({received, peer->receiveAvailable()});
  EXPECT_TRUE(received == joined({frame(1, 1, 0, kLongBody), frame(1, 1, 0, "after")}));
}

TEST_F(PortSendQueueTest, AFrameNotBegunCanBeTakenBack) {
  append(kLongBody);
  ASSERT_EQ(flush(), FlushStatus::Blocked);
  const std::size_t before = queue.size();
  queue.withdraw(append("taken back"));
  EXPECT_EQ(queue.size(), before);
}

TEST_F(PortSendQueueTest, AFrameBegunCannotBeTakenBack) {
  const auto position = append(kLongBody);
  ASSERT_EQ(flush(), FlushStatus::Blocked);
  const std::size_t before = queue.size();
  queue.withdraw(position);
  EXPECT_EQ(queue.size(), before);
}

TEST_F(PortSendQueueTest, CountsTheMessagesThatAreNotWrittenWhole) {
  EXPECT_TRUE(queue.waitingMessages().empty());
  append("written");
  append(kLongBody);
  append("after");
  queue.append({.kind = PortFrameKind::Message, .messageId = -4}, bytesOf("other"));
  queue.append({.kind = PortFrameKind::Request, .messageId = 1, .sequence = 1}, {});
  EXPECT_EQ(queue.waitingMessages(), (std::map<std::int32_t, std::size_t>{{1, 3}, {-4, 1}}));
  ASSERT_EQ(flush(), FlushStatus::Blocked);
  EXPECT_EQ(queue.waitingMessages(), (std::map<std::int32_t, std::size_t>{{1, 2}, {-4, 1}}));
  for (int i = 0; flush() == FlushStatus::Blocked; ++i) {
    if (i == 0) append("last");
    static_cast<void>(peer->receiveAvailable());
  }
  EXPECT_TRUE(queue.waitingMessages().empty());
}

TEST_F(PortSendQueueTest, APeerThatIsGoneBreaksItWithoutASignal) {
  append("lost");
  peer->close();
  EXPECT_EQ(flush(), FlushStatus::Broken);
}

}  // namespace
}  // namespace kestro::testing
