// SPDX-License-Identifier: MIT
#include "CommandLine/OfflineServices.h"

#include <fmt/format.h>

#include <string>
#include <utility>

#include "CommandLine/Formats/JsonWriter.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TextSink.h"
#include "Sources/CodeTechnologies.h"

namespace kestro {
namespace {

/// Below every priority: no line is even formatted.
constexpr LogPriority kNoPriority{-1};

class NoSink : public TextSink {
 public:
  void writeLine(std::string_view /*line*/) override {}
};

}  // namespace

struct OfflineServices::Services {
  class Log : public SystemLog {
   public:
    Log(std::optional<Output> file, LogPriority shown)
        : SystemLog(file ? LogPriority::Debug : shown), _file(std::move(file)), _shown(shown) {}

    [[nodiscard]] Result<void> finish() {
      if (!_file) return {};
      _file->flush();
      if (_file->failureMessage().empty()) return {};
      return failure(_file->failureMessage());
    }

   protected:
    void writeLine(LogPriority priority, std::string_view line) override {
      if (priority <= _shown) standardErrorSink().writeLine(line);
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
    LogPriority _shown;
    std::string _text;
  };

  Services(std::optional<Output> logFile, std::optional<LogPriority> shown)
      : isSilent(!logFile && !shown), log(std::move(logFile), shown.value_or(kNoPriority)) {}

  /// Where lines go that decoders do not give to the system log.
  [[nodiscard]] TextSink& decodersLines() { return isSilent ? nowhere : standardErrorSink(); }

  bool isSilent;
  NoSink nowhere;
  Log log;
  std::unique_ptr<Clock> systemClock = createSystemClock();
  ReplayClock clock{*systemClock};
  std::unique_ptr<Bundle> bundle = createBundle();
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

OfflineServices::OfflineServices(std::optional<Output> logFile, std::optional<LogPriority> shown)
    : _services(std::make_unique<Services>(std::move(logFile), shown)) {}
OfflineServices::~OfflineServices() = default;

SystemLog& OfflineServices::systemLog() noexcept { return _services->log; }
ReplayClock& OfflineServices::clock() noexcept { return _services->clock; }
const PropertyListCoding& OfflineServices::propertyListCoding() const noexcept {
  return *_services->coding;
}

GeneratorServices OfflineServices::forGenerator() noexcept {
  return {.systemLog = _services->log,
          .consoleLog = _services->decodersLines(),
          .standardOutput = _services->decodersLines(),
          .clock = _services->clock,
          .bundle = *_services->bundle,
          .propertyListCoding = *_services->coding};
}

SourceServices OfflineServices::forSources() {
  return {.propertyListCoding = *_services->coding,
          .clock = *_services->systemClock,
          .technologiesOfCode = technologiesByCode(forGenerator())};
}

Result<void> OfflineServices::finishLog() { return _services->log.finish(); }

}  // namespace kestro
