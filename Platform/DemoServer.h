// SPDX-License-Identifier: MIT
// A telephony server of one's own, for as long as a live display runs.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Platform/MainQueue.h"
#include "Platform/Platform.h"

namespace kestro {

/// What a demo plays unless told otherwise.
inline constexpr const char* kDefaultDemoSource = "simulation";

/// A telephony server with a source, on a port directory that nobody else uses. It ends with this
/// object, or with this process, however that ends.
class DemoServer {
 public:
  DemoServer() = default;
  /// Ends the server and removes the directory.
  virtual ~DemoServer() = default;
  DemoServer(const DemoServer&) = delete;
  DemoServer& operator=(const DemoServer&) = delete;

  [[nodiscard]] virtual const std::string& portDirectory() const noexcept = 0;

  /// Calls `ready` on the main queue once the server owns the port `serverName`; it is waited for
  /// at most 10 s. Calls `ended` instead, or later, with the reason when the server is not or no
  /// more there. Whoever holds the timer that is returned watches; `platform` must use this
  /// server's port directory.
  [[nodiscard]] virtual std::unique_ptr<Timer> watch(
      Platform& platform, const std::string& serverName, std::function<void()> ready,
      std::function<void(const std::string& reason)> ended) = 0;

  /// Removes the directory at once, for who ends the process without destroying this.
  virtual void removeDirectory() noexcept = 0;
};

}  // namespace kestro
