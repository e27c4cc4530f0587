// SPDX-License-Identifier: MIT
// What the values of a message say of cells.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <span>
#include <unordered_map>
#include <vector>

#include "Measurements/CellSection.h"
#include "Measurements/MeasuredMessage.h"

namespace kestro {

/// One cell, or what a message says of the one that serves.
struct CellObservation {
  const CellSection* section = nullptr;
  Radio radio = Radio::LTE;
  std::array<std::optional<double>, kCellFieldCount> fields{};
  /// Where level and quality stand among the message's values.
  std::optional<std::size_t> levelAt{};
  std::optional<std::size_t> qualityAt{};
  /// In place of a physical identity that is made up: what distinguishes cells of a drive-test log.
  std::optional<std::uint32_t> logCode{};

  [[nodiscard]] std::optional<double>& field(CellField field) {
    return fields[static_cast<std::size_t>(field)];
  }
  [[nodiscard]] std::optional<double> field(CellField field) const {
    return fields[static_cast<std::size_t>(field)];
  }
  /// The field as a whole number from 0; absent where it is none.
  [[nodiscard]] std::optional<std::uint32_t> number(CellField field) const;
};

/// Finds the tables' keys among the values of messages.
class CellReader {
 public:
  /// The cells of a message, those that decide first. Valid until the next message.
  [[nodiscard]] std::span<const CellObservation> read(const MeasuredMessage& message);

 private:
  /// A key of a table that a group's values are.
  struct Role {
    const CellSection* section;
    std::size_t key;
  };
  struct Roles {
    std::vector<Role> roles{};
    bool namesRadio = false;
  };
  /// The observation that a section's values go to.
  struct Open {
    std::uint32_t row;
    std::size_t observation;
  };

  [[nodiscard]] const Roles& rolesOf(const SeriesGroup& group);
  void takeValue(const MeasuredMessage& message, std::size_t at);
  CellObservation& observationOf(const CellSection& section, const MeasuredValue& value);
  void set(CellObservation& observation, const Role& role, const MeasuredValue& value,
           std::size_t at);
  void finish(const MeasuredMessage& message);

  std::unordered_map<const SeriesGroup*, Roles> _roles;
  std::unordered_map<const CellSection*, Open> _open;
  std::vector<CellObservation> _observations;
  std::vector<std::array<std::size_t, kCellFieldCount>> _keys;  ///< which key set each field
  std::optional<Radio> _namedRadio;
};

}  // namespace kestro
