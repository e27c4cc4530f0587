// SPDX-License-Identifier: MIT
// Reading the options at the end of a pcapng block.
#pragma once

#include <fmt/format.h>

#include "Platform/Result.h"
#include "Recordings/PcapngBlocks.h"

namespace kestro {

/// Calls `take(PcapngOption, PcapngBytes)`, which returns Result<void>, for each option until it
/// fails. The error says what is wrong, without a place.
template <class Take>
[[nodiscard]] Result<void> forEachPcapngOption(PcapngBytes options, const Take& take) {
  constexpr std::size_t kHead = 4;
  while (options.size() >= kHead) {
    const auto code = PcapngOption{options.u16(0)};
    const std::size_t length = options.u16(2);
    if (code == PcapngOption::End) return {};
    if (kHead + pcapngPadded(length) > options.size()) {
      return failure(
          fmt::format("an option of {} bytes where {} are left", length, options.size() - kHead));
    }
    if (auto taken = take(code, options.part(kHead, length)); !taken) return taken;
    options = options.from(kHead + pcapngPadded(length));
  }
  return {};
}

}  // namespace kestro
