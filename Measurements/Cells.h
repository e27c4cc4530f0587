// SPDX-License-Identifier: MIT
// The cells of a drive: one row a cell seen, joined over all packets that speak of it.
#pragma once

#include <chrono>
#include <compare>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <unordered_map>

#include "LogGenerator/Bands.h"
#include "Measurements/CellReader.h"
#include "Measurements/Event.h"
#include "Measurements/LevelSummary.h"

namespace kestro {

/// What tells a cell from others: its identity where that is known, else channel and physical
/// identity, as far as they are known.
struct CellName {
  Radio radio = Radio::LTE;
  std::optional<std::uint32_t> identity{};
  std::optional<std::uint32_t> channel{};
  std::optional<std::uint32_t> physical{};
  std::optional<std::uint32_t> logCode{};  ///< CellObservation::logCode

  friend auto operator<=>(const CellName&, const CellName&) = default;
  [[nodiscard]] bool isEmpty() const noexcept { return !identity && !physical && !logCode; }
};

/// "1049603", "1300/14" (channel and physical identity), "-/14" (without a channel), "code 14".
[[nodiscard]] std::string textOf(const CellName& name);

struct Cell {
  CellName name;
  std::optional<std::uint32_t> channel{};
  std::optional<std::uint32_t> physical{};
  std::optional<std::uint32_t> ownBand{};  ///< as a packet numbers it
  std::optional<std::uint32_t> area{};
  std::string network{};   ///< "999-990"; empty: not known
  LevelSummary level{};    ///< dBm
  LevelSummary quality{};  ///< dB
  Moment firstSeen{};
  Moment lastSeen{};
  Moment lastLevel{};
  std::chrono::microseconds served{0};
  /// Some of its levels came from a neighbour that was known by channel and physical identity only.
  bool isAssumed = false;

  /// Band and frequency of its channel; empty without one.
  [[nodiscard]] ChannelBand band() const;
  /// Of an LTE cell's identity: the eNodeB's, and the cell's within it.
  [[nodiscard]] std::optional<std::uint32_t> baseStation() const;
  [[nodiscard]] std::optional<std::uint32_t> sector() const;
};

/// All cells, each at the place that its first sight gave it.
class Cells {
 public:
  /// The 10,001st cell is not kept, nor any later one: they are counted. Events still name them.
  static constexpr std::size_t kMaximumCells = 10'000;

  /// The cell's place, made when it is seen for the first time; absent when there is no room.
  [[nodiscard]] std::optional<CellId> see(const CellName& name, Moment time);

  /// A cell that has been seen.
  [[nodiscard]] const Cell* find(const CellName& name) const;

  [[nodiscard]] Cell& at(CellId cell) { return _cells[cell]; }
  [[nodiscard]] const std::deque<Cell>& all() const noexcept { return _cells; }
  /// How often a cell was seen for which there is no room.
  [[nodiscard]] std::uint64_t notKeptCount() const noexcept { return _notKept; }

 private:
  struct NameHash {
    std::size_t operator()(const CellName& name) const noexcept;
  };
  std::deque<Cell> _cells;
  std::unordered_map<CellName, CellId, NameHash> _places;
  std::uint64_t _notKept = 0;
};

/// Remembers which identity was last seen for a channel and a physical identity.
class KnownIdentities {
 public:
  static constexpr std::chrono::minutes kLifetime{10};
  static constexpr std::size_t kMaximumPairs = 10'000;

  void know(Radio radio, std::uint32_t channel, std::uint32_t physical, std::uint32_t identity,
            Moment time);
  /// The identity last seen for the pair, if that is at most `kLifetime` ago.
  [[nodiscard]] std::optional<std::uint32_t> identityOf(Radio radio, std::uint32_t channel,
                                                        std::uint32_t physical, Moment time) const;

 private:
  struct Known {
    std::uint32_t identity;
    Moment time;
  };
  struct Pair {
    Radio radio;
    std::uint32_t channel;
    std::uint32_t physical;
    bool operator==(const Pair&) const = default;
  };
  struct PairHash {
    std::size_t operator()(const Pair& pair) const noexcept;
  };
  std::unordered_map<Pair, Known, PairHash> _known;
};

}  // namespace kestro
