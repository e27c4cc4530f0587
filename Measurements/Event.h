// SPDX-License-Identifier: MIT
// What happened on a drive.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Clock.h"

namespace kestro {

enum class EventKind : std::uint8_t {
  Handover,         ///< another cell serves, in connected mode
  Reselection,      ///< another cell serves, and nothing says that the phone was connected
  Technology,       ///< another radio technology serves
  Area,             ///< another tracking, location or routing area
  Network,          ///< another network
  State,            ///< a named state has changed
  MessagesMissing,  ///< no message for 5 s
  MessagesBack,     ///< the first message after that
  Alarm,            ///< a rule is broken, for as long as it says
  AlarmOver,        ///< and is kept again
};

/// "handover", "messages-missing".
[[nodiscard]] std::string_view nameOfEvent(EventKind kind) noexcept;

/// A cell's place in the list of cells (Cells.h).
using CellId = std::uint32_t;

struct Event {
  EventKind kind = EventKind::Reselection;
  Moment time{};
  std::uint64_t message = 0;  ///< the message that showed it
  std::string technology{};  ///< "LTE", "UMTS", …; of states and alarms as the log channel names it
  /// What changed: a state's or an alarm's series, with its item; else empty.
  std::string subject{};
  std::string from{};  ///< cell, technology, area, network or state before; of an alarm empty
  std::string to{};    ///< and after; of an alarm the rule
  std::optional<double> fromLevel{};  ///< the cells' levels, of the last 10 s; dBm
  std::optional<double> toLevel{};    ///< of an alarm the value
  std::string toldBy{};               ///< the packet that said so: "0xB0C2"
  std::string connectedBy{};          ///< the packet that said that the phone was connected
  /// Of an alarm how long the rule had been broken, of messages how long they were missing.
  std::optional<std::chrono::microseconds> duration{};
  std::optional<CellId> fromCell{};
  std::optional<CellId> toCell{};
};

/// Takes events in the order in which they became known.
using EventSink = std::function<void(const Event&)>;

}  // namespace kestro
