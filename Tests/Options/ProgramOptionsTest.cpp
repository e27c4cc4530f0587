// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "Options/ProgramOptions.h"
#include "Platform/Virtual/VirtualServices.h"
#include "Tests/Options/Parsing.h"

namespace kestro {
namespace {

using ::testing::HasSubstr;

TEST(ProgramOptionsTest, ALiveDisplayKnowsItsServerAndItsLog) {
  LiveOptions options;
  const CommandRow program = programOf(liveOptions(options));
  chosen(program, {"--server=Other", "--log-priority=3"});
  EXPECT_EQ(options.serverName, "Other");
  EXPECT_EQ(options.logThreshold, LogPriority::Error);
  EXPECT_EQ(options.demoSource, "");
}

TEST(ProgramOptionsTest, ADemoPlaysASimulationUnlessTold) {
  LiveOptions options;
  const CommandRow program = programOf(liveOptions(options));
  chosen(program, {"--demo"});
  EXPECT_EQ(options.demoSource, "simulation");
  chosen(program, {"--demo=capture:a.pcap"});
  EXPECT_EQ(options.demoSource, "capture:a.pcap");
}

TEST(ProgramOptionsTest, ADemoHasItsOwnServer) {
  LiveOptions options;
  EXPECT_EQ(refusal(programOf(liveOptions(options)), {"--demo", "--server=a"}),
            "--server excludes --demo");
}

TEST(ProgramOptionsTest, LogPrioritiesAreThreeToSeven) {
  LogPriority threshold = LogPriority::Notice;
  const CommandRow program = programOf({logPriorityOption(threshold)});
  EXPECT_THAT(refusal(program, {"--log-priority=2"}), HasSubstr("from 3 to 7"));
  EXPECT_THAT(refusal(program, {"--log-priority=8"}), HasSubstr("from 3 to 7"));
  chosen(program, {"--log-priority=7"});
  EXPECT_EQ(threshold, LogPriority::Debug);
}

TEST(ProgramOptionsTest, APortsNameIsChecked) {
  std::string port = "Server";
  const CommandRow program = programOf({portNameOption("--name", "", port)});
  const std::string longest(64, 'a');
  chosen(program, {"--name", longest.c_str()});
  EXPECT_EQ(port, longest);
  const std::string tooLong(65, 'a');
  EXPECT_THAT(refusal(program, {"--name", tooLong.c_str()}), HasSubstr("is no port name"));
  EXPECT_EQ(refusal(program, {"--name=a b"}),
            "--name: 'a b' is no port name (1 to 64 letters, digits, '.', '-', '_')");
}

TEST(ProgramOptionsTest, TheVersionIsTheBundles) {
  VirtualBundle bundle;
  bundle.setVersion("1.2.3");
  EXPECT_EQ(said(programOf({versionOption("program", bundle)}), {"--version"}).text,
            "program 1.2.3\n");
}

TEST(ProgramOptionsTest, ADemoHasASpeedAndMayLoop) {
  LiveOptions options;
  const CommandRow program = programOf(liveOptions(options));
  EXPECT_EQ(refusal(program, {"--speed=2"}), "--speed requires --demo");
  EXPECT_EQ(refusal(program, {"--loop"}), "--loop requires --demo");
  chosen(program, {"--demo", "--speed=2", "--loop"});
  EXPECT_EQ(options.demoSpeed, 2);
  EXPECT_TRUE(options.demoLoops);
}

}  // namespace
}  // namespace kestro
