// SPDX-License-Identifier: MIT
// The telephony server: clients, their registrations and their log channels.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/MainQueue.h"
#include "Platform/MessagePort.h"
#include "Platform/Platform.h"
#include "Platform/Result.h"
#include "Platform/TelephonyProtocol.h"
#include "TelephonyServer/LogChannel.h"
#include "TelephonyServer/Playback.h"

namespace kestro {

/// Serves clients on a named port, as Documentation/message-ports.md describes, and streams to
/// their log channels what a playback hands it. No client can hold up the server or another client:
/// one that does not read its messages loses its channel.
class Server : public PlaybackListener {
 public:
  /// How many log channels there can be at once, and how many registrations for notifications.
  static constexpr std::size_t kMaximumChannels = 512;
  static constexpr std::size_t kMaximumRegistrations = 512;
  /// How many descriptors that many clients take: each has its registration, its channel's port,
  /// the connections to both of its own ports, and, while it connects, one to the server's.
  static constexpr std::size_t kMaximumDescriptors = kMaximumRegistrations + 6 * kMaximumChannels;
  /// A longer message cannot wait for a client, and is left out for all of them.
  static constexpr std::size_t kMaximumStreamedMessage = std::size_t{4} * 1024 * 1024 - 16;

  /// Opens the server's port; the error says that another server owns the name, or that the port
  /// cannot be opened. `technology` (a constant text) is what the channels speak at first.
  /// `portLost` runs when the name is lost, after which no new client finds the server. The
  /// platform must outlive the server.
  [[nodiscard]] static Result<std::unique_ptr<Server>> open(Platform& platform,
                                                            std::string_view name,
                                                            std::string_view technology,
                                                            std::function<void()> portLost);

  /// Invalidates all channels, then notifies the registered clients.
  void technologyChanged(std::string_view technology) override;
  void messageDue(ByteView message) override;

  [[nodiscard]] std::size_t channelCount() const noexcept { return _channels.size(); }
  [[nodiscard]] std::size_t registrationCount() const noexcept { return _registrations.size(); }

 private:
  Server(Platform& platform, std::string_view name, std::string_view technology);
  [[nodiscard]] bool openPort();
  [[nodiscard]] std::optional<Bytes> answer(std::int32_t messageId, ByteView message);
  void registerClient(ByteView message);
  [[nodiscard]] Bytes createLogChannel(ByteView message);
  /// A channel to the client's port of that name, open and kept; the error is the reply's.
  [[nodiscard]] tl::expected<const LogChannel*, LogChannelError> openChannel(
      const std::string& localPort);
  /// Connects to a port that the client has named; the error says why that is not done.
  [[nodiscard]] Result<std::shared_ptr<RemotePort>> connectTo(const std::string& port) const;
  /// Whether the name is the server's own, or one of its channels'.
  [[nodiscard]] bool isOwnPort(std::string_view name) const;
  /// The port name under `key` in a dictionary; absent when there is none.
  [[nodiscard]] std::optional<std::string> portNameIn(ByteView message, std::string_view key) const;
  void forgetWhoIsGone();

  Platform& _platform;
  std::string _name;
  std::string_view _technology;
  std::shared_ptr<LocalPort> _port;
  std::unique_ptr<Timer> _timer;
  std::vector<std::unique_ptr<LogChannel>> _channels;
  std::map<std::string, std::shared_ptr<RemotePort>, std::less<>> _registrations;
};

}  // namespace kestro
