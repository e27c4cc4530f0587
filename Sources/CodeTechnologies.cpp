// SPDX-License-Identifier: MIT
#include "Sources/CodeTechnologies.h"

#include <memory>
#include <set>
#include <unordered_map>

#include "LogGenerator/LogGenerator.h"
#include "Platform/SystemLog.h"
#include "Platform/TextSink.h"

namespace kestro {
namespace {

/// Takes what generators say of themselves when they are only asked for their codes.
class NoLog final : public SystemLog {
 public:
  NoLog() : SystemLog(LogPriority{-1}) {}

 protected:
  void writeLine(LogPriority /*priority*/, std::string_view /*line*/) override {}
};

class NoText final : public TextSink {
 public:
  void writeLine(std::string_view /*line*/) override {}
};

using Table = std::unordered_map<LogCode, std::vector<std::string_view>>;

Table tableOf(const GeneratorServices& services) {
  NoLog log;
  NoText text;
  const GeneratorServices quiet{.systemLog = log,
                                .consoleLog = text,
                                .standardOutput = text,
                                .clock = services.clock,
                                .bundle = services.bundle,
                                .propertyListCoding = services.propertyListCoding};
  Table table;
  for (const std::string_view technology : LogGenerator::technologies()) {
    std::set<LogCode> codes;
    LogGenerator::generatorFromTechnology(quiet, technology)
        ->catalogue([&](const CatalogueEntry& entry) { codes.insert(entry.code); });
    for (const LogCode code : codes) table[code].push_back(technology);
  }
  return table;
}

}  // namespace

TechnologiesOfCode technologiesByCode(const GeneratorServices& services) {
  return [services, table = std::shared_ptr<Table>()](
             std::uint16_t code) mutable -> std::vector<std::string_view> {
    if (!table) table = std::make_shared<Table>(tableOf(services));
    const auto found = table->find(code);
    return found == table->end() ? std::vector<std::string_view>() : found->second;
  };
}

}  // namespace kestro
