// SPDX-License-Identifier: MIT
// A process whose parent ends.
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>

#include "TelephonyServer/EndWithParent.h"

namespace kestro {
namespace {

/// The writing end of a pipe dies with the last process that has it open.
class EndWithParentTest : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_EQ(::pipe(_pipe.data()), 0); }
  void TearDown() override {
    for (const int end : _pipe) ::close(end);
  }
  /// Whether every other process with the writing end has ended within five seconds.
  bool othersEnd() {
    ::close(_pipe[1]);
    pollfd waiting{.fd = _pipe[0], .events = POLLIN, .revents = 0};
    char byte = 0;
    while (::poll(&waiting, 1, 5'000) == 1) {
      if (::read(_pipe[0], &byte, 1) == 0) return true;
    }
    return false;
  }

  std::array<int, 2> _pipe{};
};

TEST_F(EndWithParentTest, ItEndsWhenItsParentIsKilled) {
  const pid_t parent = ::fork();
  if (parent == 0) {
    if (::fork() == 0) {
      if (!endWithParent(std::nullopt)) ::_exit(1);
      [[maybe_unused]] const auto written = ::write(_pipe[1], "x", 1);
      for (;;) ::pause();
    }
    for (;;) ::pause();
  }
  char byte = 0;
  ASSERT_EQ(::read(_pipe[0], &byte, 1), 1);
  ::kill(parent, SIGKILL);
  ::waitpid(parent, nullptr, 0);
  EXPECT_TRUE(othersEnd());
}

TEST_F(EndWithParentTest, AParentThatHasEndedAlreadyIsNoticed) {
  const pid_t child = ::fork();
  if (child == 0) ::_exit(endWithParent(1'000'000'000) ? 1 : 0);
  int status = -1;
  ::waitpid(child, &status, 0);
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
}

TEST_F(EndWithParentTest, ALivingParentIsAccepted) {
  const pid_t self = ::getpid();
  const pid_t child = ::fork();
  if (child == 0) ::_exit(endWithParent(self) ? 0 : 1);
  int status = -1;
  ::waitpid(child, &status, 0);
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
}

}  // namespace
}  // namespace kestro
