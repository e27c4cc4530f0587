// SPDX-License-Identifier: MIT
// What is changed in an XML list before the library parses it, so that it means the same to the
// library and takes it no time without bound.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "Platform/Linux/PropertyListScan.h"

namespace kestro {

/// How many bytes stand in front of each key of an edited list that has many.
inline constexpr std::size_t kKeyBeginning = 8;

/// The list with its edits made. When it has many keys, each begins with bytes that nobody can
/// foresee: keys whose hashes collide are compared with each other, which takes the library hours.
[[nodiscard]] std::string editedXml(std::string_view list, const PropertyListFacts& facts);

}  // namespace kestro
