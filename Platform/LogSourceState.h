// SPDX-License-Identifier: MIT
// What a telephony server tells of the source of its messages.
#pragma once

#include <optional>
#include <string>

#include "Platform/PropertyList.h"

namespace kestro {

/// Where a telephony server's messages come from, as far as it says so.
struct LogSourceState {
  std::optional<std::string> kind = std::nullopt;  ///< as the server names it, such as "capture"
  std::optional<std::string> name =
      std::nullopt;  ///< which one of its kind, such as the file's path
  /// No baseband has sent these messages: they are made up, or made from somebody's measurements.
  std::optional<bool> isSimulated = std::nullopt;
  std::optional<bool> hasEnded = std::nullopt;  ///< no more messages come

  friend bool operator==(const LogSourceState&, const LogSourceState&) = default;
};

/// What a person is told of a source: "simulation", "capture drive.pcap", "drive-test a.csv,
/// simulated"; empty when the server says nothing of it.
[[nodiscard]] std::string sourceText(const LogSourceState& state);

/// What a person is told when it has ended: "the recording has ended".
[[nodiscard]] std::string sourceEndedText(const LogSourceState& state);

/// Adds what is known to the server's answer or notification.
void addSourceState(const LogSourceState& state, Dictionary& body);

/// What the body of an answer or a notification says; what it does not say in the documented form
/// is absent.
[[nodiscard]] LogSourceState sourceStateIn(const Dictionary& body);

}  // namespace kestro
