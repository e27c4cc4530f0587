// SPDX-License-Identifier: MIT
// Which log messages a client has asked for.
#pragma once

#include <vector>

#include "LogGenerator/Packets/Section.h"
#include "Platform/Bytes.h"

namespace kestro {

class CodeFilter {
 public:
  /// Accepts every message.
  CodeFilter() = default;
  /// Accepts the messages with one of these codes; extra codes have their offset.
  explicit CodeFilter(std::vector<LogCode> codes);

  [[nodiscard]] bool acceptsEverything() const noexcept { return _acceptsEverything; }

  /// Whether the message is wanted. A message that is too short to have a code is wanted only if
  /// all messages are.
  [[nodiscard]] bool accepts(ByteView message) const noexcept;

 private:
  bool _acceptsEverything = true;
  std::vector<LogCode> _codes;
};

}  // namespace kestro
