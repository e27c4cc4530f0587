// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/PilotList.h"

#include <fmt/compile.h>
#include <fmt/format.h>

#include <array>
#include <memory>

#include "LogGenerator/DisplayKeys.h"

namespace kestro {
namespace {

// The keys of likely pilots are kept. An air interface's PN offset has 9 bits, a packet's 16.
constexpr std::size_t kKeptNumbers = 32;
constexpr std::uint32_t kKeptPNOffsets = 512;
using KeptKeys = std::array<Value, kKeptPNOffsets>;

Value makeKey(std::size_t number, std::uint32_t pnOffset) {
  char key[32];
  const char* end = fmt::format_to(key, FMT_COMPILE("{}{}{}"), number, kNameSeparator, pnOffset);
  return std::string_view(key, end);
}

/// The key of a likely pilot; a null pointer for the others.
const Value* keptKey(std::size_t number, std::uint32_t pnOffset) {
  static std::array<std::unique_ptr<KeptKeys>, kKeptNumbers> kept;
  if (number >= kKeptNumbers || pnOffset >= kKeptPNOffsets) return nullptr;
  if (!kept[number]) kept[number] = std::make_unique<KeptKeys>();
  Value& key = (*kept[number])[pnOffset];
  if (key.isNull()) key = makeKey(number, pnOffset);
  return &key;
}

}  // namespace

void PilotList::add(std::size_t number, std::uint32_t pnOffset, Value energy) {
  if (const Value* key = keptKey(number, pnOffset)) {
    _keys.push_back(*key);
  } else {
    _keys.push_back(makeKey(number, pnOffset));
  }
  _values.push_back(std::move(energy));
}

void PilotList::store(LookupName& name, const LookupTable& lookup) {
  const Value* earlier = lookup.onlyValue(name);
  if (earlier != nullptr && earlier->isDictionary() && earlier->isOnlyReference()) {
    earlier->dictionary().swapEntries(_keys, _values);
  } else {
    Dictionary list;
    list.swapEntries(_keys, _values);
    lookup.store(name, list);
  }
  clear();
}

void PilotList::clear() {
  static const Value marker(kSortedMarker);
  _keys.clear();
  _keys.push_back(marker);
  _values.clear();
  _values.push_back(marker);
}

}  // namespace kestro
