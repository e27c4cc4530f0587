// SPDX-License-Identifier: MIT
// Channels that were lost, and what they miss.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/MessagePort.h"
#include "TelephonyServer/ChannelCommand.h"

namespace kestro {

/// A channel that is no more, while its client may still ask for another in its place.
struct LostChannel {
  std::string portName = {};
  ProcessNumber client = kUnknownProcess;
  StartCommand command = {};  ///< what was wanted on it
  std::uint64_t missed = 0;   ///< messages that were wanted and have not left for the client
};

/// Remembers lost channels for 60 seconds, the last 512 of them, and counts what they miss.
class LostChannels {
 public:
  static constexpr unsigned kRememberedSeconds = 60;
  static constexpr std::size_t kMaximumChannels = 512;

  void remember(LostChannel channel);

  /// A message that every channel would get that wants it.
  void messageDue(ByteView message);

  /// From now on messages are of another kind. Which of them a channel would want that has asked
  /// for codes, nobody knows: these are forgotten.
  void technologyChanged();

  /// To be called once a second.
  void secondPassed();

  /// The lost channel of that name, if it was this client's, which is forgotten.
  [[nodiscard]] std::optional<LostChannel> take(std::string_view portName, ProcessNumber client);

 private:
  struct Remembered {
    LostChannel channel;
    unsigned seconds = 0;
  };
  std::deque<Remembered> _channels;
};

}  // namespace kestro
