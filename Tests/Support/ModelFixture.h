// SPDX-License-Identifier: MIT
// A model on the virtual platform beside a log channel that answers as told.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Model/KestroModel.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro::testing {

using namespace std::chrono_literals;

inline Bytes bytesOf(std::string_view text) { return {text.begin(), text.end()}; }

class ModelFixture : public ::testing::Test {
 protected:
  ModelFixture() {
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

  /// Sends a log message to the model's local port and lets it arrive.
  void sendLog(const Value& propertyList, std::int32_t messageId = 0) {
    const auto port = platform.messagePorts().createRemotePort(channelRequests.back());
    ASSERT_TRUE(port);
    ASSERT_EQ(port->post(messageId, *coding->xml(propertyList)), SendError::None);
    queue().runReady();
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
  int redraws = 0;
  std::shared_ptr<KestroModel> model = KestroModel::create(platform, [this] { ++redraws; });
};

}  // namespace kestro::testing
