// SPDX-License-Identifier: MIT
// What a harness is for, where one harness is for several technologies.
#pragma once

#include <string_view>

namespace kestro::fuzz {

/// The technology that this program's messages are of.
extern const std::string_view kTechnology;

}  // namespace kestro::fuzz
