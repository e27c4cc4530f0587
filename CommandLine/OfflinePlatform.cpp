// SPDX-License-Identifier: MIT
#include "CommandLine/OfflinePlatform.h"

#include <fmt/format.h>

#include <string>
#include <utility>

#include "CommandLine/Formats/JsonWriter.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

/// Below every priority: no line is even formatted.
constexpr LogPriority kNoPriority{-1};

}  // namespace

struct OfflinePlatform::Services {
  class Log : public SystemLog {
   public:
    explicit Log(std::optional<Output> file)
        : SystemLog(file ? LogPriority::Debug : kNoPriority), _file(std::move(file)) {}

    [[nodiscard]] Result<void> finish() {
      if (!_file) return {};
      _file->flush();
      if (_file->failureMessage().empty()) return {};
      return failure(_file->failureMessage());
    }

   protected:
    void writeLine(LogPriority priority, std::string_view line) override {
      if (!_file) return;
      _text.clear();
      JsonWriter writer(_text);
      writer.beginObject();
      writer.key("priority");
      writer.number(static_cast<std::uint64_t>(priority));
      writer.key("message");
      writer.text(line);
      writer.endObject();
      _text += '\n';
      _file->write(_text);
    }

   private:
    std::optional<Output> _file;
    std::string _text;
  };

  class StandardErrorSink : public TextSink {
   public:
    void writeLine(std::string_view line) override { fmt::print(stderr, "{}\n", line); }
  };

  explicit Services(std::optional<Output> logFile) : log(std::move(logFile)) {}

  Log log;
  StandardErrorSink standardError;
  std::unique_ptr<Clock> systemClock = createSystemClock();
  ReplayClock clock{*systemClock};
  std::unique_ptr<Bundle> bundle = createBundle();
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform others{*coding};
};

OfflinePlatform::OfflinePlatform(std::optional<Output> logFile)
    : _services(std::make_unique<Services>(std::move(logFile))) {}
OfflinePlatform::~OfflinePlatform() = default;

SystemLog& OfflinePlatform::systemLog() { return _services->log; }
TextSink& OfflinePlatform::consoleLog() { return _services->standardError; }
TextSink& OfflinePlatform::standardOutput() { return _services->standardError; }
ReplayClock& OfflinePlatform::clock() { return _services->clock; }
Bundle& OfflinePlatform::bundle() { return *_services->bundle; }
PropertyListCoding& OfflinePlatform::propertyListCoding() { return *_services->coding; }
MainQueue& OfflinePlatform::mainQueue() { return _services->others.mainQueue(); }
MessagePorts& OfflinePlatform::messagePorts() { return _services->others.messagePorts(); }
TelephonyService& OfflinePlatform::telephonyService() {
  return _services->others.telephonyService();
}
InputStreams& OfflinePlatform::inputStreams() { return _services->others.inputStreams(); }
Uuids& OfflinePlatform::uuids() { return _services->others.uuids(); }
Preferences& OfflinePlatform::preferences() { return _services->others.preferences(); }
DeviceRoot& OfflinePlatform::deviceRoot() { return _services->others.deviceRoot(); }

Result<void> OfflinePlatform::finishLog() { return _services->log.finish(); }

}  // namespace kestro
