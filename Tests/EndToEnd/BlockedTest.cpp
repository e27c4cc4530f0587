// SPDX-License-Identifier: MIT
// Programs whose output nobody takes are asked to end.
#include <fcntl.h>
#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include "Tests/EndToEnd/LiveFixture.h"

namespace kestro::testing {
namespace {

/// How long a program may take to end: what it does in the end is little, the machine may be busy.
constexpr std::chrono::seconds kAtOnce{5};

class BlockedTest : public LiveTest, public ::testing::WithParamInterface<int> {
 protected:
  [[nodiscard]] std::string pipePath() const { return source.directory() + "/pipe"; }

  /// Expects that the process ends soon after the signal.
  static void expectEndAfter(Process& process, int signal) {
    process.signal(signal);
    const auto begin = std::chrono::steady_clock::now();
    process.wait();
    EXPECT_LT(std::chrono::steady_clock::now() - begin, kAtOnce);
  }

  /// Starts a command whose standard output is a pipe that takes nothing, waits until that blocks
  /// it, and expects that it ends soon after the signal.
  void expectEndIntoFullPipe(const std::string& command, int signal) {
    ASSERT_EQ(::mkfifo(pipePath().c_str(), 0600), 0);
    const int reader = ::open(pipePath().c_str(), O_RDWR);  // keeps the pipe open, takes nothing
    ASSERT_GE(reader, 0);
    ::fcntl(reader, F_SETPIPE_SZ, 4096);
    const auto process = start({"/bin/sh", "-c",
                                fmt::format("exec \"{}\"/kestro-cli {} > {}",
                                            KESTRO_PROGRAM_DIRECTORY, command, pipePath())});
    // A pipe that is full takes no byte more.
    const std::vector<char> filling(4096, 'x');
    ::fcntl(reader, F_SETFL, O_NONBLOCK);
    while (::write(reader, filling.data(), filling.size()) > 0) {
    }
    EXPECT_TRUE(eventually([&] { return isBlocked(process->id()); }));
    expectEndAfter(*process, signal);
    ::close(reader);
  }

  /// Whether the process sleeps in a system call for half a second.
  static bool isBlocked(pid_t process) {
    for (int i = 0; i < 50; ++i) {
      std::this_thread::sleep_for(std::chrono::milliseconds(10));
      std::ifstream wait("/proc/" + std::to_string(process) + "/wchan");
      std::string where;
      wait >> where;
      if (where.find("pipe") == std::string::npos && where.find("partner") == std::string::npos)
        return false;
    }
    return true;
  }
};

TEST_P(BlockedTest, WatchIntoAPipeThatNobodyReadsEnds) {
  startServer();
  expectEndIntoFullPipe("watch --format=ndjson", GetParam());
}

TEST_P(BlockedTest, RecordIntoAPipeThatNobodyReadsEnds) {
  startServer();
  expectEndIntoFullPipe("record -o -", GetParam());
}

TEST_P(BlockedTest, RecordToANamedPipeWithoutAReaderEnds) {
  ASSERT_EQ(::mkfifo(pipePath().c_str(), 0600), 0);
  startServer();
  const auto record = start({"kestro-cli", "record", "-o", pipePath()});
  EXPECT_TRUE(eventually([&] { return isBlocked(record->id()); }));
  expectEndAfter(*record, GetParam());
}

INSTANTIATE_TEST_SUITE_P(Signals, BlockedTest, ::testing::Values(SIGINT, SIGTERM));

}  // namespace
}  // namespace kestro::testing
