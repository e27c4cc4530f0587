// SPDX-License-Identifier: MIT
// The live display's behaviour, apart from how it is shown.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "CommandLine/Terminal/WatchView.h"
#include "Model/KestroModel.h"
#include "Platform/Platform.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {

/// Shows a model's displays in a view: the status is "Connecting..." while the model is not
/// connected and until the first data, else the time of the last refresh. Main thread only.
class WatchSession {
 public:
  /// `view` and `platform` must outlive the session. After `refreshLimit` refreshes, or when the
  /// view has failed, nothing more is shown, and `ended` is called once.
  /// `serverName` is the port that is connected to.
  WatchSession(Platform& platform, WatchView& view, std::optional<std::uint64_t> refreshLimit,
               std::function<void()> ended,
               std::string serverName = std::string(kDefaultServerName));

  /// Shows the status and begins to connect.
  void start();
  /// Shows the same again, for another window.
  void redraw();

 private:
  void refresh();
  void connectionChanged();
  void updateStatus();
  void updateOrigin();
  void endIfOver();

  Platform& _platform;
  WatchView& _view;
  std::optional<std::uint64_t> _refreshLimit;
  std::function<void()> _ended;
  std::string _serverName;
  bool _isOver = false;
  std::uint64_t _refreshCount = 0;
  std::string _updateMessage = "Connecting...";
  WatchState _state;
  std::shared_ptr<WatchSession*> _self;  ///< what a queued redraw finds this by, while it lives
  std::shared_ptr<KestroModel> _model;
};

}  // namespace kestro
