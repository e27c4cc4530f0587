// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/TimeText.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

namespace kestro {

std::string isoTimeText(Moment moment) {
  const auto seconds = std::chrono::floor<std::chrono::seconds>(moment);
  return fmt::format("{:%Y-%m-%dT%H:%M:%S}.{:06}Z",
                     fmt::gmtime(static_cast<std::time_t>(seconds.time_since_epoch().count())),
                     (moment - seconds).count());
}

}  // namespace kestro
