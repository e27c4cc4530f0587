// SPDX-License-Identifier: MIT
// How many files and sockets this process may have open.
#pragma once

#include <cstddef>

namespace kestro {

/// Lets this process have at least so many descriptors open, or as many as the system allows it.
void allowDescriptors(std::size_t count);

}  // namespace kestro
