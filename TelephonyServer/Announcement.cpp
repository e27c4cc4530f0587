// SPDX-License-Identifier: MIT
#include "TelephonyServer/Announcement.h"

#include <fmt/format.h>

#include "Platform/TelephonyProtocol.h"

namespace kestro {

std::string announcement(const LogSourceState& source, std::string_view technology,
                         std::string_view portName) {
  const bool isDefault = portName == kDefaultServerName;
  const std::string option = isDefault ? "" : fmt::format(" --server={}", portName);
  return fmt::format(
      "playing {} as {}, under the name {}; watch it with `kestro{}` or `kestro-cli "
      "watch{}`",
      sourceText(source), technology, portName, option, option);
}

}  // namespace kestro
