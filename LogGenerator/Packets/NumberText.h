// SPDX-License-Identifier: MIT
// Texts that are numbers with a unit.
#pragma once

#include <optional>
#include <string_view>

namespace kestro {

struct NumberWithUnit {
  double number = 0;
  std::string_view unit{};  ///< a part of the text; empty: none
};

/// "-93 dBm", "12", "0.5 %", "40%": a decimal number of at most 15 digits, and perhaps a unit,
/// which is one word that begins with no digit behind a blank, or "%" without one. Nothing for any
/// other text.
[[nodiscard]] std::optional<NumberWithUnit> numberWithUnit(std::string_view text) noexcept;

}  // namespace kestro
