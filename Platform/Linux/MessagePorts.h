// SPDX-License-Identifier: MIT
// Named message ports on AF_UNIX stream sockets, served by Qt's event loop.
#pragma once

#include <sys/types.h>

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "Platform/Linux/UnfinishedFrames.h"
#include "Platform/MessagePort.h"
#include "Platform/SystemLog.h"

namespace kestro {

struct UnixMessagePortsOptions {
  /// Where the sockets live; without a value the environment decides: $KESTRO_PORT_DIR, else
  /// $XDG_RUNTIME_DIR/kestro, else /tmp/kestro-<uid>.
  std::optional<std::string> portDirectory;
  /// The one user whose processes may be peers; without a value the process's effective user.
  std::optional<uid_t> peerUser = std::nullopt;
  /// How long a frame that has not ended may wait for its next byte.
  std::chrono::milliseconds patience = UnfinishedFrames::kPatience;
};

/// Ports of this process. They belong to the calling thread, which must run Qt's event loop; ports
/// may be let go of at any time, also in their own handlers, but not after `log` is gone.
[[nodiscard]] std::unique_ptr<MessagePorts> createUnixMessagePorts(
    SystemLog& log, const UnixMessagePortsOptions& options);

[[nodiscard]] inline std::unique_ptr<MessagePorts> createUnixMessagePorts(
    SystemLog& log, std::optional<std::string> portDirectory) {
  return createUnixMessagePorts(log,
                                UnixMessagePortsOptions{.portDirectory = std::move(portDirectory)});
}

}  // namespace kestro
