// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>

#include "Platform/Linux/FileDeviceRoot.h"
#include "Tests/Support/FileSizeLimit.h"
#include "Tests/Support/ScopedEnvironment.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using testing::FileSizeLimit;
using ::testing::HasSubstr;
using testing::ScopedEnvironment;
using testing::TemporaryDirectory;

class FileDeviceRootTest : public ::testing::Test {
 protected:
  [[nodiscard]] std::string contents(const char* name) const {
    std::ifstream file(directory.path() / name, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  TemporaryDirectory directory;
  FileDeviceRoot root{directory.path()};
};

TEST_F(FileDeviceRootTest, DevicePathsAreLookedUpUnderTheRoot) {
  directory.write("var/mobile/file", "x");
  EXPECT_TRUE(root.exists("/var/mobile/file"));
  EXPECT_TRUE(root.exists("/var/mobile"));
  EXPECT_TRUE(root.exists("/"));
  EXPECT_FALSE(root.exists("/var/mobile/other"));
  EXPECT_FALSE(root.exists("/var/mobile/file/below"));
}

TEST_F(FileDeviceRootTest, WritesAWholeFile) {
  const Bytes bytes = {'a', 0, 0xFF};
  EXPECT_TRUE(root.write("/file", bytes));
  EXPECT_EQ(contents("file"), std::string("a\0\xFF", 3));
}

TEST_F(FileDeviceRootTest, ReplacesALongerFileInPlace) {
  directory.write("file", "longer than what comes");
  std::filesystem::create_hard_link(directory.path() / "file", directory.path() / "link");
  EXPECT_TRUE(root.write("/file", Bytes{'x'}));
  EXPECT_EQ(contents("file"), "x");
  EXPECT_EQ(contents("link"), "x");
}

TEST_F(FileDeviceRootTest, MakesNoDirectory) {
  const Result<void> written = root.write("/no/such/file", Bytes{'x'});
  ASSERT_FALSE(written);
  EXPECT_THAT(written.error().message, HasSubstr("no/such/file: No such file or directory"));
  EXPECT_FALSE(root.exists("/no"));
}

TEST_F(FileDeviceRootTest, ADirectoryCannotBeWritten) {
  EXPECT_THAT(root.write("/", Bytes{'x'}).error().message, HasSubstr("Is a directory"));
}

TEST_F(FileDeviceRootTest, AFullDiskIsAnError) {
  std::filesystem::create_symlink("/dev/full", directory.path() / "file");
  const Result<void> written = root.write("/file", Bytes{'x'});
  ASSERT_FALSE(written);
  EXPECT_THAT(written.error().message, HasSubstr("No space left on device"));
}

TEST_F(FileDeviceRootTest, ADiskThatFillsUpInTheMiddleIsAnError) {
  const FileSizeLimit limit(1000);
  const Result<void> written = root.write("/file", Bytes(1001, 'x'));
  ASSERT_FALSE(written);
  EXPECT_THAT(written.error().message, HasSubstr("File too large"));
}

TEST_F(FileDeviceRootTest, TheEnvironmentChoosesTheRoot) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", "/somewhere/else");
  EXPECT_EQ(FileDeviceRoot::pathFromEnvironment(), "/somewhere/else");
}

TEST_F(FileDeviceRootTest, TheDefaultRootIsAmongTheUsersData) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", nullptr);
  const ScopedEnvironment data("XDG_DATA_HOME", "/data");
  EXPECT_EQ(FileDeviceRoot::pathFromEnvironment(), "/data/kestro/device");
}

TEST_F(FileDeviceRootTest, WithoutADataDirectoryTheDefaultRootIsBelowHome) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", nullptr);
  const ScopedEnvironment home("HOME", "/home/somebody");
  for (const char* value : {static_cast<const char*>(nullptr), "", "relative"}) {
    const ScopedEnvironment data("XDG_DATA_HOME", value);
    EXPECT_EQ(FileDeviceRoot::pathFromEnvironment(), "/home/somebody/.local/share/kestro/device");
  }
}

TEST_F(FileDeviceRootTest, CreateDefaultMakesWhatSavingNeeds) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", nullptr);
  const ScopedEnvironment data("XDG_DATA_HOME", directory.path().c_str());
  EXPECT_TRUE(FileDeviceRoot::createDefault());
  const FileDeviceRoot made(FileDeviceRoot::pathFromEnvironment());
  EXPECT_TRUE(made.exists("/var/mobile/Library/Logs/CrashReporter"));
  EXPECT_TRUE(made.exists("/NorrowInternal/Library/PreferenceBundles/Carrier Settings.bundle"));
}

TEST_F(FileDeviceRootTest, CreateDefaultLeavesARootThatExistsAlone) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", nullptr);
  const ScopedEnvironment data("XDG_DATA_HOME", directory.path().c_str());
  std::filesystem::create_directories(directory.path() / "kestro/device");
  EXPECT_TRUE(FileDeviceRoot::createDefault());
  EXPECT_TRUE(std::filesystem::is_empty(directory.path() / "kestro/device"));
}

TEST_F(FileDeviceRootTest, CreateDefaultLeavesAChosenRootAlone) {
  const std::string chosenRoot = directory.path() / "chosen";
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", chosenRoot.c_str());
  const ScopedEnvironment data("XDG_DATA_HOME", directory.path().c_str());
  EXPECT_TRUE(FileDeviceRoot::createDefault());
  EXPECT_TRUE(std::filesystem::is_empty(directory.path()));
}

TEST_F(FileDeviceRootTest, CreateDefaultSaysWhatItCannotMake) {
  const ScopedEnvironment chosen("KESTRO_DEVICE_ROOT", nullptr);
  const std::string file = directory.write("file", "");
  const ScopedEnvironment data("XDG_DATA_HOME", file.c_str());
  EXPECT_THAT(FileDeviceRoot::createDefault().error().message, HasSubstr("Not a directory"));
}

}  // namespace
}  // namespace kestro
