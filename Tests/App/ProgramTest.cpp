// SPDX-License-Identifier: MIT
// The program as a process: its options, its signals and its ends.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <QImage>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "Tests/EndToEnd/LiveFixture.h"

namespace kestro::testing {
namespace {

using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::SizeIs;

class ProgramTest : public LiveTest {
 protected:
  using Environment = std::vector<std::pair<std::string, std::string>>;

  [[nodiscard]] std::string folder(const std::string& name) const {
    return source.directory() + "/" + name;
  }
  [[nodiscard]] Environment environment() const {
    return {{"KESTRO_PORT_DIR", folder("ports")},  {"TMPDIR", source.directory()},
            {"XDG_CONFIG_HOME", folder("config")}, {"XDG_DATA_HOME", folder("data")},
            {"XDG_RUNTIME_DIR", folder("none")},   {"KESTRO_DEVICE_ROOT", ""},
            {"DBUS_SESSION_BUS_ADDRESS", ""},      {"QT_QPA_PLATFORM", "offscreen"}};
  }
  std::unique_ptr<Process> startKestro(std::vector<std::string> arguments,
                                       const Environment& more = {}) {
    arguments.insert(arguments.begin(), "kestro");
    Environment all = environment();
    all.insert(all.end(), more.begin(), more.end());
    return std::make_unique<Process>(
        arguments, Process::Options{.environment = all, .terminal = Process::Terminal::None});
  }

  /// Writes three seconds of displays, then what no display can be made of; the file's path.
  [[nodiscard]] std::string writeEndingCapture() const {
    std::vector<std::string> messages(30, ifxMessage("1"));
    messages.insert(messages.end(), 10, "garbage");
    std::string capture = folder("ending.pcap");
    writeCapture(capture, messages, std::chrono::milliseconds(100));
    return capture;
  }

  [[nodiscard]] std::string contentsOf(const std::string& path) const {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
  }
  [[nodiscard]] std::string shellPreferences() const {
    return contentsOf(folder("config/kestro/preferences/org.lumo.Shell.ini"));
  }
  /// What is in the folder that snapshots are saved to.
  [[nodiscard]] std::vector<std::string> snapshots() const {
    const std::string saved = folder("data/kestro/device/var/mobile/Library/Logs/CrashReporter");
    std::vector<std::string> result;
    for (const auto& entry : std::filesystem::directory_iterator(saved)) {
      result.push_back(entry.path().string());
    }
    return result;
  }
};

TEST_F(ProgramTest, SignalsRunTheExit) {
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
    const auto kestro = startKestro({});
    ASSERT_TRUE(
        eventually([&] { return shellPreferences().find("RSSI=true") != std::string::npos; }));
    kestro->signal(signal);
    EXPECT_EQ(kestro->wait(), 0);
    EXPECT_THAT(shellPreferences(), HasSubstr("LumoShowGSMRSSI=false"));
  }
}

TEST_F(ProgramTest, TheFirstStartMakesADeviceOnWhichSavingIsPossible) {
  const auto kestro = startKestro({"--screenshot=" + folder("a.png"), "--after=0.1"});
  EXPECT_EQ(kestro->wait(), 0);
  EXPECT_THAT(snapshots(), SizeIs(0));
  EXPECT_TRUE(std::filesystem::exists(
      folder("data/kestro/device/NorrowInternal/Library/PreferenceBundles/Carrier "
             "Settings.bundle")));
}

TEST_F(ProgramTest, APictureOfTheDemoIsTakenAndNothingIsLeftBehind) {
  const std::string picture = folder("picture.png");
  const auto kestro =
      startKestro({"--demo", "--size=390x780", "--screenshot=" + picture, "--after=3.5"});
  EXPECT_EQ(kestro->wait(), 0) << kestro->errors();
  const QImage image(QString::fromStdString(picture));
  EXPECT_EQ(image.size(), QSize(390, 780));
  // Rows have come: their hairlines stand where there was one colour only.
  const int x = 195;
  int lines = 0;
  for (int y = 60; y < 700; ++y) lines += image.pixel(x, y) != image.pixel(x, 720) ? 1 : 0;
  EXPECT_GT(lines, 1);
  for (const auto& entry : std::filesystem::directory_iterator(source.directory())) {
    EXPECT_EQ(entry.path().string().find("kestro-demo"), std::string::npos) << entry.path();
  }
}

TEST_F(ProgramTest, APictureThatCannotBeWrittenSaysSo) {
  const auto kestro = startKestro({"--screenshot=/nowhere/a.png", "--after=0"});
  EXPECT_EQ(kestro->wait(), 1);
  EXPECT_THAT(kestro->errors(), EndsWith("kestro: cannot write the picture /nowhere/a.png\n"));
}

TEST_F(ProgramTest, WrongUsageIsRefusedAtOnce) {
  for (const char* wrong : {"--screenshot=/tmp/a.bogus", "--screenshot=/tmp/a",
                            "--demo=simulation:5G", "--after=nan", "--server="}) {
    const auto kestro = startKestro({"--screenshot=" + folder("a.png"), wrong});
    EXPECT_EQ(kestro->wait(), 2) << wrong;
    EXPECT_THAT(kestro->errors(), HasSubstr(std::string(wrong).substr(0, 6)));
  }
}

TEST_F(ProgramTest, ADemoThatCannotStartSaysWhy) {
  const auto kestro = startKestro({"--demo=capture:/nowhere.pcap"});
  EXPECT_EQ(kestro->wait(), 1);
  EXPECT_THAT(kestro->errors(), HasSubstr("kestro: the demo's telephony server: "));
  EXPECT_THAT(kestro->errors(), HasSubstr("/nowhere.pcap"));
}

TEST_F(ProgramTest, WrongUsageIsRefused) {
  const std::vector<std::vector<std::string>> wrong = {{"--size=390"},
                                                       {"--size=0x0"},
                                                       {"--size=axb"},
                                                       {"--server=a/b"},
                                                       {"--after=1"},
                                                       {"--unknown"},
                                                       {"--log-priority=2"},
                                                       {"--log-priority=8"},
                                                       {"--demo", "--server=A"},
                                                       {"--after=-1", "--screenshot=a.png"}};
  for (const auto& arguments : wrong) {
    EXPECT_EQ(startKestro(arguments)->wait(), 2) << arguments[0];
  }
}

TEST_F(ProgramTest, HelpNeedsNoDisplay) {
  const auto kestro = startKestro({"--help"}, {{"QT_QPA_PLATFORM", ""}, {"DISPLAY", ""}});
  EXPECT_EQ(kestro->wait(), 0);
  EXPECT_THAT(kestro->output(), HasSubstr("--screenshot"));
}

TEST_F(ProgramTest, TheVersionNamesTheProgram) {
  const auto kestro = startKestro({"--version"}, {{"QT_QPA_PLATFORM", ""}, {"DISPLAY", ""}});
  EXPECT_EQ(kestro->wait(), 0);
  EXPECT_THAT(kestro->output(), MatchesRegex("kestro [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

TEST_F(ProgramTest, WithoutADisplayItSaysSo) {
  const auto kestro =
      startKestro({}, {{"QT_QPA_PLATFORM", ""}, {"DISPLAY", ""}, {"WAYLAND_DISPLAY", ""}});
  EXPECT_EQ(kestro->wait(), 1);
  EXPECT_THAT(kestro->errors(), HasSubstr("kestro: there is no display here"));
}

TEST_F(ProgramTest, AFailureThatNothingCatchesIsNamedAndTheHistorySaved) {
  const auto kestro = startKestro({"--demo=capture:" + writeEndingCapture()});
  EXPECT_EQ(kestro->wait(), -SIGABRT);
  EXPECT_THAT(kestro->errors(),
              HasSubstr("kestro: ended by a failure: Could not deserialize the object "
                        "(LogGenerator/GSM/GSMLogGenerator, line 90)\n"));
  ASSERT_THAT(snapshots(), SizeIs(1));
  EXPECT_THAT(snapshots()[0], ::testing::ContainsRegex("/KestroSnapshot-[0-9]+\\.kestro$"));
  const std::string saved = contentsOf(snapshots()[0]);
  EXPECT_THAT(saved, HasSubstr("<string>Unexpected end</string>"));
  EXPECT_THAT(saved, HasSubstr("<key>DisplayState</key>"));
}

TEST_F(ProgramTest, AFailureThatNothingCatchesPutsTheShellBack) {
  const auto kestro = startKestro({"--demo=capture:" + writeEndingCapture()});
  ASSERT_TRUE(
      eventually([&] { return shellPreferences().find("RSSI=true") != std::string::npos; }));
  EXPECT_EQ(kestro->wait(), -SIGABRT);
  EXPECT_THAT(shellPreferences(), HasSubstr("LumoShowGSMRSSI=false"));
}

TEST_F(ProgramTest, LastWordsThatNobodyTakesDoNotHoldUpTheEnd) {
  // Standard error is a pipe that is full.
  const std::string pipe = folder("pipe");
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  const int end = ::open(pipe.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC);
  const std::string filling(4096, 'x');
  while (::write(end, filling.data(), filling.size()) > 0) continue;
  Process kestro({"/bin/sh", "-c",
                  "exec " KESTRO_PROGRAM_DIRECTORY "/kestro --demo=capture:'" +
                      writeEndingCapture() + "' 2>'" + pipe + "'"},
                 {.environment = environment(), .terminal = Process::Terminal::None});
  EXPECT_EQ(kestro.wait(), -SIGABRT);
  ::close(end);
}

TEST_F(ProgramTest, TheShellIsToldOnTheSessionBus) {
  const std::string heard = folder("heard");
  // The monitor writes of its own name as soon as it listens.
  const std::string script = "dbus-monitor --session \"interface='org.kestro.Preferences1'\" > '" +
                             heard + "' & until [ -s '" + heard +
                             "' ]; do sleep 0.05; done; " KESTRO_PROGRAM_DIRECTORY
                             "/kestro --screenshot='" +
                             folder("a.png") + "' --after=0.2; sleep 0.3; kill $!";
  Environment bus = environment();
  std::erase_if(bus, [](const auto& entry) { return entry.first == "DBUS_SESSION_BUS_ADDRESS"; });
  Process session({"/usr/bin/dbus-run-session", "--", "/bin/sh", "-c", script},
                  {.environment = bus, .terminal = Process::Terminal::None});
  session.wait();
  const std::string text = contentsOf(heard);
  const std::string signal =
      "path=/org/kestro/Preferences; interface=org.kestro.Preferences1; "
      "member=Changed";
  const auto first = text.find(signal);
  ASSERT_NE(first, std::string::npos) << text << session.errors();
  EXPECT_NE(text.find(signal, first + 1), std::string::npos);  // at launch and at exit
  EXPECT_THAT(text, HasSubstr("string \"org.lumo.Shell\"\n   string \"LumoShowGSMRSSI\""));
}

}  // namespace
}  // namespace kestro::testing
