// SPDX-License-Identifier: MIT
// The server's command line.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <initializer_list>
#include <variant>
#include <vector>

#include "Platform/Virtual/VirtualServices.h"
#include "TelephonyServer/Options.h"
#include "Tests/Options/RowFaults.h"

namespace kestro {
namespace {

using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::variant<ServerOptions, OptionsText> parse(std::initializer_list<const char*> arguments) {
  std::vector<const char*> line{"kestro-telephonyd"};
  line.insert(line.end(), arguments);
  VirtualBundle bundle;
  bundle.setVersion("1.2.3");
  return parseServerOptions(bundle, static_cast<int>(line.size()), line.data());
}

ServerOptions options(std::initializer_list<const char*> arguments) {
  const auto parsed = parse(arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) {
    ADD_FAILURE() << text->text;
    return {};
  }
  return std::get<ServerOptions>(parsed);
}

OptionsText refusal(std::initializer_list<const char*> arguments) {
  const auto parsed = parse(arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return *text;
  ADD_FAILURE() << "accepted";
  return {};
}

TEST(OptionsTest, EveryRowExplainsItself) {
  const VirtualBundle bundle;
  ServerArguments arguments;
  EXPECT_THAT(rowFaults(serverProgram(bundle, arguments)), IsEmpty());
}

TEST(OptionsTest, WithoutOptionsTheSimulationRunsAtItsOwnPace) {
  const auto parsed = options({});
  EXPECT_EQ(parsed.source.kind, "simulation");
  EXPECT_EQ(parsed.source.argument, "");
  EXPECT_EQ(parsed.source.technology, "");
  EXPECT_EQ(parsed.playback.speed, 1.0);
  EXPECT_FALSE(parsed.playback.loop);
  EXPECT_EQ(parsed.portName, "TelephonyServer");
  EXPECT_EQ(parsed.logThreshold, LogPriority::Notice);
  EXPECT_FALSE(parsed.exitsWithParent);
}

TEST(OptionsTest, EveryOptionIsTaken) {
  const auto parsed =
      options({"--source=drive-test:a.csv", "--technology=LTE", "--speed=0.5", "--loop",
               "--name=Other", "--log-priority=7", "--exit-with-parent=42"});
  EXPECT_EQ(parsed.source.kind, "drive-test");
  EXPECT_EQ(parsed.source.argument, "a.csv");
  EXPECT_EQ(parsed.source.technology, "LTE");
  EXPECT_EQ(parsed.playback.speed, 0.5);
  EXPECT_TRUE(parsed.playback.loop);
  EXPECT_EQ(parsed.portName, "Other");
  EXPECT_EQ(parsed.logThreshold, LogPriority::Debug);
  EXPECT_TRUE(parsed.exitsWithParent);
  EXPECT_EQ(parsed.parent, 42);
}

TEST(OptionsTest, TheParentNeedsNoNumber) {
  const auto parsed = options({"--exit-with-parent", "--loop"});
  EXPECT_TRUE(parsed.exitsWithParent);
  EXPECT_EQ(parsed.parent, std::nullopt);
  EXPECT_TRUE(parsed.playback.loop);
}

TEST(OptionsTest, AModemHasOptionsOfItsOwn) {
  const auto parsed =
      options({"--source=modem:490154203237518", "--gps=gpsd:[::1]:1234", "--personal"});
  EXPECT_EQ(parsed.source.kind, "modem");
  EXPECT_EQ(parsed.source.argument, "490154203237518");
  EXPECT_EQ(parsed.source.gps, "gpsd:[::1]:1234");
  EXPECT_TRUE(parsed.source.isPersonal);
  EXPECT_FALSE(options({"--source=modem"}).source.isPersonal);
  EXPECT_TRUE(options({"--list-modems"}).listsModems);
  EXPECT_EQ(refusal({"--gps=gpsd"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--personal"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--source=modem", "--gps=film"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--source=modem:film"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--source=modem", "--technology=LTE"}).exitStatus, 2);
}

TEST(OptionsTest, WrongUsageIsStatusTwo) {
  EXPECT_EQ(refusal({"--source=simulation:film"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--source=capture"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--technology=5G"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--technology=auto"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--source=drive-test:a.csv", "--technology=UTRAN2"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--loop=5"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--name="}).exitStatus, 2);
  EXPECT_EQ(refusal({"--speed=0"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--speed=-1"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--speed=nan"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--speed=inf"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--speed=fast"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--name=a/b"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--log-priority=2"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--log-priority=8"}).exitStatus, 2);
  EXPECT_EQ(refusal({"--unknown"}).exitStatus, 2);
  EXPECT_EQ(refusal({"stray"}).exitStatus, 2);
}

TEST(OptionsTest, TheVersionIsTheBundles) {
  const auto version = refusal({"--version"});
  EXPECT_EQ(version.exitStatus, 0);
  EXPECT_EQ(version.text, "kestro-telephonyd 1.2.3\n");
}

TEST(OptionsTest, HelpDescribesEverySource) {
  const auto help = refusal({"--help"});
  EXPECT_EQ(help.exitStatus, 0);
  for (const auto& kind : sourceKinds()) {
    EXPECT_THAT(help.text, HasSubstr(std::string(kind.form)));
  }
  EXPECT_THAT(help.text, HasSubstr("made up"));
  EXPECT_THAT(help.text, HasSubstr("Examples:"));
}

}  // namespace
}  // namespace kestro
