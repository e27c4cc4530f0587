// SPDX-License-Identifier: MIT
// ModemManager, the service of the system bus that knows the machine's modems.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <tl/expected.hpp>
#include <vector>

#include "Platform/BusValue.h"

namespace kestro {

/// Why a call failed: the error's name on the bus, and what it says of itself.
struct BusError {
  std::string name;
  std::string message;

  friend bool operator==(const BusError&, const BusError&) = default;
};

/// What a call returned.
using BusReply = tl::expected<std::vector<BusValue>, BusError>;

/// The names of errors that this side gives, too.
inline constexpr std::string_view kBusErrorNoReply = "org.freedesktop.DBus.Error.NoReply";
inline constexpr std::string_view kBusErrorDisconnected = "org.freedesktop.DBus.Error.Disconnected";
inline constexpr std::string_view kBusErrorLimits = "org.freedesktop.DBus.Error.LimitsExceeded";

struct BusCall {
  std::string path;
  std::string interface;
  std::string method;
  std::vector<BusValue> arguments = {};  ///< of the types b, i, u, t, d, s and o
};

struct BusSignal {
  std::string path;
  std::string interface;
  std::string member;
  std::vector<BusValue> arguments;
};

enum class ModemServiceState : std::uint8_t {
  Connecting,  ///< to the bus; so it is at first
  NoBus,       ///< the bus cannot be reached; it is tried again
  Absent,      ///< nobody on the bus is ModemManager
  Present,
};

/// Who is told what happens; both run on the main thread, and never inside a call to the service.
struct ModemServiceHandlers {
  /// `reason` says why there is no bus, and is empty otherwise. Another owner of ModemManager's
  /// name is announced as Absent, then Present.
  std::function<void(ModemServiceState state, std::string_view reason)> stateChanged;
  /// A signal of ModemManager's: of objects that come and go, or of properties that change. They
  /// come in the order in which ModemManager sent them, and in order with its answers.
  std::function<void(const BusSignal& signal)> signalled;
};

/// A connection to the bus. Destroying it closes it: no handler runs afterwards.
class ModemServiceConnection {
 public:
  ModemServiceConnection() = default;
  virtual ~ModemServiceConnection() = default;
  ModemServiceConnection(const ModemServiceConnection&) = delete;
  ModemServiceConnection& operator=(const ModemServiceConnection&) = delete;

  /// Sends a call to ModemManager and returns at once. `answered` runs once, later, with the answer
  /// or, at the latest after `deadline`, with an error. An answer of more values than are taken is
  /// the error kBusErrorLimits. The call starts no service.
  virtual void call(const BusCall& call, std::chrono::milliseconds deadline,
                    std::function<void(const BusReply& reply)> answered) = 0;
};

/// Main thread only; nothing here waits for the bus.
class ModemService {
 public:
  /// Of one message: more are no modem's.
  static constexpr std::size_t kMaximumValues = 20'000;

  ModemService() = default;
  virtual ~ModemService() = default;
  ModemService(const ModemService&) = delete;
  ModemService& operator=(const ModemService&) = delete;

  /// Begins to connect. The handlers must be set. The service outlives its connections.
  [[nodiscard]] virtual std::unique_ptr<ModemServiceConnection> connect(
      ModemServiceHandlers handlers) = 0;
};

}  // namespace kestro
