// SPDX-License-Identifier: MIT
// Values of a message bus, each with its type.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <variant>
#include <vector>

namespace kestro {

/// One value as a service of the bus sent it. What a variant holds stands in the variant's place.
struct BusValue {
  using Elements = std::vector<BusValue>;
  using Entries = std::vector<std::pair<BusValue, BusValue>>;
  using Content = std::variant<std::monostate, bool, std::int64_t, std::uint64_t, double,
                               std::string, Elements, Entries>;

  /// The type in D-Bus's notation, such as "u" or "a{sv}".
  std::string signature;
  /// A flag for "b"; a signed number for "n", "i" and "x"; an unsigned one for "y", "q", "u" and
  /// "t"; a real one for "d"; a text for "s", "o" and "g"; entries for dictionaries; elements for
  /// other arrays and for structures; nothing for what is none of these.
  Content content = {};

  friend bool operator==(const BusValue&, const BusValue&) = default;
};

/// Values as programs send them.
[[nodiscard]] inline BusValue busFlag(bool flag) { return {"b", flag}; }
[[nodiscard]] inline BusValue busInteger(std::int32_t number) {
  return {"i", std::int64_t{number}};
}
[[nodiscard]] inline BusValue busUnsigned(std::uint32_t number) {
  return {"u", std::uint64_t{number}};
}
[[nodiscard]] inline BusValue busLong(std::uint64_t number) { return {"t", number}; }
[[nodiscard]] inline BusValue busReal(double number) { return {"d", number}; }
[[nodiscard]] inline BusValue busText(std::string text) { return {"s", std::move(text)}; }
[[nodiscard]] inline BusValue busPath(std::string path) { return {"o", std::move(path)}; }
[[nodiscard]] inline BusValue busList(std::string signature, BusValue::Elements elements) {
  return {std::move(signature), std::move(elements)};
}
[[nodiscard]] inline BusValue busEntries(std::string signature, BusValue::Entries entries) {
  return {std::move(signature), std::move(entries)};
}

}  // namespace kestro
