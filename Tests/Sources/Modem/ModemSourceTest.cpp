// SPDX-License-Identifier: MIT
// A modem's source: when it says something, and what it asks of whom.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <string>

#include "Sources/Modem/ModemSource.h"
#include "Tests/Sources/Modem/VirtualModemManager.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;
using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using State = ModemServiceState;

class ModemSourceTest : public testing::ModemTest {};

TEST_F(ModemSourceTest, NobodyIsAskedWhileNobodyWatches) {
  addModem(0, 8);
  open();
  platform.modemService().setState(State::Present);
  pass(seconds(10));
  EXPECT_EQ(platform.modemService().connectionCount(), 0);
  EXPECT_THAT(messages, IsEmpty());
}

TEST_F(ModemSourceTest, OneMessageASecond) {
  addModem(0, 8);
  watch();
  messages.clear();
  pass(seconds(10));
  EXPECT_EQ(messages.size(), 10);
}

TEST_F(ModemSourceTest, AChangeIsShownAtOnce) {
  addModem(0, 8);
  watch();
  pass(milliseconds(300));
  messages.clear();
  change(0, kModem3gppInterface, {entry("RegistrationState", busUnsigned(2))});
  change(0, kModemInterface, {entry("State", busInteger(7))});
  pass(milliseconds(150));
  EXPECT_EQ(messages.size(), 1);
  EXPECT_EQ(shown("Registration", "State"), "searching");
  EXPECT_EQ(shown("Mode", "State"), "searching");
}

TEST_F(ModemSourceTest, AFloodOfChangesMakesTenMessagesASecond) {
  addModem(0, 8);
  watch();
  messages.clear();
  for (int i = 0; i < 1000; ++i) {
    change(0, kModemInterface, {entry("State", busInteger(8))});
    pass(milliseconds(1));
  }
  EXPECT_LE(messages.size(), 12);
}

TEST_F(ModemSourceTest, TheLocationIsAskedEverySecondAndTheCellsEveryTwo) {
  addModem(0, 8);
  watch();
  platform.modemService().forgetCalls();
  pass(seconds(10));
  EXPECT_EQ(callsOf("GetLocation"), 10);
  EXPECT_EQ(callsOf("GetCellInfo"), 5);
}

TEST_F(ModemSourceTest, NothingButTheRateIsEverChanged) {
  addModem(0, 8);
  watch();
  pass(seconds(10));
  for (const std::string& call : platform.modemService().calls()) {
    EXPECT_THAT(call, ::testing::AnyOf(HasSubstr("Get"), "Setup(1)"));
  }
}

TEST_F(ModemSourceTest, ADisabledModemIsAskedNothing) {
  addModem(0, 3);
  watch();
  EXPECT_THAT(platform.modemService().calls(), ElementsAre("Get(Version)", "GetManagedObjects"));
  EXPECT_EQ(shown("Mode", "State"), "disabled");
  EXPECT_EQ(shown("Mode", "Help"), "mmcli -m 0 --enable");
}

TEST_F(ModemSourceTest, ALockedModemSaysWhatItWants) {
  addModem(2, 2);
  objects[path(2)][std::string(kModemInterface)]["UnlockRequired"] = busUnsigned(2);
  objects[path(2)][std::string(kModemInterface)]["Sim"] =
      busPath("/org/freedesktop/ModemManager1/SIM/5");
  watch();
  EXPECT_EQ(shown("Mode", "State"), "locked: SIM PIN");
  EXPECT_EQ(shown("Mode", "Help"), "mmcli -i 5 --pin=PIN");
  EXPECT_EQ(shown("SIM", "Lock"), "SIM PIN");
}

TEST_F(ModemSourceTest, AFailedModemSaysWhy) {
  addModem(0, -1);
  objects[path(0)][std::string(kModemInterface)]["StateFailedReason"] = busUnsigned(2);
  watch();
  EXPECT_EQ(shown("Mode", "State"), "failed: the SIM is missing");
}

TEST_F(ModemSourceTest, WithoutABusItSaysSoAndGoesOnWhenThereIsOne) {
  addModem(0, 8);
  open();
  platform.modemService().setState(State::NoBus, "no socket");
  source->setWatched(true, {});
  pass(seconds(2));
  EXPECT_EQ(shown("Mode", "State"), "no system bus: no socket");
  platform.modemService().setState(State::Absent);
  pass(seconds(2));
  EXPECT_EQ(shown("Mode", "State"), "ModemManager is not running");
  EXPECT_EQ(shown("Mode", "Help"), "systemctl start ModemManager");
  platform.modemService().setState(State::Present);
  pass(seconds(2));
  EXPECT_EQ(shown("Mode", "State"), "registered");
  EXPECT_EQ(shown("Mode", "Help"), "");
}

TEST_F(ModemSourceTest, AServiceThatNeverAnswersIsNamedAndAskedAgain) {
  addModem(0, 8);
  open();
  platform.modemService().setAnswers(false);
  platform.modemService().setState(State::Present);
  source->setWatched(true, {});
  pass(seconds(5));
  EXPECT_EQ(shown("Mode", "State"), "waiting for ModemManager's answer");
  pass(seconds(7));
  EXPECT_EQ(shown("Mode", "State"), "ModemManager does not answer");
  platform.modemService().setAnswers(true);
  pass(seconds(12));
  EXPECT_EQ(shown("Mode", "State"), "registered");
}

TEST_F(ModemSourceTest, ARefusalOfThePolicyIsNamed) {
  addModem(0, 8);
  refusals["GetManagedObjects"] = "org.freedesktop.DBus.Error.AccessDenied";
  watch();
  EXPECT_EQ(shown("Mode", "State"), "no permission to ask ModemManager");
}

TEST_F(ModemSourceTest, WhatThisUserMayNotSeeIsNamed) {
  addModem(0, 8);
  refusals["GetLocation"] = "org.freedesktop.ModemManager1.Error.Core.Unauthorized";
  refusals["Setup"] = "org.freedesktop.ModemManager1.Error.Core.Unauthorized";
  refusals["GetCellInfo"] = "org.freedesktop.ModemManager1.Error.Core.Unsupported";
  watch();
  EXPECT_EQ(shown("Mode", "Not Reported"),
            "signal: no permission; cells: the modem does not report it; location: no permission");
}

TEST_F(ModemSourceTest, WhatTheModemCannotDoIsNotAskedAgain) {
  addModem(0, 8);
  refusals["GetCellInfo"] = "org.freedesktop.ModemManager1.Error.Core.Unsupported";
  refusals["GetLocation"] = "org.freedesktop.ModemManager1.Error.Core.Failed";
  watch();
  platform.modemService().forgetCalls();
  pass(seconds(100));
  EXPECT_EQ(callsOf("GetCellInfo"), 0);
  EXPECT_EQ(callsOf("GetLocation"), 10) << "a refusal is tried again, but rarely";
}

TEST_F(ModemSourceTest, AnOlderModemManagerIsNotAskedForCells) {
  addModem(0, 8);
  version = "1.18.12";
  watch();
  EXPECT_EQ(callsOf("GetCellInfo"), 0);
  EXPECT_THAT(shown("Mode", "Not Reported"), HasSubstr("ModemManager 1.18.12"));
}

TEST_F(ModemSourceTest, NoModemIsNamed) {
  watch();
  EXPECT_EQ(shown("Mode", "State"), "no modem");
  EXPECT_THAT(list("Neighbour Cells"), IsEmpty());
}

TEST_F(ModemSourceTest, AModemIsFollowedByItsIdentityUnderAnotherNumber) {
  addModem(0, 8);
  addModem(1, 8, "111111111111111");
  watch("0");
  EXPECT_EQ(shown("Mode", "Modem"), "0: Example Model X");
  remove(0);
  pass(seconds(1));
  EXPECT_EQ(shown("Mode", "State"), "the modem has gone");
  EXPECT_EQ(shown("Serving Cell", "MCC"), "");
  addModem(0, 8, "222222222222222");
  announce(0);
  pass(seconds(1));
  EXPECT_EQ(shown("Mode", "State"), "the modem has gone") << "another one with its number";
  addModem(7, 8);
  announce(7);
  pass(seconds(1));
  EXPECT_EQ(shown("Mode", "Modem"), "7: Example Model X");
}

TEST_F(ModemSourceTest, WithoutANameItIsTheFirstEnabledOneAndTheOthersAreListed) {
  addModem(0, 3, "111111111111111");
  addModem(10, 8, "333333333333333");
  addModem(2, 8, "222222222222222");
  watch();
  EXPECT_EQ(shown("Mode", "Modem"), "2: Example Model X");
  EXPECT_EQ(shown("Mode", "Other Modems"),
            "0: Example Model X, disabled; 10: Example Model X, registered");
}

TEST_F(ModemSourceTest, AModemIsFoundByItsPathAndByItsIdentity) {
  addModem(0, 8, "111111111111111");
  addModem(1, 8, "222222222222222");
  watch("222222222222222");
  EXPECT_EQ(shown("Mode", "Modem"), "1: Example Model X");
  source.reset();
  watch(path(1));
  EXPECT_EQ(shown("Mode", "Modem"), "1: Example Model X");
}

TEST_F(ModemSourceTest, AModemManagerThatStartsAgainIsReadAnew) {
  addModem(0, 8);
  watch();
  platform.modemService().setState(State::Absent);
  pass(seconds(2));
  EXPECT_EQ(shown("Mode", "State"), "ModemManager is not running");
  objects.clear();
  addModem(0, 3);
  platform.modemService().setState(State::Present);
  pass(seconds(2));
  EXPECT_EQ(shown("Mode", "State"), "disabled");
  platform.modemService().forgetCalls();
  rate = 0;
  change(0, kModemInterface, {entry("State", busInteger(8))});
  pass(seconds(2));
  EXPECT_EQ(callsOf("Setup(1)"), 1);
}

TEST_F(ModemSourceTest, MemoryStaysFlatOverAnHour) {
  addModem(0, 8);
  watch();
  for (int i = 0; i < 3600; ++i) {
    pass(seconds(1));
    messages.clear();
  }
  EXPECT_LE(platform.mainQueue().pending(), 8);
  EXPECT_THAT(lines, IsEmpty());
}

// --- The rate of the signal ----------------------------------------------------------------------

TEST_F(ModemSourceTest, ARateOfZeroIsRaisedAndGivenBack) {
  addModem(0, 8);
  watch();
  EXPECT_EQ(rate, 1);
  bool isDone = false;
  source->setWatched(false, [&] { isDone = true; });
  pass(seconds(1));
  EXPECT_TRUE(isDone);
  EXPECT_EQ(rate, 0);
  EXPECT_EQ(platform.modemService().connectionCount(), 0);
}

TEST_F(ModemSourceTest, ASlowRateIsRaisedAndGivenBack) {
  rate = 30;
  addModem(0, 8);
  watch();
  EXPECT_EQ(rate, 1);
  source->setWatched(false, {});
  pass(seconds(1));
  EXPECT_EQ(rate, 30);
}

TEST_F(ModemSourceTest, ARateOfOneIsLeftAlone) {
  rate = 1;
  addModem(0, 8);
  watch();
  source->setWatched(false, {});
  pass(seconds(1));
  EXPECT_EQ(callsOf("Setup(1)"), 0);
  EXPECT_EQ(rate, 1);
}

TEST_F(ModemSourceTest, ARateThatSomebodyElseHasSetIsLeftAlone) {
  addModem(0, 8);
  watch();
  rate = 5;
  source->setWatched(false, {});
  pass(seconds(1));
  EXPECT_EQ(rate, 5);
}

TEST_F(ModemSourceTest, TheRateIsReadAgainAfterEveryReturnToEnabled) {
  addModem(0, 8);
  watch();
  change(0, kModemInterface, {entry("State", busInteger(3))});
  rate = 0;
  pass(seconds(1));
  EXPECT_EQ(callsOf("Setup(1)"), 1);
  change(0, kModemInterface, {entry("State", busInteger(6))});
  pass(seconds(1));
  EXPECT_EQ(callsOf("Setup(1)"), 2);
}

TEST_F(ModemSourceTest, ARateOfAWrongTypeChangesNothing) {
  addModem(0, 8);
  wrongRate = busText("0");
  watch();
  EXPECT_EQ(callsOf("Setup(1)"), 0);
  EXPECT_THAT(lines, ElementsAre("ModemManager's Modem.Signal Rate is left out: it has the type s, "
                                 "not u"));
}

TEST_F(ModemSourceTest, WatchingAgainBeforeTheRateIsGivenBackGoesOn) {
  addModem(0, 8);
  watch();
  bool isDone = false;
  source->setWatched(false, [&] { isDone = true; });
  source->setWatched(true, {});
  pass(seconds(3));
  EXPECT_FALSE(isDone);
  EXPECT_EQ(rate, 1);
  EXPECT_EQ(shown("Mode", "State"), "registered");
}

// --- Positions -----------------------------------------------------------------------------------

TEST_F(ModemSourceTest, PositionsOfAGpsdAreShownWithTheirSource) {
  addModem(0, 8);
  open("", PositionServer{"host", "1234"});
  watch();
  EXPECT_EQ(platform.positionService().server().port, "1234");
  EXPECT_EQ(shown("Position", "Source"), "gpsd host:1234: no position yet");
  platform.positionService().move(PositionFix{51.887634, -8.5, 12.0, 36.0, 90.0});
  pass(seconds(1));
  EXPECT_EQ(shown("Position", "Latitude"), "51.887634");
  EXPECT_EQ(shown("Position", "Longitude"), "-8.500000");
  EXPECT_EQ(shown("Position", "Speed"), "36.0 km/h");
  EXPECT_EQ(shown("Position", "Source"), "gpsd host:1234");
  platform.positionService().fail("gone");
  pass(seconds(1));
  EXPECT_EQ(shown("Position", "Latitude"), "");
  EXPECT_EQ(shown("Position", "Source"), "gpsd host:1234: gone");
  source->setWatched(false, {});
  pass(seconds(1));
  EXPECT_FALSE(platform.positionService().isFollowed());
}

TEST_F(ModemSourceTest, TheModemsOwnPositionIsShown) {
  addModem(0, 8);
  location = busEntries("a{uv}", {{busUnsigned(2), map({entry("latitude", busReal(51.5)),
                                                        entry("longitude", busReal(-8.25))})}});
  watch();
  EXPECT_EQ(shown("Position", "Latitude"), "51.500000");
  EXPECT_EQ(shown("Position", "Source"), "the modem");
}

}  // namespace
}  // namespace kestro
