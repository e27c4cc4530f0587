// SPDX-License-Identifier: MIT
// Named values of a service, read by the type that its interface gives them.
#pragma once

#include <cstdint>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Platform/BusValue.h"
#include "Sources/Modem/BusFaults.h"

namespace kestro {

using BusProperties = std::map<std::string, BusValue, std::less<>>;

/// What a dictionary with texts as keys holds; entries with other keys are left out. Empty, and
/// named, when `value` is none. `name` is what the value is called.
[[nodiscard]] BusProperties propertiesIn(const BusValue& value, std::string_view name,
                                         BusFaults& faults);

/// Properties of one interface, or the entries of a dictionary. A value that is not there is
/// absent; one of another type, or out of its range, is named and absent.
class BusFields {
 public:
  /// `name` is what goes before a key when it is named; the faults must outlive this.
  BusFields(BusProperties properties, std::string name, BusFaults& faults)
      : _properties(std::move(properties)), _name(std::move(name)), _faults(&faults) {}

  [[nodiscard]] bool empty() const noexcept { return _properties.empty(); }
  [[nodiscard]] bool contains(std::string_view key) const { return _properties.contains(key); }

  [[nodiscard]] std::optional<bool> flag(std::string_view key) const;
  [[nodiscard]] std::optional<std::int64_t> integer(std::string_view key) const;
  [[nodiscard]] std::optional<std::uint64_t> number(
      std::string_view key,
      std::uint64_t greatest = std::numeric_limits<std::uint32_t>::max()) const;
  [[nodiscard]] std::optional<std::uint64_t> longNumber(std::string_view key) const;
  [[nodiscard]] std::optional<double> real(std::string_view key, double least,
                                           double greatest) const;
  /// As it may be shown; an empty one is absent.
  [[nodiscard]] std::optional<std::string> text(std::string_view key) const;
  /// An object's path; "/" stands for none and is absent.
  [[nodiscard]] std::optional<std::string> path(std::string_view key) const;
  /// A text that is a hexadecimal number.
  [[nodiscard]] std::optional<std::uint64_t> hexadecimal(std::string_view key,
                                                         std::uint64_t greatest) const;
  /// Texts ("as") or paths ("ao"), at most 64.
  [[nodiscard]] std::vector<std::string> texts(std::string_view key,
                                               std::string_view signature) const;
  /// The elements of a structure or another array.
  [[nodiscard]] std::vector<BusValue> elements(std::string_view key,
                                               std::string_view signature) const;
  [[nodiscard]] BusFields dictionary(std::string_view key) const;

 private:
  /// The content of the value, of this type; null when there is none.
  template <class T>
  [[nodiscard]] const T* content(std::string_view key, std::string_view signature) const;
  [[nodiscard]] std::string nameOf(std::string_view key) const;

  BusProperties _properties;
  std::string _name;
  BusFaults* _faults;
};

/// The number that the digits are; absent when they are anything else.
[[nodiscard]] std::optional<std::uint64_t> numberIn(std::string_view digits, int base);

}  // namespace kestro
