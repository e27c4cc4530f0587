// SPDX-License-Identifier: MIT
// Writing a whole file without losing the one before.
#pragma once

#include <string>
#include <string_view>

#include "Platform/Result.h"

namespace kestro {

/// Writes a file, new or in place of an earlier one, whose mode it takes over. The earlier one
/// stays as it was until the new one is complete, and for good when that fails: the error says why,
/// and names `path`. What is no regular file (a device, a pipe) is written to as it is.
[[nodiscard]] Result<void> replaceFile(const std::string& path, std::string_view contents);

}  // namespace kestro
