// SPDX-License-Identifier: MIT
// The machine's modems, listed once.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"
#include "Platform/Result.h"
#include "Sources/Modem/BusFaults.h"
#include "Sources/Modem/ModemObjects.h"

namespace kestro {

/// Asks ModemManager once. It changes nothing.
class ModemLister {
 public:
  /// All answers together take no longer than this.
  static constexpr std::chrono::seconds kPatience{5};

  /// `done` runs once: with the objects, or with the reason why there are none. Both references
  /// must outlive this, which may be destroyed after `done`, not within it.
  ModemLister(ModemService& service, MainQueue& queue,
              std::function<void(const Result<const ModemObjects*>& objects)> done);

 private:
  void changeState(ModemServiceState state, std::string_view reason);
  void end(const Result<const ModemObjects*>& objects);

  std::function<void(const Result<const ModemObjects*>& objects)> _done;
  BusFaults _faults{[](std::string_view) {}};
  ModemObjects _objects{_faults};
  ModemServiceState _state = ModemServiceState::Connecting;
  std::unique_ptr<ModemServiceConnection> _connection;
  std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

/// One line a modem: its number, maker and model, state and equipment identifier.
[[nodiscard]] std::string modemListText(const ModemObjects& objects, bool isPersonal);

}  // namespace kestro
