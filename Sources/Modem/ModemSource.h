// SPDX-License-Identifier: MIT
// The source that shows a modem of this machine.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Clock.h"
#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"
#include "Platform/PositionService.h"
#include "Platform/PropertyListCoding.h"
#include "Sources/LogSource.h"
#include "Sources/Modem/BusFaults.h"
#include "Sources/Modem/ModemFollower.h"
#include "Sources/Modem/ModemMessage.h"

namespace kestro {

/// What a modem's source is made with; all of it must outlive the source.
struct ModemServices {
  const PropertyListCoding& coding;
  const Clock& clock;
  MainQueue& queue;
  ModemService& modems;
  PositionService& positions;
};

/// What of a modem is wanted.
struct ModemWish {
  ModemName modem;
  std::optional<PositionServer> gps = std::nullopt;  ///< none: the modem's own position
  bool isPersonal = false;                           ///< identities are shown whole
};

/// Yields one message a second, and one at every change (ten a second at most), while it is
/// watched; otherwise it has no connection to the bus, and asks nobody anything.
class ModemSource : public LogSource {
 public:
  ModemSource(const ModemServices& services, ModemWish wish, SourceReporter report);

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] Result<void> restart() override { return {}; }
  void setReadyHandler(std::function<void()> handler) override { _ready = std::move(handler); }
  void setWatched(bool isWatched, std::function<void()> done) override;

 private:
  void begin();
  void end();
  void followPosition();
  void changed();
  void compose();
  [[nodiscard]] KnownPosition position() const;

  ModemServices _services;
  ModemWish _wish;
  BusFaults _faults;
  std::function<void()> _ready;
  std::function<void()> _done;
  bool _isWatched = false;
  bool _isEnding = false;
  bool _isChangePosted = false;
  std::optional<PositionFix> _fix;
  std::string _fixFailure;
  std::optional<Bytes> _next;
  std::optional<Moment> _moment;
  Bytes _message;
  std::unique_ptr<PositionFeed> _feed;
  std::unique_ptr<ModemFollower> _follower;
  std::unique_ptr<Timer> _timer;
  /// Blocks on the queue hold it weakly, to know whether the source still is.
  std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

}  // namespace kestro
