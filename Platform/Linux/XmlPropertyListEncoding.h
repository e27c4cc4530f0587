// SPDX-License-Identifier: MIT
// XML lists in other encodings than UTF-8.
#pragma once

#include <optional>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// An XML list in UTF-16 (known by its byte-order mark, or by how it begins) or ISO-8859-1 (known
/// by its declaration), in UTF-8 and with a declaration that names no encoding. Nothing for a list
/// in any other encoding. The error says that the bytes are not what the list says it is.
[[nodiscard]] Result<std::optional<std::string>> xmlInUtf8(ByteView list);

}  // namespace kestro
