// SPDX-License-Identifier: MIT
// What the commands that talk to a telephony server have in common.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Options/ProgramOptions.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {

/// What such a command does while the platform's event loop runs.
class LiveTask {
 public:
  LiveTask() = default;
  virtual ~LiveTask() = default;
  LiveTask(const LiveTask&) = delete;
  LiveTask& operator=(const LiveTask&) = delete;

  /// Called once. Where the options ask for a demo, its server is there by now.
  virtual void start() = 0;
  /// The process was asked to end.
  virtual void stop() = 0;
  /// The terminal window has another size.
  virtual void resized() {}
};

/// Ends the event loop, in a later turn of it. Only the first call counts. `complaint`, unless
/// empty, is written to standard error after the task was destroyed.
using Finish = std::function<void(int exitStatus, std::string complaint)>;

using LiveTaskMaker = std::function<std::unique_ptr<LiveTask>(LinuxPlatform& platform, Finish)>;

/// Runs a task until it finishes; the exit status. A failure that nothing catches is named on
/// standard error and in the system log, and ends the process by terminate.
[[nodiscard]] int runLive(const LiveOptions& options, const LiveTaskMaker& makeTask);

}  // namespace kestro
