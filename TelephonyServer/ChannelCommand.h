// SPDX-License-Identifier: MIT
// The commands that clients send on their log channels.
#pragma once

#include <variant>

#include "Platform/Bytes.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"
#include "TelephonyServer/CodeFilter.h"

namespace kestro {

/// Asks which technology the channel speaks.
struct GetTechnologyCommand {};

/// Starts the streaming of the messages that the filter accepts.
struct StartCommand {
  CodeFilter filter = {};
  bool wantsTimes = false;  ///< the source's time before each message
};

using ChannelCommand = std::variant<GetTechnologyCommand, StartCommand>;

/// The command in a message; the error says what the message is instead.
[[nodiscard]] Result<ChannelCommand> parseChannelCommand(const PropertyListCoding& coding,
                                                         ByteView message);

}  // namespace kestro
