// SPDX-License-Identifier: MIT
// Who is at the other end of a local socket.
#pragma once

#include <sys/types.h>

#include <optional>

#include "Platform/MessagePort.h"

namespace kestro {

/// A process as it was when the connection was made (for who listens: when it began to listen).
struct PortPeer {
  uid_t user;
  ProcessNumber process;
};

/// The peer of a connected AF_UNIX socket; absent when the system does not say.
[[nodiscard]] std::optional<PortPeer> peerOf(int socket);

}  // namespace kestro
