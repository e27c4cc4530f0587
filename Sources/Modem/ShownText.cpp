// SPDX-License-Identifier: MIT
#include "Sources/Modem/ShownText.h"

#include <algorithm>
#include <cstddef>

namespace kestro {
namespace {

constexpr std::size_t kLongestShown = 256;
constexpr std::ptrdiff_t kUnmasked = 4;

constexpr bool isContinuation(char c) { return (static_cast<unsigned char>(c) & 0xC0U) == 0x80U; }
constexpr bool isControl(char c) {
  return static_cast<unsigned char>(c) < 0x20U || static_cast<unsigned char>(c) == 0x7FU;
}
// What is beyond ASCII counts as letters: it must not stay because it is unusual.
constexpr bool isPersonal(char c) {
  return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
         static_cast<unsigned char>(c) >= 0x80U;
}

}  // namespace

std::string shownText(std::string_view text) {
  std::size_t length = std::min(text.size(), kLongestShown);
  while (length > 0 && length < text.size() && isContinuation(text[length])) --length;
  std::string result(text.substr(0, length));
  std::ranges::replace_if(result, isControl, '?');
  return result;
}

std::string maskedText(std::string_view text) {
  std::string result = shownText(text);
  auto hidden = std::ranges::count_if(result, isPersonal);
  if (hidden > kUnmasked) hidden -= kUnmasked;
  for (char& c : result) {
    if (hidden > 0 && isPersonal(c)) {
      c = '*';
      --hidden;
    }
  }
  return result;
}

}  // namespace kestro
