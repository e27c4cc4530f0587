// SPDX-License-Identifier: MIT
// Positions of a gpsd that says what the test says.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MainQueue.h"
#include "Platform/PositionService.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using testing::TemporaryDirectory;

/// A listening socket on a port of the system's choice.
class PlainGpsd {
 public:
  PlainGpsd() {
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof(address);
    _isListening = ::bind(_listener, reinterpret_cast<sockaddr*>(&address), size) == 0 &&
                   ::listen(_listener, 1) == 0 &&
                   ::getsockname(_listener, reinterpret_cast<sockaddr*>(&address), &size) == 0;
    _port = ntohs(address.sin_port);
  }
  ~PlainGpsd() {
    disconnect();
    ::close(_listener);
  }
  PlainGpsd(const PlainGpsd&) = delete;
  PlainGpsd& operator=(const PlainGpsd&) = delete;

  [[nodiscard]] bool isListening() const noexcept { return _isListening; }
  [[nodiscard]] PositionServer address() const { return {"127.0.0.1", std::to_string(_port)}; }
  void accept() { _client = ::accept(_listener, nullptr, nullptr); }
  void say(std::string_view line) const {
    static_cast<void>(::write(_client, line.data(), line.size()));
  }
  void disconnect() {
    if (_client >= 0) ::close(_client);
    _client = -1;
  }

 private:
  int _listener = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  int _client = -1;
  int _port = 0;
  bool _isListening = false;
};

class PositionServiceTest : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(gpsd.isListening()); }

  void follow(const PositionServer& server) {
    feed = platform->positionService().follow(
        server, {.moved = [this](const std::optional<PositionFix>& moved) { fix = moved; },
                 .failed = [this](std::string_view why) { reason = why; }});
  }
  bool runUntil(const std::function<bool()>& condition) {
    for (int i = 0; i < 1000 && !condition(); ++i) {
      platform->mainQueue().postAfter(milliseconds(10), [this] { platform->quit(0); });
      platform->run();
    }
    return condition();
  }

  TemporaryDirectory directory;
  std::unique_ptr<LinuxPlatform> platform = createLinuxPlatform(
      {.logThreshold = std::nullopt, .portDirectory = directory.path().string()});
  PlainGpsd gpsd;
  std::optional<PositionFix> fix;
  std::string reason;
  std::unique_ptr<PositionFeed> feed;
};

TEST_F(PositionServiceTest, AReportIsAPosition) {
  follow(gpsd.address());
  gpsd.accept();
  gpsd.say(R"({"class":"TPV","mode":3,"lat":51.5,"lon":-8.25,"altMSL":12.5,"speed":10.0,)"
           R"("track":90.5})"
           "\n");
  ASSERT_TRUE(runUntil([&] { return fix.has_value(); }));
  EXPECT_EQ(*fix, (PositionFix{51.5, -8.25, 12.5, 36.0, 90.5}));
}

TEST_F(PositionServiceTest, AReceiverThatLosesItsPositionHasNone) {
  follow(gpsd.address());
  gpsd.accept();
  gpsd.say("{\"class\":\"TPV\",\"mode\":2,\"lat\":51.5,\"lon\":-8.25}\n");
  ASSERT_TRUE(runUntil([&] { return fix.has_value(); }));
  EXPECT_EQ(*fix, (PositionFix{.latitude = 51.5, .longitude = -8.25}));
  gpsd.say("{\"class\":\"TPV\",\"mode\":1}\n");
  EXPECT_TRUE(runUntil([&] { return !fix.has_value(); }));
}

TEST_F(PositionServiceTest, AConnectionThatEndsIsNamedAndMadeAgain) {
  follow(gpsd.address());
  gpsd.accept();
  gpsd.disconnect();
  ASSERT_TRUE(runUntil([&] { return !reason.empty(); }));
  gpsd.accept();
  gpsd.say("{\"class\":\"TPV\",\"mode\":2,\"lat\":1.0,\"lon\":2.0}\n");
  EXPECT_TRUE(runUntil([&] { return fix.has_value(); }));
}

TEST_F(PositionServiceTest, AServerThatIsNotThereIsNamed) {
  follow({"127.0.0.1", "1"});
  EXPECT_TRUE(runUntil([&] { return !reason.empty(); }));
}

}  // namespace
}  // namespace kestro
