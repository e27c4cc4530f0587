// SPDX-License-Identifier: MIT
// A process whose parent ends.
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <filesystem>
#include <string>
#include <thread>
#include <utility>

#include "TelephonyServer/EndWithParent.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using testing::TemporaryDirectory;

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

TEST_F(EndWithParentTest, AnIgnoredParentsEndSendsNothing) {
  const pid_t parent = ::fork();
  if (parent == 0) {
    const pid_t self = ::getpid();
    if (::fork() != 0) ::pause();
    [[maybe_unused]] const bool ends = endWithParent(self);
    ignoreParentsEnd();
    [[maybe_unused]] auto written = ::write(_pipe[1], "x", 1);
    while (::getppid() == self) ::usleep(1'000);
    written = ::write(_pipe[1], "y", 1);
    ::_exit(0);
  }
  char byte = 0;
  ASSERT_EQ(::read(_pipe[0], &byte, 1), 1);
  ::kill(parent, SIGKILL);
  ::waitpid(parent, nullptr, 0);
  ::close(std::exchange(_pipe[1], -1));
  ASSERT_EQ(::read(_pipe[0], &byte, 1), 1);
  EXPECT_EQ(byte, 'y');
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

/// Runs `act` in a child of this process whose parent it is told, and waits for its end.
template <class Act>
void inChild(const Act& act) {
  const pid_t parent = ::getpid();
  const pid_t child = ::fork();
  if (child == 0) {
    act(parent);
    ::_exit(0);
  }
  ::waitpid(child, nullptr, 0);
}

std::string demoDirectoryIn(const TemporaryDirectory& directory) {
  const std::string path = directory.pathOf(std::string(kDemoDirectoryPrefix) + "1");
  std::filesystem::create_directory(path);
  return path;
}

TEST(OrphanedDirectoryTest, ALivingParentsIsLeft) {
  const TemporaryDirectory directory;
  const std::string path = demoDirectoryIn(directory);
  inChild([&](pid_t parent) { const OrphanedDirectory orphaned(path, parent); });
  EXPECT_TRUE(std::filesystem::exists(path));
}

TEST(OrphanedDirectoryTest, AnEndedParentsIsRemoved) {
  const TemporaryDirectory directory;
  const std::string path = demoDirectoryIn(directory);
  inChild([&](pid_t) { const OrphanedDirectory orphaned(path, 1'000'000'000); });
  EXPECT_FALSE(std::filesystem::exists(path));
}

TEST(OrphanedDirectoryTest, OneThatIsNotNamedAsADemosIsLeft) {
  const TemporaryDirectory directory;
  inChild([&](pid_t) { const OrphanedDirectory orphaned(directory.path(), 1'000'000'000); });
  EXPECT_TRUE(std::filesystem::exists(directory.path()));
}

/// A process whose first thread ends while another goes on: so is a killed one for a moment.
void endTheFirstThread() {
  std::thread([] {
    for (;;) ::pause();
  }).detach();
  ::syscall(SYS_exit, 0);
}

TEST_F(EndWithParentTest, TheDirectoryGoesWhileAKilledParentStillHasThreads) {
  const TemporaryDirectory directory;
  const std::string path = demoDirectoryIn(directory);
  const pid_t parent = ::fork();
  if (parent == 0) {
    const pid_t self = ::getpid();
    if (::fork() != 0) endTheFirstThread();
    ::usleep(200'000);
    { const OrphanedDirectory orphaned(path, self); }
    [[maybe_unused]] const auto written = ::write(_pipe[1], "x", 1);
    ::_exit(0);
  }
  char byte = 0;
  ASSERT_EQ(::read(_pipe[0], &byte, 1), 1);
  EXPECT_FALSE(std::filesystem::exists(path));
  ::kill(parent, SIGKILL);
  ::waitpid(parent, nullptr, 0);
}

}  // namespace
}  // namespace kestro
