// SPDX-License-Identifier: MIT
// Files, pipes and standard input as streams of the running platform.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <optional>
#include <string>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/FileInputStreams.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MainQueue.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using ::testing::HasSubstr;
using testing::TemporaryDirectory;

class FileInputStreamsTest : public ::testing::Test {
 protected:
  /// Opens `path`; what arrives goes to `received`, and the end stops the loop.
  void open(const std::string& path) {
    auto opened = platform->inputStreams().open(
        path,
        [this](ByteView bytes) {
          received.append(bytes.begin(), bytes.end());
          ++pieces;
        },
        [this](std::string_view reason) {
          ended = reason;
          platform->quit(0);
        });
    ASSERT_TRUE(opened) << opened.error().message;
    stream = std::move(*opened);
  }
  [[nodiscard]] std::string refusal(const std::string& path) {
    const auto opened = platform->inputStreams().open(
        path, [](ByteView) {}, [](auto) {});
    return opened ? "(opened)" : opened.error().message;
  }
  void runFor(milliseconds time) {
    platform->mainQueue().postAfter(time, [this] { platform->quit(1); });
    platform->run();
  }

  TemporaryDirectory directory;
  std::unique_ptr<LinuxPlatform> platform = createLinuxPlatform(
      {.logThreshold = std::nullopt, .portDirectory = directory.path().string()});
  std::unique_ptr<InputStream> stream;
  std::string received;
  int pieces = 0;
  std::optional<std::string> ended;
};

TEST_F(FileInputStreamsTest, AFileArrivesWholeAndEnds) {
  std::string contents;
  for (int i = 0; i < 100'000; ++i) contents += std::to_string(i);
  open(directory.write("file", contents));
  platform->run();
  EXPECT_EQ(received, contents);
  EXPECT_EQ(ended, "");
}

TEST_F(FileInputStreamsTest, NothingArrivesInsideTheOpen) {
  open(directory.write("file", "x"));
  EXPECT_EQ(received, "");
}

TEST_F(FileInputStreamsTest, AnEmptyFileEnds) {
  open(directory.write("file", ""));
  platform->run();
  EXPECT_EQ(pieces, 0);
  EXPECT_EQ(ended, "");
}

TEST_F(FileInputStreamsTest, ALongFileLeavesTimersTheirTurn) {
  open(directory.write("file", std::string(std::size_t{8} * 1024 * 1024, 'x')));
  int piecesAtTick = 0;
  platform->mainQueue().postAfter(milliseconds(1), [&] { piecesAtTick = pieces; });
  platform->run();
  EXPECT_EQ(received.size(), std::size_t{8} * 1024 * 1024);
  EXPECT_LT(piecesAtTick, pieces);
}

TEST_F(FileInputStreamsTest, APipeDeliversWhatIsWrittenUntilItsWriterIsGone) {
  const std::string path = directory.path() / "pipe";
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  open(path);  // does not wait for a writer
  runFor(milliseconds(30));
  EXPECT_EQ(ended, std::nullopt);

  FileDescriptor writer(::open(path.c_str(), O_WRONLY | O_CLOEXEC));
  ASSERT_EQ(::write(writer.get(), "one", 3), 3);
  runFor(milliseconds(30));
  EXPECT_EQ(received, "one");
  EXPECT_EQ(ended, std::nullopt);

  ASSERT_EQ(::write(writer.get(), "two", 3), 3);
  writer.reset();
  platform->run();
  EXPECT_EQ(received, "onetwo");
  EXPECT_EQ(ended, "");
}

TEST_F(FileInputStreamsTest, DashIsStandardInputAndLeavesItOpen) {
  const FileDescriptor earlier(::dup(STDIN_FILENO));
  const FileDescriptor file(
      ::open(directory.write("file", "from input").c_str(), O_RDONLY | O_CLOEXEC));
  ::dup2(file.get(), STDIN_FILENO);
  open("-");
  platform->run();
  stream.reset();
  EXPECT_EQ(received, "from input");
  EXPECT_NE(::fcntl(STDIN_FILENO, F_GETFD), -1);
  EXPECT_EQ(::fcntl(STDIN_FILENO, F_GETFL) & O_NONBLOCK, 0);
  ::dup2(earlier.get(), STDIN_FILENO);
}

TEST_F(FileInputStreamsTest, ADestroyedStreamDeliversNoMore) {
  open(directory.write("file", "x"));
  stream.reset();
  runFor(milliseconds(20));
  EXPECT_EQ(received, "");
  EXPECT_EQ(ended, std::nullopt);
}

TEST_F(FileInputStreamsTest, AStreamMayBeDestroyedInItsOwnHandlers) {
  const std::string path = directory.write("file", "x");
  bool hasEnded = false;
  stream = *platform->inputStreams().open(
      path, [this](ByteView) { stream.reset(); }, [&](std::string_view) { hasEnded = true; });
  runFor(milliseconds(20));
  EXPECT_EQ(stream, nullptr);
  EXPECT_FALSE(hasEnded);

  stream = *platform->inputStreams().open(
      path, [](ByteView) {}, [this](std::string_view) { stream.reset(); });
  runFor(milliseconds(20));
  EXPECT_EQ(stream, nullptr);
}

TEST_F(FileInputStreamsTest, AReadThatFailsEndsTheStreamWithTheReason) {
  open("/proc/self/mem");  // nothing lies at address 0
  platform->run();
  EXPECT_EQ(pieces, 0);
  EXPECT_EQ(ended, "Input/output error");
}

TEST_F(FileInputStreamsTest, WhatCannotBeOpenedIsRefusedWithTheReason) {
  EXPECT_THAT(refusal(directory.path() / "nothing"), HasSubstr("nothing: No such file"));
  EXPECT_THAT(refusal(directory.path()), HasSubstr("Is a directory"));
}

}  // namespace
}  // namespace kestro
