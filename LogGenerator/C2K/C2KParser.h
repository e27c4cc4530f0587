// SPDX-License-Identifier: MIT
// The contract of the parsers that turn CDMA2000 packets into display values.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/C2K/LookupTable.h"
#include "LogGenerator/C2K/PacketCheck.h"
#include "LogGenerator/Packets/Decode.h"
#include "LogGenerator/Packets/Explain.h"
#include "LogGenerator/Packets/Outline.h"
#include "LogGenerator/Packets/Requirement.h"
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
  [[nodiscard]] const PacketReading& reading() const noexcept { return _rules.reading; }

  /// What the packet must have. `refusalOf` tells of one that lacks some of it.
  [[nodiscard]] const PacketRules& rules() const noexcept { return _rules; }

  /// Stores what the packet, header included, shows. A packet that is refused leaves its lines in
  /// the log and nothing else.
  void parse(PacketView packet, C2KOutput& output);

  /// Visits every value that `parse` takes from the packet, under the packet's name as its section
  /// and the lookup name as its key or, for a row, its list. Nothing for a packet that is refused.
  void explain(PacketView packet, const ExplainVisitor& visit) const;

  /// What `explain` visits, under the same names.
  [[nodiscard]] OutlinedReading outline() const;

  /// The names of all values that it may store, in that order.
  [[nodiscard]] virtual std::vector<std::string_view> lookupNames() const;

 protected:
  explicit C2KParser(const PacketRules& rules) noexcept : _rules(rules) {}

  /// `parse` and `explain` for a packet that is taken. Unless a parser says otherwise, what is
  /// explained is the reading.
  virtual void take(const TakenPacket& packet, C2KOutput& output) = 0;
  virtual void explainTaken(const TakenPacket& packet, const ExplainVisitor& visit) const;
  /// What `explainTaken` visits.
  virtual void outlineTaken(std::vector<OutlinedPart>& parts) const;

 private:
  PacketRules _rules;
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

/// The parser of a packet that is nothing but the fields of its reading.
class FieldParser : public C2KParser {
 protected:
  explicit FieldParser(const PacketRules& fieldRules)
      : C2KParser(fieldRules), _fields(fieldRules.reading.fields) {}

  void take(const TakenPacket& packet, C2KOutput& output) override {
    _fields.store(packet.bytes, {}, output.lookup);
  }

 private:
  StoredFields _fields;
};

}  // namespace kestro
