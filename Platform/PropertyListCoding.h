// SPDX-License-Identifier: MIT
// Property lists as bytes: XML and binary.
#pragma once

#include <cstddef>
#include <optional>

#include "Platform/Bytes.h"
#include "Platform/PropertyList.h"
#include "Platform/Result.h"

namespace kestro {

/// What a property list may hold before it is refused as unparsable. When nodes are counted, an
/// object of a binary list that is referred to several times counts each time, and a dictionary
/// entry counts as two: its key and its value.
struct PropertyListLimits {
  std::size_t levels = 128;  ///< of containers inside one another
  std::size_t nodes = 200'000;
  std::size_t bytes = std::size_t{16} * 1024 * 1024;

  /// For what arrives from a port or in a packet.
  [[nodiscard]] static constexpr PropertyListLimits message() noexcept { return {}; }
  /// For snapshot files, which hold whole histories of displays and raw packets: ten lists that
  /// were messages once, and what is around them.
  [[nodiscard]] static constexpr PropertyListLimits snapshotFile() noexcept {
    return {.nodes = 2'100'000, .bytes = std::size_t{1024} * 1024 * 1024};
  }
};

class PropertyListCoding {
 public:
  PropertyListCoding() = default;
  virtual ~PropertyListCoding() = default;
  PropertyListCoding(const PropertyListCoding&) = delete;
  PropertyListCoding& operator=(const PropertyListCoding&) = delete;

  /// Parses XML or binary, told apart by the bytes. The order of dictionary entries is the order in
  /// the list; of entries with one key the last counts. The error says what is wrong and, where
  /// known, at which byte. XML is read in UTF-8, UTF-16 and ISO-8859-1, and with a bare value
  /// behind its declaration. Binary dates are read to 10 µs, before 1933 and after 2068 to the
  /// second. Texts of bytes that their encoding does not have, or with a NUL, are refused, and so
  /// are dates outside the years 1 to 9999. The limit of bytes holds for a list as it comes and in
  /// UTF-8.
  [[nodiscard]] virtual Result<Value> parse(
      ByteView bytes, const PropertyListLimits& limits = PropertyListLimits::message()) const = 0;

  /// The XML form, version 1.0, without a DOCTYPE line. Absent when `value` cannot be serialised:
  /// it is null, or holds a null value, a dictionary key that is no text, a text that is not UTF-8
  /// or holds a NUL, a date outside the years 1 to 9999, or containers more than 128 levels deep.
  [[nodiscard]] virtual std::optional<Bytes> xml(const Value& value) const = 0;

  /// The binary form; absent in the same cases.
  [[nodiscard]] virtual std::optional<Bytes> binary(const Value& value) const = 0;
};

}  // namespace kestro
