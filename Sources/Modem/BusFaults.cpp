// SPDX-License-Identifier: MIT
#include "Sources/Modem/BusFaults.h"

#include <fmt/format.h>

#include "Sources/Modem/ShownText.h"

namespace kestro {

void BusFaults::wrongType(std::string_view name, std::string_view expected,
                          std::string_view found) {
  tell(name, fmt::format("it has the type {}, not {}", shownText(found), expected));
}

void BusFaults::senseless(std::string_view name, std::string_view value) {
  tell(name, fmt::format("{} makes no sense", shownText(value)));
}

void BusFaults::tell(std::string_view name, std::string_view what) {
  ++_count;
  if (_named.size() >= kMaximumNames || _named.contains(name)) return;
  _named.emplace(name);
  _report(fmt::format("ModemManager's {} is left out: {}", shownText(name), what));
}

}  // namespace kestro
