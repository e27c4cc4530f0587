// SPDX-License-Identifier: MIT
// The decoder that does what its section's description says.
#pragma once

#include <memory>
#include <vector>

#include "LogGenerator/Ondrel/Base.h"
#include "LogGenerator/Packets/Decode.h"

namespace kestro {

/// Decodes what a Section describes: it writes the section's log line, looks the code up among the
/// readings, ignores short packets, fills the dictionary or replaces the list. What no table says
/// is a function of a derived class.
class SectionDecoder : public Base, protected FieldSupplier {
 public:
  /// `section` must outlive the decoder; sections are constants.
  SectionDecoder(const GeneratorServices& services, const Section& section);

  [[nodiscard]] std::string_view getSectionName() const override { return _section.name; }
  [[nodiscard]] std::span<const LogCode> getLogCodeArray() const override { return _codes; }
  [[nodiscard]] SectionKind sectionKind() const override { return _section.kind; }
  void updateWithDataLogCode(const Packet& packet, LogCode code) override;
  void explainPacket(const Packet& packet, LogCode code,
                     const ExplainVisitor& visit) const override;
  [[nodiscard]] CatalogueEntry catalogueCode(LogCode code) const override;
  [[nodiscard]] Outline outlineCode(LogCode code) const override {
    return outlineSection(_section, code);
  }

 protected:
  /// Decodes a code that has no reading; false when the code is unknown to the decoder too.
  virtual bool updateWithOtherPacket(const Packet& packet, LogCode code);

  /// Explains a code that has no reading.
  virtual void explainOtherPacket(const Packet& packet, LogCode code,
                                  const ExplainVisitor& visit) const;

  /// Completes the entry of a code that has no reading: what the packet is and its keys.
  virtual void catalogueOtherCode(CatalogueEntry& entry) const;

  /// The value of a row's key that an earlier packet gave; null leaves the key out.
  [[nodiscard]] Value supply(const Field& field, PacketView packet,
                             const RecordPosition& position) const override;

  /// Called after a reading was applied.
  virtual void didRead(const PacketReading& reading, PacketView packet);

  /// Called with the new rows of a list before they reach the display, whatever their use. A list
  /// that is the section is not built for a count of 0, unless its rows are only noted.
  virtual void willPublish(const ListReading& list, PacketView packet, std::vector<Value>& rows);

  [[nodiscard]] const Section& section() const noexcept { return _section; }

 private:
  void apply(BoundReading& bound, PacketView packet);
  void noteRows(BoundTable& table, PacketView packet);
  void applyToList(BoundTable& table, PacketView packet);
  void applyUnderKey(BoundTable& table, PacketView packet, Dictionary& section);

  const Section& _section;
  std::vector<LogCode> _codes;
  std::vector<BoundReading> _readings;
};

/// The decoder of one constant section: `using ServingCell = TableDecoder<kServingCell>;`
template <const Section& description>
class TableDecoder : public SectionDecoder {
 public:
  explicit TableDecoder(const GeneratorServices& services)
      : SectionDecoder(services, description) {}
};

}  // namespace kestro
