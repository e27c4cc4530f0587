// SPDX-License-Identifier: MIT
// What this process holds of the machine, as the system counts it.
#pragma once

#include <cstddef>

namespace kestro::soak {

/// Bytes of memory in use, after freed memory was given back.
[[nodiscard]] std::size_t residentBytes();

/// Open file descriptors.
[[nodiscard]] std::size_t openDescriptors();

}  // namespace kestro::soak
