// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/DisplayText.h"

#include <utf8proc.h>

#include <algorithm>

namespace kestro {
namespace {

constexpr std::string_view kEllipsis = "…";

struct Character {
  utf8proc_int32_t codePoint = -1;  ///< negative: the first byte is no UTF-8
  std::size_t bytes = 1;
};

/// The character that a text, which is not empty, begins with.
Character firstCharacter(std::string_view text) noexcept {
  Character result;
  const auto length =
      utf8proc_iterate(reinterpret_cast<const utf8proc_uint8_t*>(text.data()),
                       static_cast<utf8proc_ssize_t>(text.size()), &result.codePoint);
  if (length <= 0) return {};
  result.bytes = static_cast<std::size_t>(length);
  return result;
}

bool isPrintableAscii(char character) noexcept { return character >= ' ' && character <= '~'; }

bool isAscii(char character) noexcept { return static_cast<unsigned char>(character) < 0x80; }

/// Whether a terminal may take the character for a command, or shows nothing for it.
bool isUnsafe(utf8proc_int32_t codePoint) noexcept {
  switch (utf8proc_category(codePoint)) {
    case UTF8PROC_CATEGORY_CC:
    case UTF8PROC_CATEGORY_CF:
    case UTF8PROC_CATEGORY_CN:
    case UTF8PROC_CATEGORY_CO:
    case UTF8PROC_CATEGORY_CS:
    case UTF8PROC_CATEGORY_ZL:
    case UTF8PROC_CATEGORY_ZP:
      return true;
    default:
      return false;
  }
}

/// The picture of an ASCII control character: U+2400 and on; U+2421 for DEL.
void appendControlPicture(std::string& result, utf8proc_int32_t codePoint) {
  const int picture = codePoint == 0x7F ? 0x21 : static_cast<int>(codePoint);
  result += "\xE2\x90";
  result += static_cast<char>(0x80 + picture);
}

void appendSafely(std::string& result, std::string_view bytes, utf8proc_int32_t codePoint) {
  if (codePoint >= 0 && (codePoint < 0x20 || codePoint == 0x7F)) {
    appendControlPicture(result, codePoint);
  } else {
    result += codePoint < 0 || isUnsafe(codePoint) ? kReplacementCharacter : bytes;
  }
}

/// The longest beginning of `text` that fits into `cells` cells.
std::string_view prefixOfWidth(std::string_view text, std::size_t cells) {
  std::size_t end = 0;
  std::size_t used = 0;
  while (end < text.size()) {
    const Character next = firstCharacter(text.substr(end));
    used += textWidth(text.substr(end, next.bytes));
    if (used > cells) break;
    end += next.bytes;
  }
  return text.substr(0, end);
}

}  // namespace

std::string displayText(std::string_view text) {
  if (std::ranges::all_of(text, isPrintableAscii)) return std::string(text);
  std::string result;
  while (!text.empty()) {
    const Character next = firstCharacter(text);
    appendSafely(result, text.substr(0, next.bytes), next.codePoint);
    text.remove_prefix(next.bytes);
  }
  return result;
}

std::size_t textWidth(std::string_view displayText) {
  if (std::ranges::all_of(displayText, isAscii)) return displayText.size();
  std::size_t width = 0;
  while (!displayText.empty()) {
    const Character next = firstCharacter(displayText);
    width += static_cast<std::size_t>(
        next.codePoint < 0 ? 1 : std::max(0, utf8proc_charwidth(next.codePoint)));
    displayText.remove_prefix(next.bytes);
  }
  return width;
}

std::string fitText(std::string_view displayText, std::size_t cells) {
  if (textWidth(displayText) <= cells) return std::string(displayText);
  if (cells == 0) return "";
  return std::string(prefixOfWidth(displayText, cells - 1)).append(kEllipsis);
}

std::size_t validUtf8Prefix(std::string_view text) noexcept {
  std::size_t end = 0;
  while (end < text.size()) {
    if (isAscii(text[end])) {
      ++end;
      continue;
    }
    const Character next = firstCharacter(text.substr(end));
    if (next.codePoint < 0) break;
    end += next.bytes;
  }
  return end;
}

std::string validUtf8(std::string_view text) {
  std::string result;
  for (;;) {
    const std::size_t valid = validUtf8Prefix(text);
    result += text.substr(0, valid);
    if (valid == text.size()) return result;
    result += kReplacementCharacter;
    text.remove_prefix(valid + 1);
  }
}

}  // namespace kestro
