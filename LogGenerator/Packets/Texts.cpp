// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Texts.h"

#include <algorithm>
#include <charconv>
#include <deque>
#include <optional>

#include "LogGenerator/Packets/Walk.h"

namespace kestro {
namespace {

bool isSingleValued(TextRule::Kind kind) {
  return kind == TextRule::Kind::Integer || kind == TextRule::Kind::Scaled ||
         kind == TextRule::Kind::Named || kind == TextRule::Kind::Computed;
}

/// The place that the field's cached texts are for; nothing when it has none. Of a wider place the
/// low 16 bits: where the others are 0 they are the number.
std::optional<Place> keptPlace(const Field& field) {
  if (!isSingleValued(field.text.kind)) return std::nullopt;
  if (field.text.number != nullptr) return s16(0);
  if (field.placeCount != 1) return std::nullopt;
  return field.places[0].bitCount <= TextCache::kMaximumBits ? field.places[0] : u16(0);
}

void writeName(const TextRule& rule, std::int64_t raw, TextBuffer& text) {
  const auto row = std::ranges::find(rule.names, raw, &NamedValue::value);
  if (row != rule.names.end()) {
    text.append(row->text);
  } else if (rule.otherName.empty()) {
    text.append(rule.format, raw);
  } else {
    text.append(rule.otherName);
  }
}

void writeComputed(const ComputedValue& value, TextBuffer& text) {
  text.append(*value.format, value.number);
}

/// What the texts of a cache depend on.
struct CacheKey {
  TextRule rule;
  unsigned bitCount;
  bool isSigned;

  bool operator==(const CacheKey&) const = default;
};

struct KnownCache {
  CacheKey key;
  TextCache cache;
};

/// "%d" or "%u" of the number's low 32 bits, without a detour through a buffer for longer texts.
Value plainDecimal(const NumberFormat& format, std::int64_t number) {
  auto magnitude = static_cast<std::uint32_t>(number);
  char digits[16];
  char* begin = digits;
  if (format.conversion == 'd' && static_cast<std::int32_t>(magnitude) < 0) {
    *begin++ = '-';
    magnitude = 0U - magnitude;
  }
  const auto end = std::to_chars(begin, digits + sizeof(digits), magnitude);
  return std::string_view(digits, static_cast<std::size_t>(end.ptr - digits));
}

}  // namespace

void writeText(const TextRule& rule, std::int64_t raw, TextBuffer& text) {
  if (rule.hasAbsentValue && raw == rule.absentValue) {
    text.append(rule.absentText);
    return;
  }
  switch (rule.kind) {
    case TextRule::Kind::Integer:
      text.append(rule.format, raw * rule.multiplier + rule.addend);
      break;
    case TextRule::Kind::Scaled:
      text.append(rule.format, scaledNumber(rule, raw));
      break;
    case TextRule::Kind::Named:
      writeName(rule, raw, text);
      break;
    case TextRule::Kind::Computed:
      writeComputed(rule.computed({&raw, 1}), text);
      break;
    case TextRule::Kind::Hidden:
    case TextRule::Kind::Each:
    case TextRule::Kind::Removed:
    case TextRule::Kind::Supplied:
      text.append(decimal().format, raw);
      break;
  }
}

Value makeText(const TextRule& rule, std::span<const std::int64_t> raw) {
  if (rule.kind == TextRule::Kind::Integer && rule.format.isPlainDecimal() &&
      !rule.hasAbsentValue && rule.number == nullptr) {
    return plainDecimal(rule.format, raw[0] * rule.multiplier + rule.addend);
  }
  TextBuffer text;
  if (rule.number != nullptr) {
    writeText(rule, rule.number(raw), text);
    return text.text();
  }
  if (rule.kind == TextRule::Kind::Each) {
    Array texts;
    texts.reserve(raw.size());
    for (const std::int64_t number : raw) {
      text.clear();
      writeText(rule, number, text);
      texts.append(text.text());
    }
    return texts;
  }
  if (rule.kind == TextRule::Kind::Computed) {
    writeComputed(rule.computed(raw), text);
  } else {
    writeText(rule, raw[0], text);
  }
  return text.text();
}

TextCache::TextCache(const TextRule& rule, const Place& place)
    : _rule(rule),
      _place(place),
      _blocks(((std::size_t{1} << place.bitCount) + kBlockSize - 1) / kBlockSize) {}

const Value& TextCache::make(std::uint32_t bits) {
  auto& block = _blocks[bits / kBlockSize];
  if (!block) block = std::make_unique<Block>();
  const std::int64_t raw = numberFromBits(_place, bits);
  return (*block)[bits % kBlockSize] = makeText(_rule, {&raw, 1});
}

TextCache* TextCache::forField(const Field& field) {
  const std::optional<Place> place = keptPlace(field);
  if (!place) return nullptr;
  CacheKey key{.rule = field.text, .bitCount = place->bitCount, .isSigned = place->isSigned};
  key.rule.number = nullptr;
  key.rule.functionName = {};
  static std::deque<KnownCache> caches;
  const auto known = std::ranges::find(caches, key, &KnownCache::key);
  if (known != caches.end()) return &known->cache;
  caches.push_back({key, TextCache(key.rule, *place)});
  return &caches.back().cache;
}

}  // namespace kestro
