// SPDX-License-Identifier: MIT
#include "TelephonyServer/LostChannels.h"

#include <algorithm>
#include <utility>

namespace kestro {

void LostChannels::remember(LostChannel channel) {
  if (_channels.size() == kMaximumChannels) _channels.pop_front();
  _channels.push_back({std::move(channel)});
}

void LostChannels::messageDue(ByteView message) {
  for (auto& [channel, seconds] : _channels) {
    if (channel.command.filter.accepts(message)) ++channel.missed;
  }
}

void LostChannels::technologyChanged() {
  std::erase_if(_channels, [](const Remembered& entry) {
    return !entry.channel.command.filter.acceptsEverything();
  });
}

void LostChannels::secondPassed() {
  for (auto& entry : _channels) ++entry.seconds;
  std::erase_if(_channels,
                [](const Remembered& entry) { return entry.seconds > kRememberedSeconds; });
}

std::optional<LostChannel> LostChannels::take(std::string_view portName, ProcessNumber client) {
  const auto found = std::ranges::find_if(_channels, [&](const Remembered& entry) {
    return entry.channel.portName == portName && entry.channel.client == client;
  });
  if (found == _channels.end()) return std::nullopt;
  LostChannel channel = std::move(found->channel);
  _channels.erase(found);
  return channel;
}

}  // namespace kestro
