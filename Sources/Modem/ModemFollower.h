// SPDX-License-Identifier: MIT
// One modem of ModemManager's, followed through all that can happen to both.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"
#include "Sources/Modem/BusFaults.h"
#include "Sources/Modem/ModemChoice.h"
#include "Sources/Modem/ModemLocation.h"
#include "Sources/Modem/ModemObjects.h"
#include "Sources/Modem/PolledCall.h"
#include "Sources/Modem/SignalRate.h"

namespace kestro {

/// Reads everything there is to read, and changes only what SignalRate does.
class ModemFollower {
 public:
  /// An answer takes no longer than this, or there is none.
  static constexpr std::chrono::seconds kDeadline{10};

  /// The references must outlive this. `changed` runs when something is new, not within a call.
  ModemFollower(ModemService& service, MainQueue& queue, ModemName name, BusFaults& faults,
                std::function<void()> changed);
  ~ModemFollower();
  ModemFollower(const ModemFollower&) = delete;
  ModemFollower& operator=(const ModemFollower&) = delete;

  /// Asks what is asked every second.
  void secondPassed();
  /// Gives back what was changed; `done` runs when that is over. Nothing is asked any more.
  void finish(std::function<void()> done);

  [[nodiscard]] ModemServiceState serviceState() const noexcept { return _state; }
  /// Why there is no bus.
  [[nodiscard]] const std::string& reason() const noexcept { return _reason; }
  /// Why ModemManager's objects are not known; absent when they are, or are being asked for.
  [[nodiscard]] const std::optional<BusError>& objectsError() const noexcept {
    return _objectsError;
  }
  [[nodiscard]] bool knowsObjects() const noexcept { return _knowsObjects; }
  [[nodiscard]] const ModemObjects& objects() const noexcept { return _objects; }
  /// The modem's path; empty when it is not there.
  [[nodiscard]] const std::string& path() const noexcept { return _path; }
  [[nodiscard]] bool hasChosen() const noexcept { return _choice.hasChosen(); }
  [[nodiscard]] const std::string& version() const noexcept { return _version; }

  [[nodiscard]] const ModemLocation& location() const noexcept { return _location; }
  /// The cells of the last answer; absent when there is none.
  [[nodiscard]] const std::optional<std::vector<BusProperties>>& cells() const noexcept {
    return _cells;
  }
  [[nodiscard]] const PolledCall& locationCall() const noexcept { return _locationCall; }
  [[nodiscard]] const PolledCall& cellCall() const noexcept { return _cellCall; }
  /// Why the signal is not measured; null when nothing is wrong.
  [[nodiscard]] const BusError* rateError() const;
  /// Whether this ModemManager tells cells at all: 1.20 is the first that does.
  [[nodiscard]] bool canTellCells() const noexcept;

 private:
  void changeState(ModemServiceState state, std::string_view reason);
  void receive(const BusSignal& signal);
  void askForObjects();
  void askForVersion();
  void askForProperties(const std::string& path, std::string_view interface);
  void askForLocation();
  void askForCells();
  void takeCells(const BusReply& reply);
  void look();
  void lookAtState();
  void forgetModem();
  void followParts();
  SignalRate& rate();
  [[nodiscard]] bool isModemEnabled() const { return isEnabled(_objects, _path); }
  void call(const BusCall& call, std::function<void(const BusReply& reply)> answered);

  MainQueue& _queue;
  BusFaults& _faults;
  std::function<void()> _changed;
  ModemServiceState _state = ModemServiceState::Connecting;
  std::string _reason;
  std::string _version;
  bool _knowsObjects = false;
  bool _isAskingForObjects = false;
  bool _isFinishing = false;
  std::optional<BusError> _objectsError;
  ModemObjects _objects;
  ModemChoice _choice;
  std::string _path;
  bool _isEnabled = false;
  std::vector<std::string> _parts;  ///< SIM and bearers, whose properties were asked for
  ModemLocation _location;
  std::optional<std::vector<BusProperties>> _cells;
  PolledCall _locationCall{std::chrono::seconds(1)};
  PolledCall _cellCall{std::chrono::seconds(2)};
  std::map<std::string, std::unique_ptr<SignalRate>> _rates;
  /// Answers hold it weakly: what was asked of another modem or owner is of no use any more.
  std::shared_ptr<bool> _round = std::make_shared<bool>(true);
  std::unique_ptr<ModemServiceConnection> _connection;
};

}  // namespace kestro
