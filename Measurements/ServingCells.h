// SPDX-License-Identifier: MIT
// Which cell serves, and what is told when another one does.
#pragma once

#include <array>
#include <chrono>
#include <optional>

#include "Measurements/Cells.h"
#include "Measurements/Event.h"
#include "Measurements/MeasuredMessage.h"

namespace kestro {

/// A cell that serves.
struct ServingCell {
  CellName name;
  std::optional<CellId> cell{};
  std::optional<std::uint32_t> channel{};
  std::optional<std::uint32_t> physical{};
  std::optional<std::uint32_t> ownBand{};
  /// Its identity is that last seen for its channel and physical identity.
  bool isAssumed = false;

  /// Whether channel and physical identity, as far as both sides know them, are the same.
  [[nodiscard]] bool isPair(std::optional<std::uint32_t> otherChannel,
                            std::optional<std::uint32_t> otherPhysical) const noexcept;
};

/// The serving cells of a phone: one a radio of CDMA2000, else one.
class ServingCells {
 public:
  /// Connected mode must have been said so shortly before a change that is called a handover.
  static constexpr std::chrono::seconds kConnectedFor{1};
  /// A level older than that is not told with a change.
  static constexpr std::chrono::seconds kLevelFor{10};

  /// `cells` must outlive it.
  ServingCells(const Cells& cells, EventSink sink) : _cells(cells), _sink(std::move(sink)) {}

  [[nodiscard]] const std::optional<ServingCell>& of(Radio radio) const {
    return _serving[static_cast<std::size_t>(radio)];
  }
  /// For what a packet adds to the cell that serves.
  [[nodiscard]] std::optional<ServingCell>& of(Radio radio) {
    return _serving[static_cast<std::size_t>(radio)];
  }

  /// A packet names the cell that serves: tells whether that is another than before.
  void decide(Radio radio, const ServingCell& cell, const MeasuredMessage& message);

  /// Looks for what says that the phone is connected, or is not.
  void noteConnectedMode(const MeasuredMessage& message);

 private:
  struct Connected {
    Moment time;
    LogCode code;
  };
  struct Previous {
    Radio radio;
    ServingCell cell;
  };
  [[nodiscard]] std::optional<Previous> previousOf(Radio radio) const;
  [[nodiscard]] std::optional<double> levelOf(const ServingCell& cell, Moment time) const;
  void takePlace(Radio radio, const ServingCell& cell);
  void tellChange(const Previous& previous, Radio radio, const ServingCell& cell,
                  const MeasuredMessage& message) const;

  const Cells& _cells;
  EventSink _sink;
  std::array<std::optional<ServingCell>, kRadioCount> _serving{};
  std::array<std::optional<Connected>, kRadioCount> _connected{};
};

}  // namespace kestro
