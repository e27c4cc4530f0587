// SPDX-License-Identifier: MIT
// What stands inside the XML elements of numbers, booleans, dates and data, and inside entities.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace kestro {

/// What XML takes for blank.
inline constexpr std::string_view kXmlSpaces = " \t\r\n";

struct LeafVerdict {
  std::string_view problem;     ///< empty when the element is in order; else lives for ever
  bool isLargeInteger = false;  ///< an integer above 2^63 - 1
  bool isFarDate = false;       ///< a date that the library does not hand over
  /// The leading zeros of an integer, where in the content they begin and how many; the library
  /// would take it for octal.
  std::size_t zerosAt = 0;
  std::size_t zeros = 0;
};

/// Checks an element that is neither a container nor a text: its name ("integer", "true", …) and
/// its content, which is empty for an empty element.
[[nodiscard]] LeafVerdict checkXmlLeaf(std::string_view name, std::string_view content);

/// Whether `name`, the part between '&' and ';', is one of XML's five entities or the number of a
/// Unicode character other than NUL.
[[nodiscard]] bool isXmlEntity(std::string_view name);

/// The encoding that an XML declaration ("<?xml …" without its end) names, in lower case; nothing
/// when it names none.
[[nodiscard]] std::optional<std::string> declaredEncoding(std::string_view declaration);

}  // namespace kestro
