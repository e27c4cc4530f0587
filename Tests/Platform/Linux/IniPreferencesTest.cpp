// SPDX-License-Identifier: MIT
// Preferences in files of a folder of the test's own, and their signal on buses of its own.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <chrono>
#include <fstream>
#include <iterator>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/IniPreferences.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualServices.h"
#include "Tests/Platform/Linux/ChildProcess.h"
#include "Tests/Support/ScopedEnvironment.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::Field;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using testing::ScopedEnvironment;
using testing::TemporaryDirectory;

constexpr std::string_view kKey = "LumoShowGSMRSSI";

class IniPreferencesTest : public ::testing::Test {
 protected:
  [[nodiscard]] std::string fileText(const std::string& name) const {
    std::ifstream file(folder / name);
    return {std::istreambuf_iterator<char>(file), {}};
  }
  [[nodiscard]] std::optional<bool> storedAs(const std::string& line) const {
    directory.write("kestro/preferences/a.ini", "[General]\n" + line + "\n");
    return preferences.boolean("a", "key");
  }

  TemporaryDirectory directory;
  std::filesystem::path folder = directory.path() / "kestro" / "preferences";
  RecordingSystemLog log;
  IniPreferences preferences{log, folder};
};

TEST_F(IniPreferencesTest, WhatWasNeverSetIsAbsent) {
  EXPECT_EQ(preferences.boolean(kKestroPreferencesDomain, kKey), std::nullopt);
  EXPECT_FALSE(std::filesystem::exists(folder));
}

TEST_F(IniPreferencesTest, WhatWasSetIsReadBackBeforeItIsStored) {
  preferences.setBoolean("a", "key", true);
  EXPECT_EQ(preferences.boolean("a", "key"), true);
  EXPECT_FALSE(std::filesystem::exists(folder / "a.ini"));
}

TEST_F(IniPreferencesTest, SynchronizeStoresTheDomainInItsFile) {
  preferences.setBoolean(kShellPreferencesDomain, kKey, true);
  preferences.setBoolean(kKestroPreferencesDomain, kKey, false);
  preferences.synchronize(kShellPreferencesDomain);
  EXPECT_EQ(fileText("org.lumo.Shell.ini"), "[General]\nLumoShowGSMRSSI=true\n");
  EXPECT_FALSE(std::filesystem::exists(folder / "org.kestro.Kestro.ini"));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(IniPreferencesTest, OtherKeysOfTheDomainAreKept) {
  directory.write("kestro/preferences/a.ini", "[General]\nother=text\nkey=false\n");
  preferences.setBoolean("a", "key", true);
  preferences.synchronize("a");
  EXPECT_THAT(fileText("a.ini"), HasSubstr("other=text\n"));
  EXPECT_EQ(IniPreferences(log, folder).boolean("a", "key"), true);
}

TEST_F(IniPreferencesTest, WhatAnotherProcessStoredIsSeen) {
  EXPECT_EQ(storedAs("key=true"), true);
  EXPECT_EQ(storedAs("key=false"), false);
}

TEST_F(IniPreferencesTest, WhatIsNoBooleanIsAbsent) {
  EXPECT_EQ(storedAs("key=perhaps"), std::nullopt);
  EXPECT_EQ(storedAs("key="), std::nullopt);
  EXPECT_EQ(storedAs("key=true, false"), std::nullopt);
  EXPECT_EQ(storedAs("\xFF\xFE=[[["), std::nullopt);
}

TEST_F(IniPreferencesTest, AStoreThatCannotBeWrittenLeavesALogLine) {
  const std::filesystem::path file = directory.write("file", "");
  IniPreferences nowhere(log, file / "below");
  nowhere.setBoolean("a", "key", true);
  nowhere.synchronize("a");
  EXPECT_THAT(log.lines(), ElementsAre(Field(&RecordingSystemLog::Line::text,
                                             "Unable to write preferences to " +
                                                 (file / "below" / "a.ini").native())));
}

TEST_F(IniPreferencesTest, TheFolderIsAmongTheUsersConfiguration) {
  const ScopedEnvironment config("XDG_CONFIG_HOME", "/config");
  EXPECT_EQ(IniPreferences::directoryFromEnvironment(), "/config/kestro/preferences");
}

/// Preferences of a running platform, as the session bus needs it.
class PreferencesSignalTest : public IniPreferencesTest {
 protected:
  [[nodiscard]] std::chrono::milliseconds timeToNotify() {
    const auto start = std::chrono::steady_clock::now();
    preferences.notifyChanged(kShellPreferencesDomain, kKey);
    return std::chrono::duration_cast<std::chrono::milliseconds>(std::chrono::steady_clock::now() -
                                                                 start);
  }
  [[nodiscard]] auto isLogged(const std::string& reason) const {
    return ElementsAre(
        Field(&RecordingSystemLog::Line::text,
              "Unable to tell that LumoShowGSMRSSI of org.lumo.Shell changed: " + reason));
  }

  std::unique_ptr<LinuxPlatform> platform = createLinuxPlatform(
      {.logThreshold = std::nullopt, .portDirectory = directory.path().string()});
  std::string busPath = directory.path() / "session-bus";
  ScopedEnvironment runtime{"XDG_RUNTIME_DIR", nullptr};
};

TEST_F(PreferencesSignalTest, ReachesListenersOnTheSessionBus) {
  const std::string address = "unix:path=" + busPath;
  ChildProcess daemon(
      {"dbus-daemon", "--session", "--nofork", "--print-address=1", "--address=" + address});
  ASSERT_TRUE(daemon.readUntil("\n"));
  ChildProcess monitor(
      {"dbus-monitor", "--address", address, "type='signal',interface='org.kestro.Preferences1'"});
  ASSERT_TRUE(monitor.readUntil("NameLost"));  // its last word before it listens
  const ScopedEnvironment bus("DBUS_SESSION_BUS_ADDRESS", address.c_str());

  preferences.notifyChanged(kShellPreferencesDomain, kKey);
  EXPECT_THAT(log.lines(), IsEmpty());
  ASSERT_TRUE(monitor.readUntil("string \"LumoShowGSMRSSI\"")) << monitor.output();
  EXPECT_THAT(monitor.output(),
              HasSubstr("path=/org/kestro/Preferences; interface=org.kestro.Preferences1; "
                        "member=Changed\n   string \"org.lumo.Shell\"\n"));
}

TEST_F(PreferencesSignalTest, WithoutASessionBusALineSaysSo) {
  const ScopedEnvironment bus("DBUS_SESSION_BUS_ADDRESS", nullptr);
  preferences.notifyChanged(kShellPreferencesDomain, kKey);
  EXPECT_THAT(log.lines(), isLogged("there is no session bus"));
}

TEST_F(PreferencesSignalTest, ABusThatIsGoneLeavesALine) {
  const ScopedEnvironment bus("DBUS_SESSION_BUS_ADDRESS", ("unix:path=" + busPath).c_str());
  preferences.notifyChanged(kShellPreferencesDomain, kKey);
  EXPECT_THAT(log.lines(), isLogged("the session bus cannot be reached"));
}

TEST_F(PreferencesSignalTest, ABusThatDoesNotAnswerIsWaitedForOnlyAMoment) {
  const ScopedEnvironment bus("DBUS_SESSION_BUS_ADDRESS", ("unix:path=" + busPath).c_str());
  FileDescriptor silent(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
  sockaddr_un address = {.sun_family = AF_UNIX, .sun_path = {}};
  busPath.copy(address.sun_path, sizeof(address.sun_path) - 1);
  ASSERT_EQ(::bind(silent.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)), 0);
  ASSERT_EQ(::listen(silent.get(), 1), 0);
  EXPECT_LT(timeToNotify(), std::chrono::milliseconds(5000));
  EXPECT_THAT(log.lines(), isLogged("the session bus does not answer"));
}

}  // namespace
}  // namespace kestro
