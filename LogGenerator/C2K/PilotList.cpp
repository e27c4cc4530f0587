// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/PilotList.h"

#include <fmt/compile.h>
#include <fmt/format.h>

#include <span>

#include "LogGenerator/DisplayKeys.h"

namespace kestro {

PilotList::PilotList() : _keys{kSortedMarker}, _values{kSortedMarker} {}

void PilotList::reserve(std::size_t count) {
  _keys.reserve(count + 1);
  _values.reserve(count + 1);
}

void PilotList::add(std::size_t number, std::uint32_t pnOffset, Value energy) {
  char key[32];
  const char* end = fmt::format_to(key, FMT_COMPILE("{}{}{}"), number, kNameSeparator, pnOffset);
  _keys.emplace_back(std::string_view(key, end));
  _values.push_back(std::move(energy));
}

Dictionary PilotList::take() {
  Dictionary result{KeyList(std::span<const Value>(_keys)), std::move(_values)};
  *this = PilotList();
  return result;
}

}  // namespace kestro
