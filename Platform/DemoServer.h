// SPDX-License-Identifier: MIT
// A telephony server that a live display starts for itself, and that ends with it.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Platform/MainQueue.h"
#include "Platform/Platform.h"

namespace kestro {

/// What a demo plays unless told otherwise.
inline constexpr const char* kDefaultDemoSource = "simulation";

/// What a demo plays, and how.
struct DemoOptions {
  std::string source = kDefaultDemoSource;
  double speed = 1;  ///< seconds of the source in one second
  bool loops = false;
};

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

  /// Watches the server for as long as the returned timer is held. Calls `ready` on the main queue
  /// once the server owns the port `serverName`. Calls `ended` once, with the reason, when the
  /// server does not own the port within 10 s, or when it ends. `platform` must use this server's
  /// port directory.
  [[nodiscard]] virtual std::unique_ptr<Timer> watch(
      Platform& platform, const std::string& serverName, std::function<void()> ready,
      std::function<void(const std::string& reason)> ended) = 0;

  /// Removes the directory at once. For those who end the process without destroying this object.
  virtual void removeDirectory() noexcept = 0;
};

}  // namespace kestro
