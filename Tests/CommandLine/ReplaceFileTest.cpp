// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "CommandLine/ReplaceFile.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

namespace fs = std::filesystem;
using testing::FileSizeLimit;
using testing::TemporaryFile;

class ReplaceFileTest : public ::testing::Test {
 protected:
  static void write(const std::string& path, std::string_view contents) {
    std::ofstream(path, std::ios::binary) << contents;
  }
  [[nodiscard]] std::size_t filesInDirectory() const {
    const fs::directory_iterator entries(file.directory());
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
  }

  TemporaryFile file{"file"};
};

// Whether the new file is in its place already or not: there is one file, and it is whole.
TEST_F(ReplaceFileTest, ASignalInTheMiddleLeavesNoPartBehind) {
  write(file.path(), "the earlier one");
  const std::string contents(64U << 20U, 'x');
  const pid_t child = ::fork();
  if (child == 0) ::_exit(replaceFile(file.path(), contents) ? 0 : 1);
  while (filesInDirectory() == 1 && fs::file_size(file.path()) < contents.size()) {
  }
  ::kill(child, SIGTERM);
  ::waitpid(child, nullptr, 0);
  EXPECT_EQ(filesInDirectory(), 1U);
  EXPECT_EQ(fs::file_size(file.path()), contents.size());
}

TEST_F(ReplaceFileTest, WritesAFileThatWasNotThere) {
  ASSERT_TRUE(replaceFile(file.path(), "new"));
  EXPECT_EQ(file.contents(), "new");
  EXPECT_EQ(filesInDirectory(), 1U);
}

TEST_F(ReplaceFileTest, ReplacesAFileAndKeepsItsMode) {
  write(file.path(), "the earlier one");
  fs::permissions(file.path(), fs::perms::owner_read | fs::perms::owner_write);
  ASSERT_TRUE(replaceFile(file.path(), "new"));
  EXPECT_EQ(file.contents(), "new");
  EXPECT_EQ(fs::status(file.path()).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_EQ(filesInDirectory(), 1U);
}

TEST_F(ReplaceFileTest, AFullDiskLeavesTheEarlierFileWhole) {
  write(file.path(), "earlier");
  const std::string contents(100'000, 'x');
  {
    const FileSizeLimit limit(50'000);
    const auto written = replaceFile(file.path(), contents);
    ASSERT_FALSE(written);
    EXPECT_EQ(written.error().message, file.path() + ": File too large");
  }
  EXPECT_EQ(file.contents(), "earlier");
  EXPECT_EQ(filesInDirectory(), 1U);
}

TEST_F(ReplaceFileTest, ALinkGoesOnLeadingToTheFile) {
  write(file.path(), "earlier");
  const std::string link = file.directory() + "/link";
  fs::create_symlink("file", link);
  ASSERT_TRUE(replaceFile(link, "new"));
  EXPECT_TRUE(fs::is_symlink(link));
  EXPECT_EQ(file.contents(), "new");
}

TEST_F(ReplaceFileTest, AMissingDirectoryIsNamed) {
  const auto written = replaceFile("/nowhere/file", "new");
  ASSERT_FALSE(written);
  EXPECT_EQ(written.error().message, "/nowhere/file: No such file or directory");
}

TEST_F(ReplaceFileTest, ADeviceIsWrittenToAsItIs) {
  const auto written = replaceFile("/dev/full", "new");
  ASSERT_FALSE(written);
  EXPECT_EQ(written.error().message, "/dev/full: No space left on device");
  EXPECT_TRUE(fs::is_character_file("/dev/full"));
}

}  // namespace
}  // namespace kestro
