// SPDX-License-Identifier: MIT
// Failed system calls as failures of ours.
#pragma once

#include <fmt/format.h>

#include <cerrno>
#include <string_view>
#include <system_error>

#include "Platform/Result.h"

namespace kestro {

/// "`what` `path`: " and the system's text for errno as the failed call left it.
[[nodiscard]] inline tl::unexpected<Error> systemFailure(std::string_view what,
                                                         std::string_view path) {
  const int number = errno;
  return failure(fmt::format("{} {}: {}", what, path, std::generic_category().message(number)));
}

}  // namespace kestro
