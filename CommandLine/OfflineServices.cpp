// SPDX-License-Identifier: MIT
#include "CommandLine/OfflineServices.h"

#include <fmt/format.h>

#include <string>
#include <utility>

#include "CommandLine/Formats/JsonWriter.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TextSink.h"

namespace kestro {
namespace {

/// Below every priority: no line is even formatted.
constexpr LogPriority kNoPriority{-1};

}  // namespace

struct OfflineServices::Services {
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

  explicit Services(std::optional<Output> logFile) : log(std::move(logFile)) {}

  Log log;
  std::unique_ptr<Clock> systemClock = createSystemClock();
  ReplayClock clock{*systemClock};
  std::unique_ptr<Bundle> bundle = createBundle();
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

OfflineServices::OfflineServices(std::optional<Output> logFile)
    : _services(std::make_unique<Services>(std::move(logFile))) {}
OfflineServices::~OfflineServices() = default;

SystemLog& OfflineServices::systemLog() noexcept { return _services->log; }
ReplayClock& OfflineServices::clock() noexcept { return _services->clock; }
const PropertyListCoding& OfflineServices::propertyListCoding() const noexcept {
  return *_services->coding;
}

GeneratorServices OfflineServices::forGenerator() noexcept {
  return {.systemLog = _services->log,
          .consoleLog = standardErrorSink(),
          .standardOutput = standardErrorSink(),
          .clock = _services->clock,
          .bundle = *_services->bundle,
          .propertyListCoding = *_services->coding};
}

Result<void> OfflineServices::finishLog() { return _services->log.finish(); }

}  // namespace kestro
