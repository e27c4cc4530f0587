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

/// What comes to standard error of a line of the system log and one of a decoder.
std::string shownBy(OfflineServices& services) {
  ::testing::internal::CaptureStderr();
  services.systemLog().write(LogPriority::Warning, "warning");
  services.systemLog().write(LogPriority::Notice, "notice");
  services.forGenerator().standardOutput.writeLine("decoder");
  services.forGenerator().consoleLog.writeLine("console");
  return ::testing::internal::GetCapturedStderr();
}

TEST(OfflineServices, SayNothingUnlessAsked) {
  OfflineServices services;
  EXPECT_EQ(shownBy(services), "");
}

TEST(OfflineServices, ShowLinesUpToAPriorityAndThoseOfDecoders) {
  OfflineServices services(std::nullopt, LogPriority::Warning);
  EXPECT_EQ(shownBy(services), "warning\ndecoder\nconsole\n");
}

TEST(OfflineServices, WithALogFileShowThoseOfDecoders) {
  const TemporaryFile file;
  OfflineServices services(*Output::create(file.path()));
  EXPECT_EQ(shownBy(services), "decoder\nconsole\n");
}

TEST(OfflineServices, AFileHasEveryLineWhateverIsShown) {
  const TemporaryFile file;
  OfflineServices services(*Output::create(file.path()), LogPriority::Error);
  EXPECT_EQ(shownBy(services), "decoder\nconsole\n");
  ASSERT_TRUE(services.finishLog());
  EXPECT_EQ(file.contents(),
            "{\"priority\":4,\"message\":\"warning\"}\n{\"priority\":5,\"message\":\"notice\"}\n");
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
