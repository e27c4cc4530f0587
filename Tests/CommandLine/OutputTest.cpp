// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "Tests/Support/TemporaryFile.h"

namespace kestro {
namespace {

using testing::TemporaryFile;

TEST(Output, WritesAFile) {
  const TemporaryFile file;
  {
    auto output = Output::create(file.path());
    ASSERT_TRUE(output);
    output->write("a");
    output->write("b");
  }
  EXPECT_EQ(file.contents(), "ab");
}

TEST(Output, SaysWhyAFileCannotBeCreated) {
  const auto output = Output::create("/nowhere/at/all");
  ASSERT_FALSE(output);
  EXPECT_EQ(output.error().message, "/nowhere/at/all: No such file or directory");
}

TEST(Output, RemembersThatTheDiskIsFull) {
  auto output = Output::create("/dev/full");
  ASSERT_TRUE(output);
  output->write("a");
  EXPECT_EQ(output->failureMessage(), "");
  output->flush();
  EXPECT_EQ(output->failureMessage(), "/dev/full: No space left on device");
  EXPECT_FALSE(output->readerIsGone());
}

TEST(OfflineServices, WritesSystemLogLinesAsJson) {
  const TemporaryFile file;
  OfflineServices services(*Output::create(file.path()));
  services.systemLog().write(LogPriority::Error, " ***** \"x\"\n");
  services.systemLog().log(LogPriority::Debug, "{}", 1);
  ASSERT_TRUE(services.finishLog());
  EXPECT_EQ(file.contents(),
            "{\"priority\":3,\"message\":\" ***** \\\"x\\\"\\n\"}\n"
            "{\"priority\":7,\"message\":\"1\"}\n");
}

TEST(OfflineServices, WithoutALogFileNoLineIsFormatted) {
  OfflineServices services;
  EXPECT_FALSE(services.systemLog().accepts(LogPriority{0}));
}

TEST(OfflineServices, SaysWhyTheLogCannotBeWritten) {
  OfflineServices services(*Output::create("/dev/full"));
  services.systemLog().write(LogPriority::Error, "x");
  const auto outcome = services.finishLog();
  ASSERT_FALSE(outcome);
  EXPECT_EQ(outcome.error().message, "/dev/full: No space left on device");
}

}  // namespace
}  // namespace kestro
