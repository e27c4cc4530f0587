// SPDX-License-Identifier: MIT
// The telephony server's end of a log channel on the virtual platform; it answers as told.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro::testing {

using namespace std::chrono_literals;

inline Bytes bytesOf(std::string_view text) { return {text.begin(), text.end()}; }

class LogChannelFixture : public ::testing::Test {
 protected:
  LogChannelFixture() {
    openChannel();
    platform.telephonyService().setChannelHandler([this](std::string_view localPort) {
      channelRequests.emplace_back(localPort);
      return channelReply;
    });
  }

  /// Opens the server's end of the log channel under the name "Channel".
  void openChannel() {
    channel = platform.messagePorts().createLocalPort(
        "Channel", [this](std::int32_t id, ByteView message) -> std::optional<Bytes> {
          commandIds.push_back(id);
          commands.emplace_back(message.begin(), message.end());
          return technologyReply;
        });
  }

  /// The reply to "GetTechnology" that names a technology.
  Bytes technologyAnswer(std::string_view technology) {
    return *coding->xml(Dictionary{{"GetTechnology", technology}});
  }

  void answerTechnology(std::string_view technology) {
    technologyReply = technologyAnswer(technology);
  }

  /// The server is gone, and its end of the channel with it.
  void loseServer() {
    platform.telephonyService().setReachable(false);
    channel.reset();
  }
  void bringServerBack() {
    platform.telephonyService().setReachable(true);
    openChannel();
  }

  /// Sends a message to the local port of the last client that asked for the channel, and lets it
  /// arrive.
  void send(ByteView message, std::int32_t messageId = 0) {
    const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
    ASSERT_TRUE(port);
    ASSERT_EQ(port->post(messageId, message), SendError::None);
    queue().runReady();
  }
  void sendLog(const Value& propertyList, std::int32_t messageId = 0) {
    send(*coding->xml(propertyList), messageId);
  }

  VirtualMainQueue& queue() { return platform.mainQueue(); }

  /// The texts of the error lines since the last call.
  std::vector<std::string> errors() {
    std::vector<std::string> result;
    for (const auto& line : platform.systemLog().take()) {
      if (line.priority == LogPriority::Error) result.push_back(line.text);
    }
    return result;
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::shared_ptr<LocalPort> channel;
  std::vector<std::string> channelRequests;
  LogChannelReply channelReply{0, "Channel"};
  std::vector<Bytes> commands;
  std::vector<std::int32_t> commandIds;
  std::optional<Bytes> technologyReply = technologyAnswer("IFX");
};

}  // namespace kestro::testing
