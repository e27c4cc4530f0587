// SPDX-License-Identifier: MIT
// Local ports, against senders that write bytes.
#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>

#include <algorithm>
#include <csignal>
#include <fstream>

#include "Tests/Platform/Linux/PortFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

constexpr std::uint8_t kMessage = 1;
constexpr std::uint8_t kRequest = 2;
constexpr std::uint8_t kReply = 3;
constexpr std::uint8_t kReplyWithoutData = 4;

/// While it lives the process can open no descriptor.
class NoDescriptors {
 public:
  NoDescriptors() {
    EXPECT_EQ(::getrlimit(RLIMIT_NOFILE, &_limit), 0);
    const rlimit few{128, _limit.rlim_max};
    EXPECT_EQ(::setrlimit(RLIMIT_NOFILE, &few), 0);
    do {
      _taken.emplace_back(::open("/dev/null", O_RDONLY | O_CLOEXEC));
    } while (_taken.back().isOpen());
  }
  ~NoDescriptors() { EXPECT_EQ(::setrlimit(RLIMIT_NOFILE, &_limit), 0); }
  NoDescriptors(const NoDescriptors&) = delete;
  NoDescriptors& operator=(const NoDescriptors&) = delete;

 private:
  rlimit _limit{};
  std::vector<FileDescriptor> _taken;
};

class UnixLocalPortTest : public PortFixture {
 protected:
  /// Sends `bytes` over a connection of their own and waits until the port has closed it.
  void expectClosedBy(const Bytes& bytes) {
    RawPeer peer = connectRaw("A");
    peer.send(bytes);
    EXPECT_TRUE(turnUntil([&] { return peer.isAtEnd(); }));
  }
};

TEST_F(UnixLocalPortTest, DeliversAMessageWithItsId) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 0xFFFFFFFE, 0, "hello"));
  ASSERT_TRUE(turnUntilMessages(1));
  EXPECT_THAT(messages, ElementsAre(Message{-2, "hello"}));
}

TEST_F(UnixLocalPortTest, DeliversAnEmptyMessage) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 3, 0, ""));
  ASSERT_TRUE(turnUntilMessages(1));
  EXPECT_THAT(messages, ElementsAre(Message{3, ""}));
}

TEST_F(UnixLocalPortTest, DeliversManyMessagesInOrder) {
  const auto port = openPort("A");
  constexpr int kCount = 20000;
  std::thread sending([&] {
    RawPeer peer = connectRaw("A");
    for (int i = 0; i < kCount; ++i) peer.send(frame(kMessage, 0, 0, std::to_string(i)));
  });
  EXPECT_TRUE(turnUntilMessages(kCount));
  sending.join();
  for (int i = 0; i < kCount; ++i)
    ASSERT_EQ(messages[static_cast<std::size_t>(i)].text, std::to_string(i));
}

TEST_F(UnixLocalPortTest, DeliversTheLongestMessage) {
  const auto port = openPort("A");
  const std::string body(16 * 1024 * 1024, 'x');
  std::thread sending([&] {
    RawPeer peer = connectRaw("A");
    peer.send(frame(kMessage, 0, 0, body));
  });
  EXPECT_TRUE(turnUntilMessages(1));
  sending.join();
  ASSERT_EQ(messages.size(), 1U);
  EXPECT_TRUE(messages[0].text == body);
}

TEST_F(UnixLocalPortTest, DeliversAMessageThatArrivesByteByByte) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  for (const std::uint8_t byte : frame(kMessage, 0, 0, "slow")) {
    EXPECT_THAT(messages, IsEmpty());
    peer.send({byte});
    turnUntilIdle();
  }
  ASSERT_TRUE(turnUntilMessages(1));
  EXPECT_EQ(messages[0].text, "slow");
}

TEST_F(UnixLocalPortTest, DeliversWhatCameBeforeTheEnd) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(joined({frame(kMessage, 0, 0, "a"), frame(kMessage, 0, 0, "b")}));
  peer.close();
  ASSERT_TRUE(turnUntilMessages(2));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(UnixLocalPortTest, AnswersARequestWithData) {
  reply = bytesOf("yes");
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kRequest, 2, 7, "may I?"));
  ASSERT_TRUE(turnUntilMessages(1));
  turnUntilIdle();
  EXPECT_EQ(peer.receive(19), frame(kReply, 2, 7, "yes"));
}

TEST_F(UnixLocalPortTest, EmptyDataIsNotNoData) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kRequest, 2, 7, ""));
  ASSERT_TRUE(turnUntilMessages(1));
  reply = Bytes();
  peer.send(frame(kRequest, 2, 8, ""));
  ASSERT_TRUE(turnUntilMessages(2));
  turnUntilIdle();
  EXPECT_EQ(peer.receive(32),
            joined({frame(kReplyWithoutData, 2, 7, ""), frame(kReply, 2, 8, "")}));
}

TEST_F(UnixLocalPortTest, AMessageIsNotAnswered) {
  reply = bytesOf("unasked");
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 2, 0, ""));
  ASSERT_TRUE(turnUntilMessages(1));
  turnUntilIdle();
  EXPECT_THAT(peer.receiveAvailable(), IsEmpty());
}

TEST_F(UnixLocalPortTest, AReplyThatIsTooLongIsReplacedByNoData) {
  reply = Bytes(16 * 1024 * 1024 + 1);
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kRequest, 2, 7, ""));
  ASSERT_TRUE(turnUntilMessages(1));
  turnUntilIdle();
  EXPECT_EQ(peer.receive(16), frame(kReplyWithoutData, 2, 7, ""));
  EXPECT_THAT(logTexts(), ElementsAre("Message port \"A\": a reply of 16777217 bytes is dropped, "
                                      "at most 16777216 are allowed"));
}

TEST_F(UnixLocalPortTest, AReplyToAPeerThatIsGoneIsDropped) {
  reply = Bytes(300000, 'x');
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kRequest, 2, 7, ""));
  peer.close();
  ASSERT_TRUE(turnUntilMessages(1));
  RawPeer next = connectRaw("A");
  next.send(frame(kMessage, 0, 0, "still there"));
  ASSERT_TRUE(turnUntilMessages(2));
  EXPECT_TRUE(port->isValid());
}

TEST_F(UnixLocalPortTest, ServesWhatHasArrivedWhenAskedTo) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  turnUntilIdle();
  for (int i = 0; i < 50; ++i) peer.send(frame(kMessage, 0, 0, std::string(1000, 'x')));
  peer.close();
  EXPECT_THAT(messages, IsEmpty());
  port->serveArrived();
  EXPECT_EQ(messages.size(), 50U);
  EXPECT_THAT(log.lines(), IsEmpty());
}

// Malformed frames: each closes its connection, and nothing else.

TEST_F(UnixLocalPortTest, AFrameOfUnknownKindClosesItsConnection) {
  const auto port = openPort("A");
  expectClosedBy(frame(5, 0, 0, "x"));
  EXPECT_THAT(logTexts(), ElementsAre("Message port \"A\": closing a connection: a frame of kind "
                                      "5, which does not travel here"));
  EXPECT_THAT(messages, IsEmpty());
}

TEST_F(UnixLocalPortTest, AReplyFromASenderClosesItsConnection) {
  const auto port = openPort("A");
  expectClosedBy(frame(kReply, 0, 1, "x"));
}

TEST_F(UnixLocalPortTest, AReservedBitClosesItsConnection) {
  const auto port = openPort("A");
  Bytes bytes = frame(kMessage, 0, 0, "x");
  bytes[2] = 1;
  expectClosedBy(bytes);
}

TEST_F(UnixLocalPortTest, AnOversizedFrameClosesItsConnectionByItsHeader) {
  const auto port = openPort("A");
  expectClosedBy({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 1});
  EXPECT_THAT(logTexts(), ElementsAre(HasSubstr("16777217 bytes")));
}

TEST_F(UnixLocalPortTest, ATruncatedFrameIsDroppedWithALine) {
  const Bytes whole = frame(kMessage, 0, 0, "body");
  const auto port = openPort("A");
  for (std::size_t cut = 1; cut < whole.size(); ++cut) {
    RawPeer peer = connectRaw("A");
    peer.send(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(cut)));
    peer.close();
    ASSERT_TRUE(turnUntil([&] { return !log.lines().empty(); })) << cut;
    EXPECT_THAT(log.take().front().text, HasSubstr("the stream ends within a frame, " +
                                                   std::to_string(cut) + " bytes dropped"));
  }
  EXPECT_THAT(messages, IsEmpty());
}

TEST_F(UnixLocalPortTest, FramesBeforeAMalformedOneAreServed) {
  const auto port = openPort("A");
  expectClosedBy(joined({frame(kMessage, 0, 0, "good"), frame(99, 0, 0, "")}));
  EXPECT_THAT(messages, ElementsAre(Message{0, "good"}));
}

TEST_F(UnixLocalPortTest, AMalformedFrameLeavesOtherConnectionsAlone) {
  const auto port = openPort("A");
  RawPeer other = connectRaw("A");
  other.send(frame(kMessage, 0, 0, "before"));
  ASSERT_TRUE(turnUntilMessages(1));
  expectClosedBy(frame(5, 0, 0, "x"));
  other.send(frame(kMessage, 0, 0, "after"));
  ASSERT_TRUE(turnUntilMessages(2));
  EXPECT_EQ(messages[1].text, "after");
  EXPECT_TRUE(port->isValid());
}

TEST_F(UnixLocalPortTest, RandomBytesNeverHarmIt) {
  const auto port = openPort("A");
  std::uint32_t state = 1;
  for (int round = 0; round < 200; ++round) {
    Bytes bytes(64);
    for (auto& byte : bytes)
      byte = static_cast<std::uint8_t>((state = state * 1664525 + 1013904223) >> 24);
    bytes[0] = static_cast<std::uint8_t>(1 + round % 5);
    RawPeer peer = connectRaw("A");
    peer.send(bytes);
    peer.close();
    turnUntilIdle();
  }
  RawPeer last = connectRaw("A");
  last.send(frame(kMessage, 77, 0, "sane"));
  EXPECT_TRUE(turnUntil([&] {
    return !messages.empty() && messages.back() == Message{77, "sane"};
  }));
}

// Who may open a port, and who may connect.

TEST_F(UnixLocalPortTest, BadNamesAreRefused) {
  for (const std::string& name : {std::string(), std::string("."), std::string(".."),
                                  std::string("a/b"), std::string(65, 'x')}) {
    EXPECT_FALSE(openPort(name)) << name;
    EXPECT_THAT(log.take(),
                ElementsAre(::testing::Field(
                    &RecordingSystemLog::Line::text,
                    "Message port \"" + name + "\": cannot open: this is no port name")));
    EXPECT_FALSE(ports->createRemotePort(name)) << name;
    EXPECT_EQ(log.take().size(), 1U);
  }
}

TEST_F(UnixLocalPortTest, ALiveNameIsNotStolen) {
  const auto port = openPort("A");
  const auto others = createUnixMessagePorts(log, directory.path().string());
  EXPECT_FALSE(others->createLocalPort("A", {}));
  EXPECT_THAT(logTexts(), ElementsAre("Message port \"A\": cannot open: the name is in use"));
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 0, 0, "mine"));
  EXPECT_TRUE(turnUntilMessages(1));
}

TEST_F(UnixLocalPortTest, TheFirstPortTidiesUpAfterDeadProcesses) {
  { const RawListener dead(pathOf("Dead")); }
  const auto port = openPort("A");
  EXPECT_FALSE(std::filesystem::exists(pathOf("Dead")));
}

TEST_F(UnixLocalPortTest, ADirectoryOpenToOthersIsRefused) {
  std::filesystem::permissions(directory.path(), std::filesystem::perms::all);
  EXPECT_FALSE(openPort("A"));
  EXPECT_FALSE(ports->createRemotePort("A"));
  EXPECT_THAT(logTexts(),
              ElementsAre(HasSubstr("its mode is 0777"), HasSubstr("its mode is 0777")));
}

TEST_F(UnixLocalPortTest, APeerOfAnotherUserIsRefused) {
  const auto strict = createUnixMessagePorts(
      log, UnixMessagePortsOptions{.portDirectory = directory.path().string(),
                                   .peerUser = ::geteuid() + 1});
  const auto port = strict->createLocalPort("A", [&](std::int32_t, ByteView) {
    ADD_FAILURE() << "served another user";
    return std::nullopt;
  });
  ASSERT_TRUE(port);
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 0, 0, "x"));
  EXPECT_TRUE(turnUntil([&] { return peer.isAtEnd(); }));
  EXPECT_THAT(logTexts(), ElementsAre("Message port \"A\": refusing a connection of another user"));
  EXPECT_FALSE(strict->createRemotePort("A"));
}

// The end of a port.

TEST_F(UnixLocalPortTest, InvalidateRunsTheHandlerOnceAndClosesAll) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  turnUntilIdle();
  int invalidations = 0;
  port->setInvalidationHandler([&] { ++invalidations; });
  port->invalidate();
  port->invalidate();
  EXPECT_EQ(invalidations, 1);
  EXPECT_FALSE(port->isValid());
  EXPECT_TRUE(peer.isAtEnd());
  EXPECT_FALSE(std::filesystem::exists(pathOf("A")));
}

TEST_F(UnixLocalPortTest, ARemovedInvalidationHandlerDoesNotRun) {
  const auto port = openPort("A");
  port->setInvalidationHandler([] { ADD_FAILURE(); });
  port->setInvalidationHandler({});
  port->invalidate();
}

TEST_F(UnixLocalPortTest, DestroyingAPortRunsNoHandlerAndGivesTheNameBack) {
  auto port = openPort("A");
  port->setInvalidationHandler([] { ADD_FAILURE(); });
  port.reset();
  EXPECT_FALSE(std::filesystem::exists(pathOf("A")));
  EXPECT_TRUE(openPort("A"));
}

TEST_F(UnixLocalPortTest, LosesItsNameWithItsFile) {
  const auto port = openPort("A");
  int invalidations = 0;
  port->setInvalidationHandler([&] { ++invalidations; });
  std::filesystem::remove(pathOf("A"));
  EXPECT_TRUE(turnUntil([&] { return invalidations != 0; }));
  EXPECT_FALSE(port->isValid());
  EXPECT_THAT(logTexts(), ElementsAre("Message port \"A\": its socket file is gone"));
}

TEST_F(UnixLocalPortTest, LosesItsNameToAnotherSocket) {
  const auto port = openPort("A");
  std::filesystem::remove(pathOf("A"));
  const RawListener thief(pathOf("A"));
  EXPECT_TRUE(turnUntil([&] { return !port->isValid(); }));
  EXPECT_TRUE(std::filesystem::exists(pathOf("A")));
}

TEST_F(UnixLocalPortTest, APeerThatClosesLeavesThePortValid) {
  const auto port = openPort("A");
  port->setInvalidationHandler([] { ADD_FAILURE(); });
  RawPeer peer = connectRaw("A");
  turnUntilIdle();
  peer.close();
  turnUntilIdle();
  EXPECT_TRUE(port->isValid());
}

// Handlers that end what they run in.

TEST_F(UnixLocalPortTest, MayBeDestroyedInItsMessageHandler) {
  std::shared_ptr<LocalPort> port;
  int calls = 0;
  const std::string kept(100, 'k');
  port = ports->createLocalPort("A",
                                [&, kept](std::int32_t, ByteView message) -> std::optional<Bytes> {
                                  port.reset();
                                  ++calls;
                                  EXPECT_EQ(kept, std::string(100, 'k'));
                                  EXPECT_EQ(textOf(message), "first");
                                  return bytesOf("dropped");
                                });
  RawPeer peer = connectRaw("A");
  peer.send(joined({frame(kRequest, 0, 1, "first"), frame(kMessage, 0, 0, "second")}));
  EXPECT_TRUE(turnUntil([&] { return calls != 0; }));
  turnUntilIdle();
  EXPECT_EQ(calls, 1);
  EXPECT_TRUE(peer.isAtEnd());
}

TEST_F(UnixLocalPortTest, MayBeInvalidatedAndOpenedAnewInItsMessageHandler) {
  std::shared_ptr<LocalPort> port;
  port = ports->createLocalPort("A", [&](std::int32_t, ByteView) -> std::optional<Bytes> {
    port->invalidate();
    port = openPort("A");
    return std::nullopt;
  });
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 0, 0, "reopen"));
  ASSERT_TRUE(turnUntil([&] { return peer.isAtEnd(); }));
  RawPeer next = connectRaw("A");
  next.send(frame(kMessage, 0, 0, "to the new one"));
  ASSERT_TRUE(turnUntilMessages(1));
  EXPECT_EQ(messages[0].text, "to the new one");
}

TEST_F(UnixLocalPortTest, MayBeDestroyedInItsInvalidationHandler) {
  auto port = openPort("A");
  port->setInvalidationHandler([&] { port.reset(); });
  port->invalidate();
  EXPECT_FALSE(port);
}

TEST_F(UnixLocalPortTest, MayBeDestroyedInTheHandlerThatTellsOfItsLoss) {
  auto port = openPort("A");
  port->setInvalidationHandler([&] { port.reset(); });
  std::filesystem::remove(pathOf("A"));
  EXPECT_TRUE(turnUntil([&] { return !port; }));
}

TEST_F(UnixLocalPortTest, AHandlerMayRunTheEventLoop) {
  int depth = 0;
  int deepest = 0;
  const auto port = ports->createLocalPort("A", [&](std::int32_t id, ByteView) {
    deepest = std::max(deepest, ++depth);
    messages.push_back({id, ""});
    turnUntilIdle();
    --depth;
    return std::nullopt;
  });
  RawPeer peer = connectRaw("A");
  for (std::uint32_t id = 0; id < 10; ++id) peer.send(frame(kMessage, id, 0, ""));
  ASSERT_TRUE(turnUntilMessages(10));
  EXPECT_EQ(deepest, 1);
  for (int id = 0; id < 10; ++id) EXPECT_EQ(messages[static_cast<std::size_t>(id)].id, id);
}

// Who sends.

/// Connects to the socket at `path` in a process of its own, sends `bytes` and stays.
class SendingChild {
 public:
  SendingChild(const std::filesystem::path& path, const Bytes& bytes) : _process(::fork()) {
    if (_process != 0) return;
    RawPeer peer = RawPeer::connectedTo(path);
    peer.send(bytes);
    for (;;) ::pause();
  }
  ~SendingChild() {
    ::kill(_process, SIGKILL);
    ::waitpid(_process, nullptr, 0);
  }
  SendingChild(const SendingChild&) = delete;
  SendingChild& operator=(const SendingChild&) = delete;

  [[nodiscard]] ProcessNumber process() const noexcept { return _process; }

 private:
  pid_t _process;
};

TEST_F(UnixLocalPortTest, KnowsTheSenderOfWhatItsHandlerAnswers) {
  std::shared_ptr<LocalPort> port;
  std::vector<ProcessNumber> senders;
  port = ports->createLocalPort("A", [&](std::int32_t, ByteView) -> std::optional<Bytes> {
    senders.push_back(port->sender());
    const bool isFirst = senders.size() == 1;
    EXPECT_TRUE(!isFirst || turnUntil([&] { return senders.size() >= 3; }));  // the other's turn
    senders.push_back(port->sender());
    return std::nullopt;
  });
  RawPeer mine = connectRaw("A");
  const SendingChild child(pathOf("A"), frame(kMessage, 0, 0, "x"));
  ASSERT_TRUE(turnUntil([&] {
    mine.send(frame(kMessage, 0, 0, "x"));
    return senders.size() >= 4;
  }));
  const std::vector<ProcessNumber> both = {::getpid(), child.process()};
  EXPECT_THAT(both, ::testing::Contains(senders[0]));
  EXPECT_THAT(both, ::testing::Contains(senders[1]));
  EXPECT_NE(senders[0], senders[1]);
  EXPECT_EQ(senders[1], senders[2]);
  EXPECT_EQ(senders[0], senders[3]);
  EXPECT_EQ(port->sender(), kUnknownProcess);
}

// Fairness and limits.

TEST_F(UnixLocalPortTest, ABusyPeerDoesNotHoldUpAnother) {
  std::size_t served = 0;
  bool otherServed = false;
  const auto port = ports->createLocalPort("A", [&](std::int32_t id, ByteView) {
    ++served;
    if (id == 2) otherServed = true;
    std::this_thread::sleep_for(100us);
    return std::nullopt;
  });
  RawPeer busy = connectRaw("A");
  Bytes flood;
  for (int i = 0; i < 2000; ++i) {
    const Bytes one = frame(kMessage, 1, 0, "x");
    flood.insert(flood.end(), one.begin(), one.end());
  }
  busy.send(flood);
  RawPeer other = connectRaw("A");
  other.send(frame(kMessage, 2, 0, "x"));
  ASSERT_TRUE(turnUntil([&] { return otherServed; }));
  EXPECT_LT(served, 1000U);
  EXPECT_TRUE(turnUntil([&] { return served == 2001; }));
}

TEST_F(UnixLocalPortTest, APeerThatReadsNoRepliesIsReadNoFurther) {
  reply = Bytes(512 * 1024, 'r');
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  for (std::uint32_t i = 1; i <= 100; ++i) peer.send(frame(kRequest, 0, i, ""));
  turnUntilIdle();
  EXPECT_LT(messages.size(), 10U);
  std::size_t received = 0;
  EXPECT_TRUE(turnUntil([&] {
    received += peer.receiveAvailable().size();
    return received == 100 * (16 + 512 * 1024);
  }));
  EXPECT_EQ(messages.size(), 100U);
}

TEST_F(UnixLocalPortTest, UnfinishedFramesShare64MiBAndTheLargestIsClosedBeyond) {
  const auto port = openPort("A");
  std::vector<RawPeer> peers;
  // Bytes of one frame; all but its last arrive.
  const auto leaveUnfinished = [&](std::size_t size) {
    Bytes bytes = frame(kMessage, 0, 0, std::string(size - 16, 'x'));
    bytes.pop_back();
    peers.push_back(connectRaw("A"));
    std::atomic<bool> isSent = false;
    std::thread sending([&] {
      peers.back().send(bytes);
      isSent = true;
    });
    EXPECT_TRUE(turnUntil([&] { return isSent.load(); }));
    sending.join();
    turnUntilIdle();
  };
  leaveUnfinished(15 * kMebibyte);
  leaveUnfinished(16 * kMebibyte);
  leaveUnfinished(15 * kMebibyte);
  leaveUnfinished(15 * kMebibyte);
  leaveUnfinished(3 * kMebibyte + 4);  // 64 MiB, less one byte
  EXPECT_THAT(log.lines(), IsEmpty());
  peers.push_back(connectRaw("A"));
  peers.back().send({1, 0});
  ASSERT_TRUE(turnUntil([&] { return !log.lines().empty(); }));
  EXPECT_THAT(
      logTexts(),
      ElementsAre("Message port \"A\": closing a connection: 16777215 bytes of a frame that "
                  "has not ended wait here, and 67108865 on all connections, at most "
                  "67108864 may"));
  EXPECT_TRUE(peers[1].isAtEnd());
  for (const std::size_t other : {0, 2, 3, 4}) peers[other].send({'x'});
  EXPECT_TRUE(turnUntilMessages(4));
  EXPECT_EQ(log.lines().size(), 1U);
}

/// The bytes of this process that are resident and its own.
std::size_t residentBytes() {
  std::ifstream statistics("/proc/self/statm");
  std::size_t size = 0;
  std::size_t resident = 0;
  std::size_t shared = 0;
  statistics >> size >> resident >> shared;
  return (resident - shared) * static_cast<std::size_t>(::getpagesize());
}

TEST_F(UnixLocalPortTest, AConnectionKeepsNoMemoryOfALongMessage) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "the sanitizers keep what is freed";
#endif
  std::size_t count = 0;
  const auto port = ports->createLocalPort("A", [&](std::int32_t, ByteView) {
    ++count;
    return std::optional<Bytes>();
  });
  const Bytes bytes = frame(kMessage, 0, 0, std::string(15 * kMebibyte, 'x'));
  const std::size_t before = residentBytes();
  std::vector<RawPeer> peers;
  for (std::size_t i = 1; i <= 20; ++i) {
    peers.push_back(connectRaw("A"));
    std::thread sending([&] { peers.back().send(bytes); });
    EXPECT_TRUE(turnUntil([&] { return count == i; }));
    sending.join();
    turnUntilIdle();
  }
  EXPECT_LT(residentBytes(), before + 64 * kMebibyte);
  EXPECT_THAT(log.lines(), IsEmpty());
}

/// Ports whose peers may leave a frame as it is for half a second.
class ImpatientPortTest : public UnixLocalPortTest {
 protected:
  ImpatientPortTest() {
    ports = createUnixMessagePorts(
        log,
        UnixMessagePortsOptions{.portDirectory = directory.path().string(), .patience = 500ms});
  }
};

TEST_F(ImpatientPortTest, AFrameThatDoesNotGoOnClosesItsConnection) {
  const auto port = openPort("A");
  RawPeer stalled = connectRaw("A");
  RawPeer slow = connectRaw("A");
  RawPeer idle = connectRaw("A");
  idle.send(frame(kMessage, 0, 0, "idle"));
  stalled.send({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 9, 0, 0, 0, 'x'});
  const Bytes whole = frame(kMessage, 0, 0, "slow");
  const auto begin = std::chrono::steady_clock::now();
  for (const std::uint8_t byte : whole) {  // 20 bytes, 100 ms apart
    slow.send({byte});
    const auto next = std::chrono::steady_clock::now() + 100ms;
    EXPECT_TRUE(turnUntil([&] { return std::chrono::steady_clock::now() >= next; }));
    const bool isEarly = std::chrono::steady_clock::now() - begin < 400ms;
    EXPECT_TRUE(!isEarly || log.lines().empty());
  }
  EXPECT_THAT(messages, ElementsAre(Message{0, "idle"}, Message{0, "slow"}));
  EXPECT_TRUE(stalled.isAtEnd());
  EXPECT_FALSE(idle.isAtEnd());
  EXPECT_THAT(logTexts(),
              ElementsAre("Message port \"A\": closing a connection: nothing of a frame that has "
                          "not ended came for 0.5 s"));
}

TEST_F(ImpatientPortTest, WhatArrivedWhileThisProcessStoodStillIsServed) {
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  const Bytes whole = frame(kMessage, 0, 0, "body");
  peer.send(Bytes(whole.begin(), whole.end() - 1));
  turnUntilIdle();
  peer.send({whole.back()});
  std::this_thread::sleep_for(700ms);
  EXPECT_TRUE(turnUntilMessages(1));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST(UnfinishedFrames, MayWaitTenSecondsForTheirNextByte) {
  EXPECT_EQ(UnixMessagePortsOptions().patience, 10s);
}

TEST_F(UnixLocalPortTest, WithoutDescriptorsItWaitsAndThenAccepts) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "the sanitizers take descriptors for themselves";
#endif
  const auto port = openPort("A");
  RawPeer peer = connectRaw("A");
  peer.send(frame(kMessage, 0, 0, "patient"));
  {
    const NoDescriptors none;
    for (int turn = 0; turn < 20; ++turn) QCoreApplication::processEvents();
  }
  EXPECT_THAT(logTexts(), ElementsAre(HasSubstr("cannot accept a connection")));
  EXPECT_TRUE(turnUntilMessages(1));
}

TEST_F(UnixLocalPortTest, DescriptorsAreClosedOnExec) {
  const auto port = openPort("A");
  const auto remote = ports->createRemotePort("A");
  RawPeer peer = connectRaw("A");
  turnUntilIdle();
  for (int descriptor = 3; descriptor < 64; ++descriptor) {
    struct stat status {};
    if (::fstat(descriptor, &status) != 0 || !S_ISSOCK(status.st_mode)) continue;
    EXPECT_NE(::fcntl(descriptor, F_GETFD) & FD_CLOEXEC, 0) << descriptor;
  }
}

}  // namespace
}  // namespace kestro::testing
