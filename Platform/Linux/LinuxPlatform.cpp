// SPDX-License-Identifier: MIT
#include "Platform/Linux/LinuxPlatform.h"

#include <QCoreApplication>
#include <clocale>
#include <cstdio>
#include <utility>

#include "Platform/Bundle.h"
#include "Platform/Clock.h"
#include "Platform/Linux/FileDeviceRoot.h"
#include "Platform/Linux/FileInputStreams.h"
#include "Platform/Linux/GpsdPositions.h"
#include "Platform/Linux/IniPreferences.h"
#include "Platform/Linux/MessagePorts.h"
#include "Platform/Linux/ModemBus.h"
#include "Platform/Linux/ProcessSignals.h"
#include "Platform/Linux/QtMainQueue.h"
#include "Platform/Linux/QueuedSystemLog.h"
#include "Platform/Linux/RandomUuids.h"
#include "Platform/Linux/StdioTextSink.h"
#include "Platform/Linux/TelephonyService.h"

namespace kestro {
namespace {

/// Qt's application object: the one that exists, or one of our own.
class EventLoop {
 public:
  EventLoop() {
    if (QCoreApplication::instance() == nullptr) {
      _own = std::make_unique<QCoreApplication>(_argumentCount, _arguments);
    }
    // Qt takes the user's locale over; numbers in texts and property lists keep the C form.
    std::setlocale(LC_NUMERIC, "C");
  }

  int run() {
    if (_earlyStatus) return *std::exchange(_earlyStatus, std::nullopt);
    _isRunning = true;
    const int status = QCoreApplication::exec();
    _isRunning = false;
    return status;
  }

  // Qt forgets an exit that is asked for before its loop runs.
  void quit(int exitStatus) {
    if (_isRunning) {
      QCoreApplication::exit(exitStatus);
    } else {
      _earlyStatus = exitStatus;
    }
  }

 private:
  int _argumentCount = 1;
  char _name[7] = "kestro";
  char* _arguments[2] = {_name, nullptr};
  std::unique_ptr<QCoreApplication> _own;
  std::optional<int> _earlyStatus;
  bool _isRunning = false;
};

/// No priority is as grave as this, so that nothing is accepted.
constexpr LogPriority kNothing{-1};

std::unique_ptr<QueuedSystemLog> createSystemLog(std::optional<LogPriority> threshold) {
  if (threshold) return std::make_unique<QueuedSystemLog>(*threshold, syslogWriter());
  return std::make_unique<QueuedSystemLog>(kNothing, [](LogPriority, const std::string&) {});
}

class LinuxPlatformServices final : public LinuxPlatform {
 public:
  explicit LinuxPlatformServices(const LinuxPlatformOptions& options)
      : _systemLog(createSystemLog(options.logThreshold)),
        _standardOutput(options.standardOutputToStandardError ? stderr : stdout),
        _preferences(*_systemLog, IniPreferences::directoryFromEnvironment()),
        _messagePorts(createUnixMessagePorts(*_systemLog, options.portDirectory)),
        _telephonyService(createPortTelephonyService(*_messagePorts, _uuids, *_coding, *_systemLog,
                                                     options.telephonyServerName)) {}

  [[nodiscard]] SystemLog& systemLog() override { return *_systemLog; }
  [[nodiscard]] TextSink& consoleLog() override { return _consoleLog; }
  [[nodiscard]] TextSink& standardOutput() override { return _standardOutput; }
  [[nodiscard]] Clock& clock() override { return *_clock; }
  [[nodiscard]] Bundle& bundle() override { return *_bundle; }
  [[nodiscard]] PropertyListCoding& propertyListCoding() override { return *_coding; }
  [[nodiscard]] MainQueue& mainQueue() override { return _mainQueue; }
  [[nodiscard]] MessagePorts& messagePorts() override { return *_messagePorts; }
  [[nodiscard]] TelephonyService& telephonyService() override { return *_telephonyService; }
  [[nodiscard]] InputStreams& inputStreams() override { return _inputStreams; }
  [[nodiscard]] Uuids& uuids() override { return _uuids; }
  [[nodiscard]] Preferences& preferences() override { return _preferences; }
  [[nodiscard]] DeviceRoot& deviceRoot() override { return _deviceRoot; }
  [[nodiscard]] ModemService& modemService() override { return _modemService; }
  [[nodiscard]] PositionService& positionService() override { return _positionService; }

  int run() override { return _eventLoop.run(); }
  void quit(int exitStatus) override { _eventLoop.quit(exitStatus); }
  void setTerminationHandler(std::function<void()> handler) override {
    _signals.setTerminationHandler(std::move(handler));
  }
  void setResizeHandler(std::function<void()> handler) override {
    _signals.setResizeHandler(std::move(handler));
  }
  void flushSystemLog() override { static_cast<void>(_systemLog->flush()); }
  [[nodiscard]] Result<void> createDefaultDeviceRoot() override {
    return FileDeviceRoot::createDefault();
  }

 private:
  // In this order: each may use those above it, and what still waits in the queue dies first.
  EventLoop _eventLoop;
  std::unique_ptr<QueuedSystemLog> _systemLog;
  StdioTextSink _consoleLog{stderr};
  StdioTextSink _standardOutput;
  std::unique_ptr<Clock> _clock = createSystemClock();
  std::unique_ptr<Bundle> _bundle = createBundle();
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  RandomUuids _uuids;
  FileDeviceRoot _deviceRoot{FileDeviceRoot::pathFromEnvironment()};
  IniPreferences _preferences;
  FileInputStreams _inputStreams;
  std::unique_ptr<MessagePorts> _messagePorts;
  std::unique_ptr<TelephonyService> _telephonyService;
  LinuxModemService _modemService;
  GpsdPositions _positionService;
  ProcessSignals _signals;
  QtMainQueue _mainQueue;
};

}  // namespace

std::unique_ptr<LinuxPlatform> createLinuxPlatform(const LinuxPlatformOptions& options) {
  return std::make_unique<LinuxPlatformServices>(options);
}

}  // namespace kestro
