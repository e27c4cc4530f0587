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
#include "Platform/Clock.h"
#include "Platform/LogSourceState.h"
#include "Platform/MainQueue.h"
#include "Platform/MessagePort.h"
#include "Platform/Platform.h"
#include "Platform/Result.h"
#include "Platform/TelephonyProtocol.h"
#include "TelephonyServer/LogChannel.h"
#include "TelephonyServer/LostChannels.h"
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
  void messageDue(ByteView message, Moment time) override;
  /// Tells the registered clients.
  void sourceEnded() override;

  /// What clients are told of the source; nothing, save that it has not ended, until this is
  /// called.
  void setSource(LogSourceState source);

  /// `handler` runs when the first channel has opened, and when the last one has closed.
  void setWatchHandler(std::function<void(bool isWatched)> handler) {
    _watchHandler = std::move(handler);
  }

  [[nodiscard]] std::size_t channelCount() const noexcept { return _channels.size(); }
  [[nodiscard]] std::size_t registrationCount() const noexcept { return _registrations.size(); }

 private:
  Server(Platform& platform, std::string_view name, std::string_view technology);
  [[nodiscard]] bool openPort();
  [[nodiscard]] std::optional<Bytes> answer(std::int32_t messageId, ByteView message);
  void registerClient(ByteView message);
  [[nodiscard]] Bytes createLogChannel(ByteView message);
  /// The reply to a request for a channel to the client's port of that name.
  [[nodiscard]] Dictionary channelReplyTo(const Dictionary& request, const std::string& localPort);
  /// A channel to the client's port of that name, open and kept; the error is the reply's.
  [[nodiscard]] tl::expected<LogChannel*, LogChannelError> openChannel(
      const std::string& localPort);
  /// Lets `channel` go on where the client's channel `previous` ended. How many messages that one
  /// has missed, if that is known.
  [[nodiscard]] std::optional<std::uint64_t> follow(LogChannel& channel, std::string_view previous);
  /// Closes and remembers the channels for which that holds.
  void closeChannels(const std::function<bool(LogChannel&)>& isOver);
  void notify(const Dictionary& body);
  /// Connects to a port that the client has named; the error says why that is not done.
  [[nodiscard]] Result<std::shared_ptr<RemotePort>> connectTo(const std::string& port) const;
  /// Whether the name is the server's own, or one of its channels'.
  [[nodiscard]] bool isOwnPort(std::string_view name) const;
  /// The dictionary that a message is; an empty one when it is none.
  [[nodiscard]] Dictionary dictionaryIn(ByteView message) const;
  void forgetWhoIsGone();
  void tellWhetherWatched();

  Platform& _platform;
  std::string _name;
  std::string_view _technology;
  std::shared_ptr<LocalPort> _port;
  std::unique_ptr<Timer> _timer;
  std::vector<std::unique_ptr<LogChannel>> _channels;
  LostChannels _lostChannels;
  LogSourceState _source{.hasEnded = false};
  std::function<void(bool isWatched)> _watchHandler;
  bool _isWatched = false;
  std::map<std::string, std::shared_ptr<RemotePort>, std::less<>> _registrations;
};

}  // namespace kestro
