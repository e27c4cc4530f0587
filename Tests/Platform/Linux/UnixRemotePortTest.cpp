// SPDX-License-Identifier: MIT
// Remote ports, against receivers that read bytes, and against ports of another thread.
#include <sys/wait.h>

#include <algorithm>
#include <array>
#include <csignal>

#include "Tests/Platform/Linux/PortFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

class UnixRemotePortTest : public PortFixture {
 protected:
  /// Makes "Peer", connects a remote port to it and takes the other end.
  void connectToPeer() {
    listener.emplace(pathOf("Peer"));
    remote = ports->createRemotePort("Peer");
    ASSERT_TRUE(remote);
    peer.emplace(listener->accept());
  }

  /// Fills the connection until the system takes no more.
  void fillConnection() {
    while (remote->send(0, Bytes(32 * 1024), 0ms) == SendError::None) {
    }
  }

  std::optional<RawListener> listener;
  std::optional<RawPeer> peer;
  std::shared_ptr<RemotePort> remote;
};

TEST_F(UnixRemotePortTest, NobodyIsConnectedToWithoutAnOwner) {
  EXPECT_FALSE(ports->createRemotePort("Nobody"));
  { const RawListener dead(pathOf("Dead")); }
  EXPECT_FALSE(ports->createRemotePort("Dead"));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(UnixRemotePortTest, PostsLeaveInOrderWithTheTurn) {
  connectToPeer();
  EXPECT_EQ(remote->post(1, bytesOf("one")), SendError::None);
  EXPECT_EQ(remote->post(-1, bytesOf("")), SendError::None);
  EXPECT_THAT(peer->receiveAvailable(), IsEmpty());
  turnUntilIdle();
  EXPECT_EQ(peer->receiveAvailable(), joined({frame(1, 1, 0, "one"), frame(1, 0xFFFFFFFF, 0, "")}));
}

TEST_F(UnixRemotePortTest, ManyPostsLeaveBeforeTheTurnEnds) {
  connectToPeer();
  for (int i = 0; i < 400; ++i) EXPECT_EQ(remote->post(0, Bytes(200)), SendError::None);
  EXPECT_GE(peer->receiveAvailable().size(), 64U * 1024);
}

TEST_F(UnixRemotePortTest, PostsLeaveWhenThePortIsLetGo) {
  connectToPeer();
  EXPECT_EQ(remote->post(1, bytesOf("last words")), SendError::None);
  remote.reset();
  EXPECT_EQ(peer->receive(26), frame(1, 1, 0, "last words"));
  EXPECT_TRUE(peer->isAtEnd());
}

TEST_F(UnixRemotePortTest, SendHandsOverAtOnceAndAfterWhatWasPosted) {
  connectToPeer();
  EXPECT_EQ(remote->post(1, bytesOf("first")), SendError::None);
  EXPECT_EQ(remote->send(2, bytesOf("second"), 1s), SendError::None);
  EXPECT_EQ(peer->receiveAvailable(), joined({frame(1, 1, 0, "first"), frame(1, 2, 0, "second")}));
}

TEST_F(UnixRemotePortTest, SendsTheLongestMessageToAPeerThatReads) {
  connectToPeer();
  const std::string body(16 * kMebibyte, 'x');
  Bytes received;
  std::thread reading([&] { received = peer->receive(16 + body.size()); });
  EXPECT_EQ(remote->send(0, bytesOf(body), 5s), SendError::None);
  reading.join();
  EXPECT_TRUE(received == frame(1, 0, 0, body));
}

TEST_F(UnixRemotePortTest, AMessageThatIsTooLongIsRefusedAndNothingElse) {
  connectToPeer();
  const Bytes tooLong(16 * kMebibyte + 1);
  EXPECT_EQ(remote->post(0, tooLong), SendError::Transport);
  EXPECT_EQ(remote->send(0, tooLong, 1s), SendError::Transport);
  EXPECT_EQ(remote->request(0, tooLong, 1s, 1s).error, SendError::Transport);
  EXPECT_TRUE(remote->isValid());
  EXPECT_THAT(peer->receiveAvailable(), IsEmpty());
}

// Requests.

TEST_F(UnixRemotePortTest, ARequestYieldsItsReply) {
  connectToPeer();
  std::thread answering([&] {
    EXPECT_EQ(peer->receive(19), frame(2, 5, 1, "ask"));
    peer->send(frame(3, 5, 1, "answer"));
  });
  const auto answer = remote->request(5, bytesOf("ask"), 1s, 5s);
  answering.join();
  EXPECT_EQ(answer.error, SendError::None);
  EXPECT_EQ(answer.data, bytesOf("answer"));
}

TEST_F(UnixRemotePortTest, AReplyTellsNoDataFromEmptyData) {
  connectToPeer();
  peer->send(frame(4, 0, 1, ""));
  const auto without = remote->request(0, {}, 1s, 5s);
  EXPECT_EQ(without.error, SendError::None);
  EXPECT_EQ(without.data, std::nullopt);
  peer->send(frame(3, 0, 2, ""));
  const auto empty = remote->request(0, {}, 1s, 5s);
  EXPECT_EQ(empty.error, SendError::None);
  EXPECT_EQ(empty.data, Bytes());
}

TEST_F(UnixRemotePortTest, ALongReplyArrivesWhole) {
  connectToPeer();
  const std::string body(16 * kMebibyte, 'r');
  std::thread answering([&] { peer->send(frame(3, 0, 1, body)); });
  const auto answer = remote->request(0, {}, 1s, 5s);
  answering.join();
  ASSERT_TRUE(answer.data);
  EXPECT_TRUE(*answer.data == bytesOf(body));
}

TEST_F(UnixRemotePortTest, WithoutAReplyTheTimeRunsOut) {
  connectToPeer();
  const auto begin = std::chrono::steady_clock::now();
  EXPECT_EQ(remote->request(0, {}, 1s, 50ms).error, SendError::ReceiveTimeout);
  const auto elapsed = std::chrono::steady_clock::now() - begin;
  EXPECT_GE(elapsed, 50ms);
  EXPECT_LT(elapsed, 1s);
  EXPECT_TRUE(remote->isValid());
}

TEST_F(UnixRemotePortTest, ALateReplyIsNotTakenForALaterOne) {
  connectToPeer();
  EXPECT_EQ(remote->request(0, {}, 1s, 0ms).error, SendError::ReceiveTimeout);
  peer->send(joined({frame(3, 0, 1, "late"), frame(3, 0, 2, "in time")}));
  EXPECT_EQ(remote->request(0, {}, 1s, 5s).data, bytesOf("in time"));
}

TEST_F(UnixRemotePortTest, LateRepliesAreTakenOffTheConnection) {
  connectToPeer();
  EXPECT_EQ(remote->request(0, {}, 1s, 0ms).error, SendError::ReceiveTimeout);
  std::atomic<bool> allSent = false;
  std::thread answering([&] {
    peer->send(frame(3, 0, 1, std::string(4 * kMebibyte, 'x')));
    allSent = true;
  });
  EXPECT_TRUE(turnUntil([&] { return allSent.load(); }));
  answering.join();
}

TEST_F(UnixRemotePortTest, APeerThatClosesDuringARequestIsATransportError) {
  connectToPeer();
  std::thread closing([&] {
    static_cast<void>(peer->receive(16));
    peer->close();
  });
  EXPECT_EQ(remote->request(0, {}, 1s, 5s).error, SendError::Transport);
  closing.join();
  EXPECT_FALSE(remote->isValid());
}

TEST_F(UnixRemotePortTest, AMalformedReplyIsATransportErrorAndClosesTheConnection) {
  connectToPeer();
  peer->send(frame(1, 0, 0, "not the way messages go"));
  EXPECT_EQ(remote->request(0, {}, 1s, 5s).error, SendError::Transport);
  EXPECT_FALSE(remote->isValid());
  EXPECT_THAT(logTexts(), ElementsAre(HasSubstr("a frame of kind 1, which does not travel here")));
}

TEST_F(UnixRemotePortTest, MalformedBytesBetweenRequestsCloseTheConnection) {
  connectToPeer();
  peer->send(Bytes(16, 0xFF));
  EXPECT_TRUE(turnUntil([&] { return !remote->isValid(); }));
  EXPECT_EQ(log.lines().size(), 1U);
}

TEST_F(UnixRemotePortTest, OnlyTheReplyIsServedWhileARequestWaits) {
  reply = bytesOf("from the thread");
  const PortThread thread(directory.path(), "Other", [](std::int32_t, ByteView message) {
    return std::optional<Bytes>(Bytes(message.begin(), message.end()));
  });
  const auto port = openPort("Mine");
  RawPeer sender = connectRaw("Mine");
  turnUntilIdle();
  const auto other = ports->createRemotePort("Other");
  for (int i = 0; i < 5; ++i) sender.send(frame(1, 0, 0, std::to_string(i)));
  EXPECT_EQ(other->request(0, bytesOf("echo"), 1s, 5s).data, bytesOf("echo"));
  EXPECT_THAT(messages, IsEmpty());
  ASSERT_TRUE(turnUntilMessages(5));
  EXPECT_THAT(messages, ElementsAre(Message{0, "0"}, Message{0, "1"}, Message{0, "2"},
                                    Message{0, "3"}, Message{0, "4"}));
}

TEST_F(UnixRemotePortTest, ARequestMayBeMadeInAHandler) {
  const PortThread thread(directory.path(), "Other", [](std::int32_t, ByteView) {
    return std::optional<Bytes>(bytesOf("inner"));
  });
  const auto other = ports->createRemotePort("Other");
  const auto port = ports->createLocalPort("Mine", [&](std::int32_t, ByteView message) {
    const std::string before = textOf(message);
    const auto inner = other->request(0, {}, 1s, 5s);
    messages.push_back({0, before + textOf(*inner.data) + textOf(message)});
    return std::nullopt;
  });
  RawPeer sender = connectRaw("Mine");
  sender.send(joined({frame(1, 0, 0, "a"), frame(1, 0, 0, "b")}));
  ASSERT_TRUE(turnUntilMessages(2));
  EXPECT_THAT(messages, ElementsAre(Message{0, "ainnera"}, Message{0, "binnerb"}));
}

TEST_F(UnixRemotePortTest, WhatWasPostedElsewhereLeavesBeforeTheWait) {
  connectToPeer();
  const RawListener silent(pathOf("Silent"));
  const auto other = ports->createRemotePort("Silent");
  EXPECT_EQ(remote->post(1, bytesOf("now")), SendError::None);
  EXPECT_EQ(other->request(0, {}, 1s, 0ms).error, SendError::ReceiveTimeout);
  EXPECT_EQ(peer->receiveAvailable(), frame(1, 1, 0, "now"));
}

// Peers that never stop sending.

/// Sends replies that nobody awaits from its end of a connection, until nobody reads them any more:
/// faster than one can read, so that there is always more.
class Flood {
 public:
  explicit Flood(RawPeer& peer) {
    Bytes frames;  // few enough for one write to be whole
    for (int i = 0; i < 1024; ++i) frames = joined({std::move(frames), frame(4, 0, 99, "")});
    for (auto& thread : _threads) {
      thread = std::thread([this, &peer, frames] {
        while (!_stop) peer.send(frames);
      });
    }
    std::this_thread::sleep_for(20ms);
  }
  ~Flood() {
    _stop = true;
    for (auto& thread : _threads) thread.join();
  }
  Flood(const Flood&) = delete;
  Flood& operator=(const Flood&) = delete;

 private:
  std::atomic<bool> _stop = false;
  std::array<std::thread, 2> _threads;
};

TEST_F(UnixRemotePortTest, AFloodOfOtherRepliesDoesNotHoldUpARequest) {
  connectToPeer();
  const Flood flood(*peer);
  const auto begin = std::chrono::steady_clock::now();
  for (int i = 0; i < 20; ++i) {
    EXPECT_EQ(remote->request(0, {}, 1s, 10ms).error, SendError::ReceiveTimeout);
  }
  const auto elapsed = std::chrono::steady_clock::now() - begin;
  EXPECT_GE(elapsed, 200ms);
  EXPECT_LT(elapsed, 1s);
  remote->invalidate();
}

TEST_F(UnixRemotePortTest, AFloodOfRepliesDoesNotHoldUpASendThatIsNotTaken) {
  connectToPeer();
  fillConnection();
  const Flood flood(*peer);
  const auto begin = std::chrono::steady_clock::now();
  for (int i = 0; i < 20; ++i) EXPECT_EQ(remote->send(0, {}, 10ms), SendError::SendTimeout);
  const auto elapsed = std::chrono::steady_clock::now() - begin;
  EXPECT_GE(elapsed, 200ms);
  EXPECT_LT(elapsed, 1s);
  remote->invalidate();
}

TEST_F(UnixRemotePortTest, UnfinishedRepliesShare64MiBAndTheLargestIsClosedBeyond) {
  Bytes begun = frame(3, 0, 1, std::string(13 * kMebibyte, 'x'));
  begun.pop_back();
  const Bytes longer = joined({frame(3, 0, 1, std::string(14 * kMebibyte, 'x'))});
  listener.emplace(pathOf("Peer"));
  std::vector<std::shared_ptr<RemotePort>> remotes;
  std::vector<RawPeer> peers;
  for (int i = 0; i < 5; ++i) {
    remotes.push_back(ports->createRemotePort("Peer"));
    peers.push_back(listener->accept());
    std::atomic<bool> isSent = false;
    std::thread sending([&] {
      peers.back().send(i == 2 ? Bytes(longer.begin(), longer.end() - 1) : begun);
      isSent = true;
    });
    EXPECT_TRUE(turnUntil([&] { return isSent.load(); }));
    sending.join();
    turnUntilIdle();
  }
  EXPECT_THAT(logTexts(), ElementsAre(HasSubstr("14680079 bytes of a frame that has not ended")));
  for (std::size_t i = 0; i < remotes.size(); ++i) EXPECT_EQ(remotes[i]->isValid(), i != 2) << i;
}

TEST_F(UnixRemotePortTest, AReplyThatIsThereWhenTheTimeIsOverIsTaken) {
  connectToPeer();
  peer->send(frame(3, 0, 1, "in time"));
  EXPECT_EQ(remote->request(0, {}, 1s, 0ms).data, bytesOf("in time"));
}

// Peers that stop reading.

TEST_F(UnixRemotePortTest, ASendThatIsNotTakenRunsOutOfTimeAndIsForgotten) {
  connectToPeer();
  fillConnection();
  const auto begin = std::chrono::steady_clock::now();
  EXPECT_EQ(remote->send(7, bytesOf("never sent"), 50ms), SendError::SendTimeout);
  EXPECT_GE(std::chrono::steady_clock::now() - begin, 50ms);
  EXPECT_EQ(remote->request(8, {}, 10ms, 5s).error, SendError::SendTimeout);
  EXPECT_TRUE(remote->isValid());
  std::string received;
  EXPECT_TRUE(turnUntil([&] {
    received += textOf(peer->receiveAvailable());
    return remote->send(9, bytesOf("sent"), 0ms) == SendError::None;
  }));
  received += textOf(peer->receiveAvailable());
  EXPECT_THAT(received, Not(HasSubstr("never sent")));
  EXPECT_TRUE(received.ends_with(textOf(frame(1, 9, 0, "sent"))));
}

TEST_F(UnixRemotePortTest, ASendTakenInPartIsFinishedLater) {
  connectToPeer();
  const std::string body(kMebibyte, 'p');
  EXPECT_EQ(remote->send(1, bytesOf(body), 10ms), SendError::SendTimeout);
  Bytes received;
  EXPECT_TRUE(turnUntil([&] {
    received = joined({received, peer->receiveAvailable()});
    return received.size() == 16 + body.size();
  }));
  EXPECT_TRUE(received == frame(1, 1, 0, body));
}

TEST_F(UnixRemotePortTest, PostsToASlowPeerWaitAndArrive) {
  connectToPeer();
  std::size_t expected = 0;
  for (int i = 0; i < 30; ++i, expected += 16 + 100 * 1024) {
    ASSERT_EQ(remote->post(0, Bytes(100 * 1024)), SendError::None);
  }
  std::size_t received = 0;
  EXPECT_TRUE(turnUntil([&] {
    received += peer->receiveAvailable().size();
    return received == expected;
  }));
}

TEST_F(UnixRemotePortTest, MoreThanTheQueueHoldsClosesTheConnectionWithALine) {
  connectToPeer();
  fillConnection();
  const Bytes message(kMebibyte - 16);
  for (int i = 0; i < 4; ++i) EXPECT_EQ(remote->post(0, message), SendError::None);
  EXPECT_TRUE(remote->isValid());
  EXPECT_EQ(remote->post(0, {}), SendError::Transport);
  EXPECT_FALSE(remote->isValid());
  EXPECT_EQ(remote->post(0, {}), SendError::InvalidPort);
  EXPECT_THAT(logTexts(),
              ElementsAre("Message port \"Peer\": closing a connection: the peer does not read: "
                          "4194320 bytes wait, at most 4194304 may"));
}

TEST_F(UnixRemotePortTest, CountsTheMessagesThatDoNotLeave) {
  connectToPeer();
  EXPECT_EQ(remote->post(0, bytesOf("leaves")), SendError::None);
  EXPECT_EQ(remote->unsentMessages(0), 1U);
  turnUntilIdle();
  EXPECT_EQ(remote->unsentMessages(0), 0U);
  fillConnection();
  for (int i = 0; i < 3; ++i) EXPECT_EQ(remote->post(0, Bytes(kMebibyte)), SendError::None);
  EXPECT_EQ(remote->post(4, {}), SendError::None);
  EXPECT_EQ(remote->post(0, Bytes(kMebibyte)), SendError::Transport);
  EXPECT_EQ(remote->unsentMessages(0), 3U);
  EXPECT_EQ(remote->unsentMessages(4), 1U);
  EXPECT_EQ(remote->unsentMessages(1), 0U);
}

TEST_F(UnixRemotePortTest, WhenMuchWaitsForManyEachMayHoldUpLess) {
  std::vector<RawListener> listeners;
  std::vector<std::shared_ptr<RemotePort>> slow;
  const Bytes message(kMebibyte);
  const auto addSlowPeer = [&] {
    const std::string name = "Slow" + std::to_string(slow.size());
    listeners.emplace_back(pathOf(name));
    slow.push_back(ports->createRemotePort(name));
  };
  // 60 MiB, of which the system's buffers take some: that may wait.
  for (int i = 0; i < 20; ++i) {
    addSlowPeer();
    for (int j = 0; j < 3; ++j) EXPECT_EQ(slow.back()->post(0, message), SendError::None);
  }
  // Nothing waits for these yet. Of all 100 MiB the system's buffers do not take 36.
  for (int i = 0; i < 10; ++i) {
    addSlowPeer();
    EXPECT_EQ(slow.back()->post(0, Bytes(4 * kMebibyte - 16)), SendError::None);
  }
  EXPECT_EQ(slow.front()->post(0, {}), SendError::Transport);
  EXPECT_EQ(slow.front()->post(0, {}), SendError::InvalidPort);
  // When enough connections are gone, the others may go on.
  for (const auto& port : slow) static_cast<void>(port->post(0, {}));
  EXPECT_GE(std::ranges::count_if(slow, [](const auto& port) { return port->isValid(); }), 16);
}

TEST_F(UnixRemotePortTest, ASlowReaderDoesNotHoldUpAnother) {
  connectToPeer();
  fillConnection();
  RawListener fast(pathOf("Fast"));
  const auto toFast = ports->createRemotePort("Fast");
  EXPECT_EQ(remote->post(0, Bytes(kMebibyte)), SendError::None);
  EXPECT_EQ(toFast->post(1, bytesOf("quick")), SendError::None);
  turnUntilIdle();
  EXPECT_EQ(fast.accept().receive(21), frame(1, 1, 0, "quick"));
}

// Validity.

TEST_F(UnixRemotePortTest, IsInvalidAsSoonAsThePeerHasClosed) {
  connectToPeer();
  EXPECT_TRUE(remote->isValid());
  peer->close();
  EXPECT_FALSE(remote->isValid());
  EXPECT_EQ(remote->send(0, {}, 1s), SendError::InvalidPort);
  EXPECT_EQ(remote->request(0, {}, 1s, 1s).error, SendError::InvalidPort);
}

TEST_F(UnixRemotePortTest, IsInvalidEvenWithAnUnreadReplyBeforeTheEnd) {
  connectToPeer();
  peer->send(frame(3, 0, 1, "late"));
  peer->close();
  EXPECT_FALSE(remote->isValid());
}

TEST_F(UnixRemotePortTest, IsInvalidOnceTheOwnerIsGoneThatNeverAccepted) {
  auto port = openPort("Mine");
  const auto toMine = ports->createRemotePort("Mine");
  EXPECT_TRUE(toMine->isValid());
  port.reset();
  EXPECT_FALSE(toMine->isValid());
}

TEST_F(UnixRemotePortTest, IsInvalidAfterInvalidate) {
  connectToPeer();
  remote->invalidate();
  remote->invalidate();
  EXPECT_FALSE(remote->isValid());
  EXPECT_EQ(remote->post(0, {}), SendError::InvalidPort);
  EXPECT_TRUE(peer->isAtEnd());
}

TEST_F(UnixRemotePortTest, APostToAPeerThatIsGoneEndsTheConnection) {
  connectToPeer();
  peer->close();
  static_cast<void>(remote->post(0, bytesOf("lost")));
  turnUntilIdle();
  EXPECT_EQ(remote->post(0, bytesOf("lost")), SendError::InvalidPort);
}

// Other processes.

/// A child that owns the port "Child" and does nothing with it.
class IdleChild {
 public:
  explicit IdleChild(const std::filesystem::path& path) {
    int ready[2] = {-1, -1};
    EXPECT_EQ(::pipe(ready), 0);
    _process = ::fork();
    if (_process == 0) {
      const RawListener listener(path);
      static_cast<void>(::write(ready[1], "x", 1));
      for (;;) ::pause();
    }
    char byte = 0;
    EXPECT_EQ(::read(ready[0], &byte, 1), 1);
    ::close(ready[0]);
    ::close(ready[1]);
  }
  ~IdleChild() { end(); }
  IdleChild(const IdleChild&) = delete;
  IdleChild& operator=(const IdleChild&) = delete;

  [[nodiscard]] pid_t process() const noexcept { return _process; }
  void stop() {
    ::kill(_process, SIGSTOP);
    int status = 0;
    ::waitpid(_process, &status, WUNTRACED);
  }
  void end() {
    if (_process <= 0) return;
    ::kill(_process, SIGKILL);
    int status = 0;
    ::waitpid(_process, &status, 0);
    _process = -1;
  }

 private:
  pid_t _process = -1;
};

TEST_F(UnixRemotePortTest, AStoppedPeerBlocksNothingBeyondTheTimeouts) {
  IdleChild child(pathOf("Child"));
  remote = ports->createRemotePort("Child");
  ASSERT_TRUE(remote);
  child.stop();
  const auto begin = std::chrono::steady_clock::now();
  EXPECT_TRUE(remote->isValid());
  EXPECT_EQ(remote->request(0, bytesOf("hello?"), 50ms, 50ms).error, SendError::ReceiveTimeout);
  EXPECT_EQ(remote->send(0, Bytes(8 * kMebibyte), 50ms), SendError::SendTimeout);
  EXPECT_TRUE(ports->createRemotePort("Child"));
  remote.reset();
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 1s);
}

TEST_F(UnixRemotePortTest, KnowsTheProcessThatOwnsThePort) {
  const IdleChild child(pathOf("Child"));
  const auto port = openPort("Mine");
  EXPECT_EQ(ports->createRemotePort("Child")->owner(), child.process());
  EXPECT_EQ(ports->createRemotePort("Mine")->owner(), ::getpid());
}

TEST_F(UnixRemotePortTest, ALinkToAPortIsNoPort) {
  const auto port = openPort("Mine");
  std::filesystem::create_symlink(pathOf("Mine"), pathOf("Link"));
  std::filesystem::create_symlink("Nowhere", pathOf("Broken"));
  EXPECT_FALSE(ports->createRemotePort("Link"));
  EXPECT_FALSE(ports->createRemotePort("Broken"));
  EXPECT_THAT(logTexts(),
              ElementsAre("Message port \"Link\": cannot connect: it is a symbolic link",
                          "Message port \"Broken\": cannot connect: it is a symbolic link"));
}

TEST_F(UnixRemotePortTest, AKilledPeerIsInvalidAtOnce) {
  IdleChild child(pathOf("Child"));
  remote = ports->createRemotePort("Child");
  ASSERT_TRUE(remote);
  EXPECT_TRUE(remote->isValid());
  child.end();
  EXPECT_FALSE(remote->isValid());
  EXPECT_FALSE(ports->createRemotePort("Child"));
  EXPECT_TRUE(openPort("Child"));
}

}  // namespace
}  // namespace kestro::testing
