// SPDX-License-Identifier: MIT
// Positions that a test moves.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "Platform/PositionService.h"

namespace kestro {

class VirtualPositionService : public PositionService {
 public:
  [[nodiscard]] std::unique_ptr<PositionFeed> follow(const PositionServer& server,
                                                     PositionHandlers handlers) override {
    _server = server;
    auto shared = std::make_shared<PositionHandlers>(std::move(handlers));
    _handlers = shared;
    return std::make_unique<Feed>(std::move(shared));
  }

  void move(const std::optional<PositionFix>& fix) const {
    if (const auto handlers = _handlers.lock()) handlers->moved(fix);
  }
  void fail(std::string_view reason) const {
    if (const auto handlers = _handlers.lock()) handlers->failed(reason);
  }
  /// Whether somebody follows.
  [[nodiscard]] bool isFollowed() const noexcept { return !_handlers.expired(); }
  /// The gpsd that was asked for last.
  [[nodiscard]] const PositionServer& server() const noexcept { return _server; }

 private:
  class Feed : public PositionFeed {
   public:
    explicit Feed(std::shared_ptr<PositionHandlers> handlers) : _handlers(std::move(handlers)) {}

   private:
    std::shared_ptr<PositionHandlers> _handlers;
  };

  PositionServer _server;
  std::weak_ptr<PositionHandlers> _handlers;
};

}  // namespace kestro
