// SPDX-License-Identifier: MIT
// The simulated drive of a GSM and UMTS phone, as messages of the IFX channel.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>

#include "Platform/PropertyListCoding.h"
#include "Sources/IFX/IFXMessage.h"
#include "Sources/LogSource.h"
#include "Sources/World/SimulatedPhone.h"

namespace kestro {

/// A drive without end. Every message holds the whole display: radio access, serving cell, radio
/// quality, the lists of cells, the data connection, mobility and the car. The same seed gives the
/// same messages in every run.
class IFXSimulation : public LogSource {
 public:
  static constexpr std::uint64_t kDefaultSeed = 2012;
  /// The time from one message to the next.
  static constexpr std::chrono::milliseconds kInterval{500};

  /// `coding` must outlive the simulation.
  explicit IFXSimulation(const PropertyListCoding& coding, std::uint64_t seed = kDefaultSeed);

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] std::string_view madeUp() const noexcept override { return kMadeUpBySimulation; }
  [[nodiscard]] Result<void> restart() override;

 private:
  const PropertyListCoding& _coding;
  std::uint64_t _seed;
  SimulatedPhone _phone;
  std::chrono::milliseconds _time{0};
  bool _hasBegun = false;
  Bytes _message;
};

/// What the phone shows now.
[[nodiscard]] IFXMessage ifxMessageOf(const SimulatedPhone& phone);

}  // namespace kestro
