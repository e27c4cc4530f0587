// SPDX-License-Identifier: MIT
#include "Sources/DriveTestValues.h"

#include <charconv>
#include <string>

namespace kestro {
namespace {

template <class Number, class... Format>
std::optional<Number> parsed(const std::optional<std::string>& text, Format... format) {
  if (!text) return std::nullopt;
  Number number{};
  const char* end = text->data() + text->size();
  const auto result = std::from_chars(text->data(), end, number, format...);
  if (result.ec != std::errc() || result.ptr != end) return std::nullopt;
  return number;
}

}  // namespace

std::optional<double> numberIn(const DriveTestRow& row, DriveTestColumn column) {
  return parsed<double>(row.text(column));
}

std::optional<std::uint32_t> integerIn(const DriveTestRow& row, DriveTestColumn column, int base) {
  return parsed<std::uint32_t>(row.text(column), base);
}

}  // namespace kestro
