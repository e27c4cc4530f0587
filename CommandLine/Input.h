// SPDX-License-Identifier: MIT
// Where a command reads whole files.
#pragma once

#include <cstddef>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// All of a file. One that is longer than `longest` is refused, also when that shows only while it
/// is read; every error begins with the path.
[[nodiscard]] Result<Bytes> readFile(const std::string& path, std::size_t longest);

}  // namespace kestro
