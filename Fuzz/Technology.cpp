// SPDX-License-Identifier: MIT
// Compiled once a technology, which the build names.
#include "Fuzz/Technology.h"

namespace kestro::fuzz {

const std::string_view kTechnology = KESTRO_FUZZ_TECHNOLOGY;

}  // namespace kestro::fuzz
