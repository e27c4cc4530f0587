// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "Recordings/OutputPath.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

namespace fs = std::filesystem;

class OutputPathTest : public ::testing::Test {
 protected:
  OutputPathTest() { std::ofstream(path("a.pcap")) << "recording"; }

  [[nodiscard]] std::string path(const std::string& name) const { return directory.pathOf(name); }
  [[nodiscard]] bool isRefused(const std::string& output,
                               const std::vector<std::string>& inputs) const {
    return !checkOutputIsNoInput(output, inputs).has_value();
  }

  testing::TemporaryDirectory directory;
};

TEST_F(OutputPathTest, AnInputIsNoOutput) {
  const std::vector<std::string> inputs = {path("b.pcap"), path("a.pcap")};
  const auto checked = checkOutputIsNoInput(path("a.pcap"), inputs);
  ASSERT_FALSE(checked);
  EXPECT_EQ(checked.error().message, path("a.pcap") + ": the output would replace the input");
}

TEST_F(OutputPathTest, LinksAndOtherNamesDoNotHideAnInput) {
  fs::create_symlink(path("a.pcap"), path("symbolic.pcap"));
  fs::create_hard_link(path("a.pcap"), path("hard.pcap"));
  EXPECT_TRUE(isRefused(path("symbolic.pcap"), {path("a.pcap")}));
  EXPECT_TRUE(isRefused(path("hard.pcap"), {path("a.pcap")}));
  EXPECT_TRUE(isRefused(path("./a.pcap"), {path("a.pcap")}));
  EXPECT_TRUE(isRefused(path("a.pcap"), {path("symbolic.pcap")}));
}

TEST_F(OutputPathTest, OtherFilesAndNewOnesAreOutputs) {
  std::ofstream(path("b.pcap")) << "recording";
  EXPECT_FALSE(isRefused(path("b.pcap"), {path("a.pcap")}));
  EXPECT_FALSE(isRefused(path("new.pcap"), {path("a.pcap"), path("new.pcap")}));
}

TEST_F(OutputPathTest, ADeviceMayBeBoth) { EXPECT_FALSE(isRefused("/dev/null", {"/dev/null"})); }

TEST_F(OutputPathTest, WhatCouldNotBeCreatedIsRefused) {
  const auto problem = [](const std::string& output) {
    const auto checked = checkOutputCanBeCreated(output);
    return checked ? "" : checked.error().message;
  };
  EXPECT_EQ(problem(path("none/b.pcap")),
            path("none/b.pcap") + ": cannot create: No such file or directory");
  EXPECT_EQ(problem(path("a.pcap/b.pcap")),
            path("a.pcap/b.pcap") + ": cannot create: Not a directory");
  EXPECT_EQ(problem(path("")), path("") + ": cannot create: Is a directory");
  EXPECT_EQ(problem(path("a.pcap")), "");
  EXPECT_EQ(problem(path("b.pcap")), "");
  EXPECT_EQ(problem("b.pcap"), "");
  EXPECT_EQ(problem("-"), "");
  EXPECT_FALSE(fs::exists(path("b.pcap")));
}

TEST_F(OutputPathTest, AnUnwritableFileOrFolderIsRefused) {
  if (::geteuid() == 0) GTEST_SKIP() << "nothing is unwritable for root";
  fs::permissions(path("a.pcap"), fs::perms::owner_read);
  EXPECT_FALSE(checkOutputCanBeCreated(path("a.pcap")));
  fs::permissions(path(""), fs::perms::owner_read | fs::perms::owner_exec);
  EXPECT_FALSE(checkOutputCanBeCreated(path("b.pcap")));
  fs::permissions(path(""), fs::perms::owner_all);
}

TEST(OutputNameTest, AHyphenIsStandardOutput) {
  EXPECT_EQ(outputName("-"), "standard output");
  EXPECT_EQ(outputName("a-"), "a-");
}

}  // namespace
}  // namespace kestro
