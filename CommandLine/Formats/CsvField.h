// SPDX-License-Identifier: MIT
// Comma-separated values, RFC 4180.
#pragma once

#include <string>
#include <string_view>

namespace kestro {

/// Appends a text as a field, in quotes where it needs them. Bytes that are no UTF-8 become U+FFFD.
void appendCsvField(std::string& output, std::string_view text);

}  // namespace kestro
