// SPDX-License-Identifier: MIT
#include "Platform/Linux/PortPeer.h"

#include <sys/socket.h>

namespace kestro {

bool isPeerOfUser(int socket, uid_t user) {
  ucred credentials{};
  socklen_t length = sizeof(credentials);
  return ::getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &credentials, &length) == 0 &&
         credentials.uid == user;
}

}  // namespace kestro
