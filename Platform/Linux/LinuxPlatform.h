// SPDX-License-Identifier: MIT
// The only header of the Linux platform, and of all that it uses, that other folders include.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "Platform/DemoServer.h"
#include "Platform/Platform.h"
#include "Platform/Result.h"
#include "Platform/SystemLog.h"

namespace kestro {

struct LinuxPlatformOptions {
  /// Lines above this priority number are dropped; without a value nothing goes to the system log.
  std::optional<LogPriority> logThreshold = LogPriority::Notice;
  /// The port name of the telephony server to talk to.
  std::string telephonyServerName = "TelephonyServer";
  /// Where ports live; without a value the environment decides ($KESTRO_PORT_DIR and so on).
  std::optional<std::string> portDirectory;
  /// Whether the decoders' lines for standard output go to the process's standard error, so that
  /// what a program prints for other programs stays clean.
  bool standardOutputToStandardError = true;
};

/// The platform of a running process, with its event loop. At most one exists at a time, made and
/// used on the main thread. Where a QCoreApplication (or QApplication) exists already it is used,
/// otherwise the platform makes one of its own.
class LinuxPlatform : public Platform {
 public:
  /// Serves the main queue until `quit`; returns quit's exit status.
  virtual int run() = 0;
  virtual void quit(int exitStatus) = 0;

  /// Calls `handler` on the main thread when the process is asked to end (SIGINT, SIGTERM, SIGHUP).
  /// Without a handler the signals end the process as usual.
  virtual void setTerminationHandler(std::function<void()> handler) = 0;

  /// Calls `handler` on the main thread when the terminal's size changes (SIGWINCH).
  virtual void setResizeHandler(std::function<void()> handler) = 0;

  /// Waits, for at most a second, until the system log has every line so far. Call it first where
  /// the process is ended without destroying the platform.
  virtual void flushSystemLog() = 0;

  /// Makes the default device root with the folders that saving needs, where the root itself is
  /// absent; does nothing where $KESTRO_DEVICE_ROOT chooses another.
  [[nodiscard]] virtual Result<void> createDefaultDeviceRoot() = 0;
};

[[nodiscard]] std::unique_ptr<LinuxPlatform> createLinuxPlatform(
    const LinuxPlatformOptions& options = {});

/// Starts a kestro-telephonyd process, which is looked for beside this program and then in PATH, on
/// a fresh port directory (0700). Call it on the main thread. The error says why it could not be
/// started.
[[nodiscard]] Result<std::unique_ptr<DemoServer>> startDemoServer(const DemoOptions& options);

/// Opens those of the descriptors 0, 1 and 2 that are closed on the null device, so that no file
/// that is opened later becomes one of them and gets lines that were not meant for it. Call it
/// first in `main`. A file that reaches the process's size limit is then a full disk: the write
/// fails, and no signal ends the process.
void prepareStandardStreams() noexcept;

/// Ends the process, as the end of `main` does. Call it there, when the platform is gone. Should a
/// system bus still keep a connection waiting, the end does not wait with it.
[[noreturn]] void endProcess(int status);

/// Lines on standard error, for programs that need no event loop. A line that cannot be written is
/// dropped, whatever the reason.
[[nodiscard]] TextSink& standardErrorSink();

class PropertyListCoding;
class Clock;
class Bundle;

/// Single services, for programs and tests that need no event loop.
[[nodiscard]] std::unique_ptr<PropertyListCoding> createPropertyListCoding();
[[nodiscard]] std::unique_ptr<Clock> createSystemClock();
[[nodiscard]] std::unique_ptr<Bundle> createBundle();

}  // namespace kestro
