// SPDX-License-Identifier: MIT
// Who is at the other end of a local socket.
#pragma once

#include <sys/types.h>

namespace kestro {

/// Whether the process at the other end of a connected AF_UNIX socket ran as `user` when the
/// connection was made (for who listens: when it began to listen).
[[nodiscard]] bool isPeerOfUser(int socket, uid_t user);

}  // namespace kestro
