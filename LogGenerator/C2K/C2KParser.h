// SPDX-License-Identifier: MIT
// The contract of the parsers that turn CDMA2000 packets into display values.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/C2K/LookupTable.h"
#include "LogGenerator/Packets/Decode.h"
#include "LogGenerator/Packets/Explain.h"
#include "LogGenerator/Packets/Section.h"
#include "Platform/PropertyList.h"
#include "Platform/SystemLog.h"

namespace kestro {

/// What a parser writes to, and reads back from, while it takes one packet.
struct C2KOutput {
  Dictionary& state;  ///< the generator state, for what lasts from one packet to the next
  LookupTable lookup;
  SystemLog& log;
};

/// Takes the packets of one log code. Values are stored under lookup names; a template says where
/// the display shows them.
class C2KParser {
 public:
  virtual ~C2KParser() = default;
  C2KParser(const C2KParser&) = delete;
  C2KParser& operator=(const C2KParser&) = delete;

  /// The packet's code, name and length, and whatever of it a layout describes. The keys of its
  /// shown fields and lists are lookup names.
  [[nodiscard]] const PacketReading& reading() const noexcept { return _reading; }

  /// Stores what the packet, header included, shows. A packet that it rejects leaves a line in the
  /// log and nothing else.
  virtual void parse(PacketView packet, C2KOutput& output) = 0;

  /// Visits every value that `parse` takes from the packet, under the packet's name as its section
  /// and the lookup name as its key or, for a row, its list. Nothing for a packet that it rejects.
  virtual void explain(PacketView packet, const ExplainVisitor& visit) const = 0;

  /// The names of all values that it may store, in that order.
  [[nodiscard]] virtual std::vector<std::string_view> lookupNames() const;

 protected:
  /// `reading` must be a constant.
  explicit C2KParser(const PacketReading& reading) noexcept : _reading(reading) {}

  [[nodiscard]] bool isLongEnough(PacketView packet) const noexcept {
    return packet.size() >= _reading.packet.minimumLength;
  }
  /// Like the overload without a log; a packet that is too short leaves a line in `log`.
  [[nodiscard]] bool isLongEnough(PacketView packet, SystemLog& log) const;

 private:
  const PacketReading& _reading;
};

/// The text for a value that the phone does not know in its present state.
inline constexpr std::string_view kNotAvailable = "N/A";

/// The shown fields of a layout, whose keys are lookup names, ready for use.
class StoredFields {
 public:
  explicit StoredFields(std::span<const Field> fields);

  /// Stores every field that is shown, in the layout's order.
  void store(PacketView packet, const RecordPosition& position, const LookupTable& lookup);

 private:
  struct StoredField {
    BoundField field;
    LookupName name;
  };

  std::vector<StoredField> _fields;
};

}  // namespace kestro
