// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortPeer.h"

#include <sys/socket.h>

namespace kestro {

std::optional<PortPeer> peerOf(int socket) {
  ucred credentials{};
  socklen_t length = sizeof(credentials);
  if (::getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &credentials, &length) != 0) return {};
  return PortPeer{credentials.uid, credentials.pid};
}

}  // namespace kestro
