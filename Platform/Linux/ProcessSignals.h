// SPDX-License-Identifier: MIT
// POSIX signals, delivered on the main thread by the event loop.
#pragma once

#include <QSocketNotifier>
#include <csignal>
#include <functional>
#include <initializer_list>
#include <map>
#include <memory>

#include "Platform/Linux/BlockedCalls.h"
#include "Platform/Linux/FileDescriptor.h"

namespace kestro {

/// At most one exists at a time, and it needs a QCoreApplication. Signals that the process was
/// started to ignore (as nohup does) stay ignored. Destroying it gives every signal its earlier
/// disposition back.
class ProcessSignals {
 public:
  ProcessSignals();
  ~ProcessSignals();
  ProcessSignals(const ProcessSignals&) = delete;
  ProcessSignals& operator=(const ProcessSignals&) = delete;

  /// Runs `handler` on the main thread after SIGINT, SIGTERM or SIGHUP. An empty one gives the
  /// signals back their effect. A system call that blocks the main thread then fails with EINTR, so
  /// that the handler's turn comes, and goes on failing so until this is destroyed.
  void setTerminationHandler(std::function<void()> handler);
  /// Runs `handler` on the main thread after SIGWINCH.
  void setResizeHandler(std::function<void()> handler);

 private:
  void setHandler(std::initializer_list<int> numbers, std::function<void()> handler);
  void catchSignal(int number);
  void releaseSignal(int number);
  void drain();

  BlockedCalls _blockedCalls;
  FileDescriptor _readEnd;
  FileDescriptor _writeEnd;
  std::unique_ptr<QSocketNotifier> _notifier;
  std::map<int, std::function<void()>> _handlers;  ///< by signal number
  std::map<int, struct sigaction> _earlier;        ///< dispositions before ours
};

}  // namespace kestro
