// SPDX-License-Identifier: MIT
// A telephony server of one's own, for as long as a live command runs.
#pragma once

#include <sys/types.h>

#include <functional>
#include <memory>
#include <string>

#include "Platform/MainQueue.h"
#include "Platform/Platform.h"
#include "Platform/Result.h"

namespace kestro {

/// A kestro-telephonyd process with a source, on a port directory that nobody else uses. It ends
/// with this object, or with this process, however that ends.
class DemoServer {
 public:
  /// Starts the server, which is looked for beside this program and then in PATH, on a fresh port
  /// directory (0700). Call it on the main thread. The error says why it could not be started.
  [[nodiscard]] static Result<std::unique_ptr<DemoServer>> start(const std::string& source);

  /// Ends the server and removes the directory.
  ~DemoServer();
  DemoServer(const DemoServer&) = delete;
  DemoServer& operator=(const DemoServer&) = delete;

  [[nodiscard]] const std::string& portDirectory() const noexcept { return _directory; }

  /// Calls `ready` on the main queue once the server owns the port `serverName`; it is waited for
  /// at most 10 s. Calls `ended` instead, or later, with the reason when the server is not or no
  /// more there. Whoever holds the timer that is returned watches; `platform` must use this
  /// server's port directory.
  [[nodiscard]] std::unique_ptr<Timer> watch(Platform& platform, const std::string& serverName,
                                             std::function<void()> ready,
                                             std::function<void(const std::string& reason)> ended);

  /// Removes the directory at once, for who ends the process without destroying this.
  void removeDirectory() noexcept;

 private:
  explicit DemoServer(std::string directory) : _directory(std::move(directory)) {}

  [[nodiscard]] std::string logPath() const { return _directory + "/telephonyd.log"; }
  [[nodiscard]] std::string lastLogLine() const;
  [[nodiscard]] bool hasEnded() noexcept;
  void end() noexcept;

  std::string _directory;
  pid_t _process = -1;  ///< -1 before it runs and after it has ended
};

}  // namespace kestro
