// SPDX-License-Identifier: MIT
// Which series the rows of a list belong to, found by what tells one row from another.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <unordered_map>
#include <vector>

#include "LogGenerator/Packets/MeasuredField.h"

namespace kestro {

/// The numbers that identify a row: those of the identifying fields that the row has. Made and
/// compared for every row: in registers.
struct RowIdentity {
  std::uint64_t first = 0;    ///< the low 32 bits of the first number, and of the second
  std::uint64_t second = 0;   ///< of the third and the fourth
  std::uint32_t present = 0;  ///< a bit for each field

  bool operator==(const RowIdentity&) const = default;

  void set(std::size_t index, std::uint32_t number) noexcept {
    (index < 2 ? first : second) |= std::uint64_t{number} << (index % 2 * 32);
  }
  [[nodiscard]] std::uint32_t number(std::size_t index) const noexcept {
    return static_cast<std::uint32_t>((index < 2 ? first : second) >> (index % 2 * 32));
  }
};
static_assert(RecordTable::kMaximumIdentity == 4);

/// The series of one list's rows, each row's made when it first comes up.
class RowSeries {
 public:
  /// `identity` are the identifying fields. They and the groups, of which some may be null, must
  /// outlive it, and so must `table`.
  RowSeries(std::span<const Field> identity, std::span<const SeriesGroup* const> groups,
            SeriesTable& table);

  /// To be called before the rows of a packet.
  void beginPacket() noexcept { ++_packet; }

  /// What the fields say of row number `row` at `position`; without any, the number.
  [[nodiscard]] RowIdentity identityOf(std::size_t row, PacketView packet,
                                       const RecordPosition& position,
                                       const NumberSupplier* supplier) const;

  /// The series of the row, in the order of the groups; null where there is none. Of several rows
  /// of one packet that look the same each has its own.
  [[nodiscard]] std::span<const Series* const> of(std::size_t row, const RowIdentity& identity);

 private:
  using SeriesList = std::vector<const Series*>;
  struct Known {
    SeriesList series;
    std::vector<SeriesList> others{};  ///< of the second, third … in one packet
    std::uint64_t packet = 0;          ///< the number of the last packet that had it
    std::size_t count = 0;             ///< how often that one had it
  };
  struct Last {
    RowIdentity identity;
    Known* known;
  };
  struct Hash {
    std::size_t operator()(const RowIdentity& identity) const noexcept;
  };

  [[nodiscard]] Known* known(std::size_t row, const RowIdentity& identity);
  [[nodiscard]] Item itemOf(const RowIdentity& identity, std::size_t occurrence) const;
  [[nodiscard]] SeriesList seriesOf(const Item& item) const;

  std::span<const Field> _fields;
  std::span<const SeriesGroup* const> _groups;
  SeriesTable& _table;
  std::vector<MeasuredField> _identity;
  std::unordered_map<RowIdentity, Known, Hash> _known;
  std::vector<Last> _last;  ///< by their position
  SeriesList _none;         ///< those of a row for which there is no more room
  std::uint64_t _packet = 0;
};

}  // namespace kestro
