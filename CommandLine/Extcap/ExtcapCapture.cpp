// SPDX-License-Identifier: MIT
#include "CommandLine/Extcap/ExtcapCapture.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <chrono>
#include <memory>
#include <utility>

#include "CommandLine/Commands/LiveRun.h"
#include "CommandLine/Commands/RecordSession.h"
#include "CommandLine/ExitStatus.h"
#include "Platform/MainQueue.h"

namespace kestro {
namespace {

constexpr std::chrono::milliseconds kPipeLookInterval{500};
/// How often nobody may have opened the pipe for reading: Wireshark does so after it has started
/// this program.
constexpr int kLooksWithoutReader = 20;

/// Tells whether nobody reads a pipe any more, also while nothing is written to it.
class PipeWatch {
 public:
  explicit PipeWatch(std::string path) : _path(std::move(path)) {}
  ~PipeWatch() {
    if (_descriptor >= 0) ::close(_descriptor);
  }
  PipeWatch(const PipeWatch&) = delete;
  PipeWatch& operator=(const PipeWatch&) = delete;

  [[nodiscard]] bool hasReader() {
    if (_descriptor < 0) open();
    pollfd entry{.fd = _descriptor, .events = 0, .revents = 0};
    return _descriptor >= 0 && (::poll(&entry, 1, 0) <= 0 || (entry.revents & POLLERR) == 0);
  }

  /// Whether nobody will read it, to be asked once an interval.
  [[nodiscard]] bool isAbandoned() {
    if (hasReader()) return false;
    return _descriptor >= 0 || ++_vainLooks >= kLooksWithoutReader;
  }

 private:
  /// Fails while there is no reader.
  void open() {
    // NOLINTNEXTLINE(cppcoreguidelines-pro-type-vararg): the system's interface
    _descriptor = ::open(_path.c_str(), O_WRONLY | O_NONBLOCK | O_CLOEXEC);
  }

  std::string _path;
  int _descriptor = -1;
  int _vainLooks = 0;
};

class CaptureTask : public LiveTask {
 public:
  CaptureTask(const std::string& pipe, Platform& platform, Finish finish)
      : _platform(platform),
        _finish(std::move(finish)),
        _watch(pipe),
        // Remarks are for people who look on; Wireshark takes all that is said for a failure.
        _session(
            platform, pipe, {}, [](const std::string&) {},
            [this](const std::string& reason) { fail(reason); }) {}

  void start() override {
    _looks = _platform.mainQueue().scheduleRepeating(kPipeLookInterval, [this] {
      if (_watch.isAbandoned()) stop();
    });
    _session.start();
  }

  void stop() override {
    _session.stop();
    _finish(kExitDone, "");
  }

 private:
  /// A pipe that nobody reads any more is how most captures end.
  void fail(const std::string& reason) {
    if (!_watch.hasReader()) return _finish(kExitDone, "");
    _finish(kExitNothingDone, reason);
  }

  Platform& _platform;
  Finish _finish;
  PipeWatch _watch;
  RecordSession _session;
  std::unique_ptr<Timer> _looks;
};

}  // namespace

int captureForWireshark(const LiveOptions& options, const std::string& pipe) {
  return runLive(options, [&](LinuxPlatform& platform, Finish finish) {
    return std::make_unique<CaptureTask>(pipe, platform, std::move(finish));
  });
}

}  // namespace kestro
