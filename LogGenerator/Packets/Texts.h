// SPDX-License-Identifier: MIT
// From raw values to texts, and the texts that were made before.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <span>

#include "LogGenerator/Packets/Field.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// The number that a scaled rule shows for a raw value.
[[nodiscard]] inline double scaledNumber(const TextRule& rule, std::int64_t raw) {
  return static_cast<double>(raw) * rule.scale + rule.offset;
}

/// The text of one raw value by any rule that takes a single place.
void writeText(const TextRule& rule, std::int64_t raw, TextBuffer& text);

/// What a field shows for its places' raw values: a text, or for TextRule::Kind::Each an array of
/// texts.
[[nodiscard]] Value makeText(const TextRule& rule, std::span<const std::int64_t> raw);

/// The texts of one rule for the first 2^16 values of a place's bits, made when first asked for.
class TextCache {
 public:
  static constexpr unsigned kMaximumBits = 16;
  /// Bits below it have a text here.
  static constexpr std::uint32_t kSize = 1U << kMaximumBits;

  TextCache(const TextRule& rule, const Place& place);

  /// The text of the place's bits, which must be below kSize and fit the place. Valid as long as
  /// the cache, which is as long as the process.
  [[nodiscard]] const Value& text(std::uint32_t bits) {
    const auto& block = _blocks[bits / kBlockSize];
    if (block) {
      const Value& known = (*block)[bits % kBlockSize];
      if (!known.isNull()) return known;
    }
    return make(bits);
  }

  /// The one cache for this rule over such places (for a rule of a computed number: over its low 16
  /// bits, signed); null when its texts are not kept.
  [[nodiscard]] static TextCache* forField(const Field& field);

 private:
  static constexpr std::uint32_t kBlockSize = 256;
  using Block = std::array<Value, kBlockSize>;

  const Value& make(std::uint32_t bits);

  TextRule _rule;
  Place _place;
  std::vector<std::unique_ptr<Block>> _blocks;
};

}  // namespace kestro
