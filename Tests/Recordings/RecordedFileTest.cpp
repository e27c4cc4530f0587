// SPDX-License-Identifier: MIT
// Files as bytes: looking ahead, reading over, their end, and pipes.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <string>

#include "Recordings/RecordedFile.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using testing::TemporaryDirectory;

class RecordedFileTest : public ::testing::Test {
 protected:
  /// The name that the system gives the reading end of a pipe, into which `contents` were written.
  std::string pipeOf(std::string_view contents) {
    EXPECT_EQ(::pipe2(_pipe.data(), O_CLOEXEC), 0);
    EXPECT_EQ(::write(_pipe[1], contents.data(), contents.size()),
              static_cast<ssize_t>(contents.size()));
    ::close(_pipe[1]);
    return "/proc/self/fd/" + std::to_string(_pipe[0]);
  }
  void TearDown() override {
    if (_pipe[0] >= 0) ::close(_pipe[0]);
  }

  TemporaryDirectory _directory;
  std::array<int, 2> _pipe = {-1, -1};
};

TEST_F(RecordedFileTest, WhatIsSeenAheadStaysUnread) {
  auto file = RecordedFile::open(_directory.write("a", "abcdef")).value();
  EXPECT_THAT(file.ahead(6).value(), ElementsAre('a', 'b', 'c', 'd', 'e', 'f'));
  EXPECT_EQ(file.position(), 0U);
  file.take(2);
  EXPECT_EQ(file.position(), 2U);
  EXPECT_EQ(file.ahead(1).value().front(), 'c');
  std::array<std::uint8_t, 3> target{};
  EXPECT_EQ(file.read(target), 3U);
  EXPECT_THAT(target, ElementsAre('c', 'd', 'e'));
  EXPECT_EQ(file.position(), 5U);
}

TEST_F(RecordedFileTest, FewerBytesAheadAreTheEnd) {
  auto file = RecordedFile::open(_directory.write("a", "abc")).value();
  EXPECT_EQ(file.ahead(1'000'000'000).value().size(), 3U);
  EXPECT_EQ(file.passOver(7), 3U);
  EXPECT_TRUE(file.ahead(1).value().empty());
  std::array<std::uint8_t, 3> target{};
  EXPECT_EQ(file.read(target), 0U);
  EXPECT_EQ(file.position(), 3U);
}

TEST_F(RecordedFileTest, MoreThanOnePieceIsReadInOrder) {
  std::string contents;
  for (int i = 0; i < 300'000; ++i) contents += static_cast<char>(i % 251);
  auto file = RecordedFile::open(_directory.write("a", contents)).value();
  EXPECT_EQ(file.passOver(250'000), 250'000U);
  const auto bytes = file.ahead(50'000).value();
  EXPECT_EQ(std::string(bytes.begin(), bytes.begin() + 50'000), contents.substr(250'000));
}

TEST_F(RecordedFileTest, APipeIsReadToItsEnd) {
  auto file = RecordedFile::open(pipeOf("abc")).value();
  EXPECT_EQ(file.fractionRead(), std::nullopt);
  EXPECT_EQ(file.ahead(2).value().front(), 'a');
  EXPECT_EQ(file.passOver(9), 3U);
}

TEST_F(RecordedFileTest, HowMuchIsReadIsAFraction) {
  auto file = RecordedFile::open(_directory.write("a", "abcd")).value();
  EXPECT_EQ(file.ahead(4).value().size(), 4U);
  EXPECT_EQ(file.fractionRead(), 0.0);
  file.take(1);
  EXPECT_EQ(file.fractionRead(), 0.25);
  EXPECT_EQ(RecordedFile::open(_directory.write("empty", "")).value().fractionRead(), 1.0);
}

TEST_F(RecordedFileTest, TheSystemsReasonFollowsThePath) {
  const std::string missing = _directory.pathOf("none");
  EXPECT_EQ(RecordedFile::open(missing).error().message, missing + ": No such file or directory");
  auto directory = RecordedFile::open(_directory.pathOf("")).value();
  EXPECT_THAT(directory.ahead(1).error().message, EndsWith(": Is a directory"));
}

}  // namespace
}  // namespace kestro
