// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdio>
#include <string>

#include "Platform/Linux/StdioTextSink.h"

namespace kestro {
namespace {

TEST(StdioTextSink, WritesEachLineAtOnce) {
  std::array<int, 2> ends = {-1, -1};
  ASSERT_EQ(::pipe(ends.data()), 0);
  std::FILE* stream = ::fdopen(ends[1], "w");
  StdioTextSink(stream).writeLine("a line");
  std::array<char, 16> bytes = {};
  EXPECT_EQ(::read(ends[0], bytes.data(), bytes.size()), 7);
  EXPECT_EQ(std::string(bytes.data()), "a line\n");
  std::fclose(stream);
  ::close(ends[0]);
}

TEST(StdioTextSink, ALineWhoseReaderHasGoneIsDropped) {
  std::array<int, 2> ends = {-1, -1};
  ASSERT_EQ(::pipe(ends.data()), 0);
  std::FILE* stream = ::fdopen(ends[1], "w");
  ::close(ends[0]);
  const auto before = std::signal(SIGPIPE, SIG_DFL);
  StdioTextSink(stream).writeLine("nobody reads this");  // the signal would end the test
  sigset_t pending;
  ::sigpending(&pending);
  EXPECT_EQ(::sigismember(&pending, SIGPIPE), 0);
  std::signal(SIGPIPE, before);
  std::fclose(stream);
}

}  // namespace
}  // namespace kestro
