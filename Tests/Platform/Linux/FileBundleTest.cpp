// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Platform/Linux/FileBundle.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::MatchesRegex;
using testing::TemporaryDirectory;

class FileBundleTest : public ::testing::Test {
 protected:
  TemporaryDirectory directory;
  FileBundle bundle{directory.path()};
};

TEST_F(FileBundleTest, ListsResourcesOfATypeInNameOrderWithTheirFolders) {
  directory.write("b.plist", "");
  directory.write("Templates/UTRAN.plist", "");
  directory.write("a.plist", "");
  directory.write("a.txt", "");
  directory.write("plist", "");
  std::filesystem::create_directory(directory.path() / "folder.plist");
  EXPECT_THAT(bundle.resourcesOfType("plist"),
              ElementsAre("Templates/UTRAN.plist", "a.plist", "b.plist"));
}

TEST_F(FileBundleTest, ReadsAResource) {
  directory.write("LTE.plist", std::string("a\0b\xFF\n", 5));
  EXPECT_EQ(bundle.resource("LTE", "plist"), (Bytes{'a', 0, 'b', 0xFF, '\n'}));
}

TEST_F(FileBundleTest, ReadsAnEmptyResource) {
  directory.write("empty.plist", "");
  EXPECT_EQ(bundle.resource("empty", "plist"), Bytes{});
}

TEST_F(FileBundleTest, ReadsAResourceOfAFolder) {
  directory.write("Templates/LTE.plist", "x");
  EXPECT_EQ(bundle.resource("Templates/LTE", "plist"), Bytes{'x'});
}

TEST_F(FileBundleTest, AResourceThatIsNotThereIsAbsent) {
  std::filesystem::create_directory(directory.path() / "folder.plist");
  EXPECT_EQ(bundle.resource("LTE", "plist"), std::nullopt);
  EXPECT_EQ(bundle.resource("folder", "plist"), std::nullopt);
}

TEST_F(FileBundleTest, AFolderThatIsNotThereHoldsNothing) {
  const FileBundle nowhere(directory.path() / "nowhere");
  EXPECT_THAT(nowhere.resourcesOfType("plist"), IsEmpty());
  EXPECT_EQ(nowhere.resource("LTE", "plist"), std::nullopt);
}

TEST_F(FileBundleTest, KnowsItsVersionAndBuildDate) {
  ASSERT_TRUE(bundle.version());
  EXPECT_THAT(*bundle.version(), MatchesRegex("[0-9]+\\.[0-9]+\\.[0-9]+"));
  EXPECT_THAT(bundle.buildDate(),
              MatchesRegex("[A-Z][a-z]{2} [ 1-3][0-9] 20[0-9]{2} [0-9]{2}:[0-9]{2}:[0-9]{2}"));
}

TEST_F(FileBundleTest, TheBuildTreesResourcesAreBesideTheExecutable) {
  const std::filesystem::path executable = std::filesystem::read_symlink("/proc/self/exe");
  EXPECT_EQ(FileBundle::resourcesOfProgram(), executable.parent_path() / "Resources");
}

}  // namespace
}  // namespace kestro
