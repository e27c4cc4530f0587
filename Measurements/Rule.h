// SPDX-License-Identifier: MIT
// What a user wants to be told of: "Measured RSRP < -110 dBm for 4 s".
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Result.h"

namespace kestro {

enum class Comparison : std::uint8_t {
  Less,
  LessOrEqual,
  Greater,
  GreaterOrEqual,
  Equal,
  NotEqual,
};

/// The comparison as it is written: "<=".
[[nodiscard]] std::string_view comparisonText(Comparison comparison) noexcept;

/// Whether `value` compares so with `limit`.
[[nodiscard]] bool compares(double value, Comparison comparison, double limit) noexcept;

/// A rule is broken at an item of a series while its values compare so with the limit.
struct Rule {
  std::string text;    ///< the whole rule as it was written, without blanks around it
  std::string series;  ///< "Section/Key", or "Key": of every section that has it
  Comparison comparison = Comparison::Less;
  double limit = 0;
  std::string unit{};  ///< a series of another unit is not meant; empty: any unit
  std::chrono::microseconds duration{0};  ///< so long without a break before it is an alarm

  friend bool operator==(const Rule&, const Rule&) = default;
};

inline constexpr std::size_t kMaximumRules = 1'000;
inline constexpr std::size_t kMaximumRuleLength = 1'000;  ///< bytes of a line

/// Reads rules, one a line: `SERIES OP NUMBER [UNIT] [for N [s]]`, with OP one of < <= > >= == !=.
/// A series whose name holds an operator or a "#" stands in quotes ("). Empty lines, and what
/// follows a "#", are passed over. An error begins with "`origin`:LINE:COLUMN: ", both counted from
/// 1, the column in characters.
[[nodiscard]] Result<std::vector<Rule>> parseRules(std::string_view text, std::string_view origin);

}  // namespace kestro
