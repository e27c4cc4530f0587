// SPDX-License-Identifier: MIT
#include <fcntl.h>
#include <sys/socket.h>

#include <utility>

#include "Platform/Linux/PortFrameReader.h"
#include "Tests/Platform/Linux/PortFixture.h"

namespace kestro::testing {
namespace {

using FillStatus = PortFrameReader::FillStatus;

class PortFrameReaderTest : public ::testing::Test {
 protected:
  PortFrameReaderTest() {
    int pair[2] = {-1, -1};
    EXPECT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, pair), 0);
    _socket = FileDescriptor(pair[0]);
    EXPECT_EQ(::fcntl(_socket.get(), F_SETFL, O_NONBLOCK), 0);
    peer.emplace(FileDescriptor(pair[1]));
  }

  FillStatus fill() { return reader.fill(_socket.get()); }

  /// The next frame's body; nothing when there is no whole frame.
  std::optional<std::string> nextBody() {
    const auto next = reader.next();
    EXPECT_TRUE(next);
    if (!next || !*next) return std::nullopt;
    return textOf((*next)->body);
  }

  /// Sends `bytes` and fills until all of them have been read.
  void pass(const Bytes& bytes) {
    std::thread sending([&] { peer->send(bytes); });
    for (std::size_t before = reader.unreadBytes(); reader.unreadBytes() - before < bytes.size();) {
      if (fill() == FillStatus::NothingYet) std::this_thread::sleep_for(10us);
    }
    sending.join();
  }

  std::optional<RawPeer> peer;
  PortFrameReader reader{PortDirection::ToReceiver};

 private:
  FileDescriptor _socket;
};

TEST_F(PortFrameReaderTest, YieldsAFrame) {
  pass(frame(2, 5, 7, "hello"));
  const auto next = reader.next();
  ASSERT_TRUE(next && *next);
  EXPECT_EQ((*next)->header, (PortFrameHeader{PortFrameKind::Request, 5, 7, 5}));
  EXPECT_EQ(textOf((*next)->body), "hello");
}

TEST_F(PortFrameReaderTest, OneReadYieldsManyFrames) {
  peer->send(joined({frame(1, 0, 0, "a"), frame(1, 0, 0, ""), frame(1, 0, 0, "ccc")}));
  EXPECT_EQ(fill(), FillStatus::Data);
  EXPECT_EQ(nextBody(), "a");
  EXPECT_EQ(nextBody(), "");
  EXPECT_EQ(nextBody(), "ccc");
  EXPECT_EQ(nextBody(), std::nullopt);
}

TEST_F(PortFrameReaderTest, AFrameCutAnywhereWaitsForItsRest) {
  const Bytes whole = frame(1, 0, 0, "body");
  for (std::size_t cut = 1; cut < whole.size(); ++cut) {
    const auto middle = whole.begin() + static_cast<std::ptrdiff_t>(cut);
    pass(Bytes(whole.begin(), middle));
    EXPECT_EQ(nextBody(), std::nullopt) << cut;
    EXPECT_FALSE(reader.hasNext()) << cut;
    pass(Bytes(middle, whole.end()));
    EXPECT_TRUE(reader.hasNext()) << cut;
    EXPECT_EQ(nextBody(), "body") << cut;
  }
}

TEST_F(PortFrameReaderTest, AMalformedHeaderIsAnErrorBeforeItsBodyArrives) {
  pass(frame(9, 0, 0, ""));
  EXPECT_TRUE(reader.hasNext());
  EXPECT_FALSE(reader.next());
}

TEST_F(PortFrameReaderTest, FramesBeforeAMalformedOneAreYielded) {
  pass(joined({frame(1, 0, 0, "good"), frame(9, 0, 0, "")}));
  EXPECT_EQ(nextBody(), "good");
  EXPECT_FALSE(reader.next());
}

TEST_F(PortFrameReaderTest, TheEndOfTheStreamIsTold) {
  EXPECT_EQ(fill(), FillStatus::NothingYet);
  peer->close();
  EXPECT_EQ(fill(), FillStatus::End);
}

TEST_F(PortFrameReaderTest, AHeaderThatAnnouncesMuchTakesNoMemory) {
  pass({1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1});
  EXPECT_EQ(nextBody(), std::nullopt);
  pass({'x'});
  EXPECT_EQ(reader.capacity(), PortFrameReader::kReadSize);
}

TEST_F(PortFrameReaderTest, ALongFrameArrivesWholeAndItsMemoryIsGivenBack) {
  const std::string body(3 * 1024 * 1024 + 1, 'x');
  pass(frame(1, 0, 0, body));
  EXPECT_EQ(nextBody(), body);
  pass(frame(1, 0, 0, "short"));
  EXPECT_EQ(nextBody(), "short");
  EXPECT_EQ(reader.capacity(), PortFrameReader::kReadSize);
}

TEST_F(PortFrameReaderTest, TheBufferOfALongFrameIsNoLongerThanTheFrame) {
  const Bytes whole = frame(1, 0, 0, std::string(3 * 1024 * 1024 + 1, 'x'));
  pass(Bytes(whole.begin(), whole.end() - 1));
  EXPECT_EQ(reader.capacity(), whole.size());
  pass({whole.back()});
  EXPECT_TRUE(nextBody());
}

TEST_F(PortFrameReaderTest, NothingUnreadTakesNoMemory) {
  pass(frame(1, 0, 0, "short"));
  EXPECT_EQ(nextBody(), "short");
  reader.giveBackMemory();
  EXPECT_EQ(reader.capacity(), 0U);
  pass(frame(1, 0, 0, "next"));
  EXPECT_EQ(nextBody(), "next");
}

TEST_F(PortFrameReaderTest, ABeginningAfterALongFrameTakesLittleMemory) {
  const Bytes next = frame(1, 0, 0, "next");
  pass(joined(
      {frame(1, 0, 0, std::string(3 * 1024 * 1024, 'x')), Bytes(next.begin(), next.end() - 1)}));
  EXPECT_TRUE(nextBody());
  reader.giveBackMemory();
  EXPECT_EQ(reader.capacity(), PortFrameReader::kReadSize);
  pass({next.back()});
  EXPECT_EQ(nextBody(), "next");
}

TEST_F(PortFrameReaderTest, OneReadTakesABoundedAmount) {
  const Bytes whole = frame(1, 0, 0, std::string(2 * 1024 * 1024, 'x'));
  std::thread sending([&] { peer->send(whole); });
  for (std::size_t before = 0; before < whole.size(); before = reader.unreadBytes()) {
    if (fill() == FillStatus::NothingYet) std::this_thread::sleep_for(10us);
    EXPECT_LE(reader.unreadBytes() - before, PortFrameReader::kReadSize);
  }
  sending.join();
}

}  // namespace
}  // namespace kestro::testing
