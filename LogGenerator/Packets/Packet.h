// SPDX-License-Identifier: MIT
// A packet on its way through the decoders that want it.
#pragma once

#include <optional>

#include "Platform/Bytes.h"
#include "Platform/PropertyList.h"
#include "Platform/Result.h"

namespace kestro {

class PropertyListCoding;

/// A packet's bytes, header included, borrowed; and the property list that they carry, which is
/// parsed when a decoder first asks for it and kept for the others.
class Packet {
 public:
  // Implicit: a packet is its bytes, so bytes can be given where a packet is wanted.
  // NOLINTBEGIN(google-explicit-constructor)
  Packet(ByteView bytes) noexcept : _bytes(bytes) {}
  Packet(const Bytes& bytes) noexcept : _bytes(bytes) {}
  // NOLINTEND(google-explicit-constructor)
  Packet(const Packet&) = delete;
  Packet& operator=(const Packet&) = delete;

  [[nodiscard]] ByteView bytes() const noexcept { return _bytes; }

  /// The property list after the packet's header; the error says why there is none. A packet of no
  /// more than the header has an empty payload, which is no property list. Valid as long as the
  /// packet; all who ask share its containers and leave them as they are.
  [[nodiscard]] const Result<Value>& propertyList(const PropertyListCoding& coding) const;

 private:
  ByteView _bytes;
  mutable std::optional<Result<Value>> _propertyList;
};

}  // namespace kestro
