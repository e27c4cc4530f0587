// SPDX-License-Identifier: MIT
// The active-set sub-packet of the 1x status packet.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/C2K/PilotList.h"
#include "LogGenerator/Packets/Explain.h"
#include "LogGenerator/Packets/Field.h"
#include "LogGenerator/Packets/Outline.h"
#include "LogGenerator/Packets/Walk.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// The sub-packet's fields that all pilots share.
extern const std::span<const Field> kOneXActiveSetFields;

// In each pilot's record.
inline constexpr Place kOneXPilotPN = u16(12);
inline constexpr Place kOneXPilotEnergy = u16(24);  ///< behind the record's variable part

inline constexpr NumberFormat kOneXEnergyFormat = "%+.2f dB";  ///< of all but the reference pilot

/// The pilots' records. Energies are not made by a rule, but by `OneXActiveSet::energyText`.
extern const SizedRecords kOneXPilots;

/// The pilots of a sub-packet at a place in its packet. The packet is borrowed; whatever lies past
/// its end reads as 0.
class OneXActiveSet {
 public:
  OneXActiveSet(PacketView packet, std::size_t start);

  /// From 0 to 255.
  [[nodiscard]] std::size_t pilotCount() const noexcept { return _pilotCount; }

  /// Where `kOneXPilotPN` and `kOneXPilotEnergy` of pilot `index` count from.
  [[nodiscard]] RecordPosition pilotAt(std::size_t index) const noexcept;
  [[nodiscard]] RecordPosition pilotEnergyAt(std::size_t index) const noexcept;

  [[nodiscard]] std::uint32_t pnOffset(std::size_t index) const noexcept;
  /// The pilot's energy in dB, in a format of its own when it is the reference pilot's.
  [[nodiscard]] ComputedValue energyOf(std::size_t index) const noexcept;
  [[nodiscard]] Value energyText(std::size_t index) const;

  /// Adds every pilot to the list.
  void addTo(PilotList& list) const;

  /// Visits the fields that all pilots share, then PN offset and energy of each as a row of `list`.
  void explain(std::string_view section, std::string_view list, const ExplainVisitor& visit) const;

 private:
  [[nodiscard]] double energy(std::size_t index) const noexcept;
  void explainPilot(const Explainer& explainer, ExplainedValue value,
                    const ExplainVisitor& visit) const;
  /// Where the places of one of the pilots' fields lie.
  [[nodiscard]] std::vector<ExplainedSource> sources(const Explainer& explainer, const Field& field,
                                                     std::size_t index) const;

  PacketView _packet;
  RecordPosition _position;
  std::size_t _pilotCount;
  std::size_t _variableSize;  ///< of a pilot's record
  std::size_t _stride;
  std::uint32_t _referencePN;
  // What all energies are computed from.
  double _factor;
  double _divisor;
  double _noise;
};

}  // namespace kestro
