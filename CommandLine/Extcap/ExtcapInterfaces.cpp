// SPDX-License-Identifier: MIT
#include "CommandLine/Extcap/ExtcapInterfaces.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <iterator>

#include "LogGenerator/LogGenerator.h"
#include "Options/ProgramOptions.h"
#include "Platform/TelephonyService.h"
#include "Recordings/PcapFormat.h"

namespace kestro {
namespace {

struct InterfaceRow {
  std::string_view name;
  std::string_view title;
};

constexpr std::array kInterfaces = {
    InterfaceRow{kChannelInterface, "Kestro log channel"},
    InterfaceRow{kSimulationInterface, "Kestro simulation"},
};

/// An option of an interface. Its number is its place among the interface's.
struct OptionText {
  std::string_view interfaceName;
  std::string_view call;
  std::string_view title;
  std::string_view help;
  bool isTechnology = false;  ///< chosen from the technologies; any text otherwise
  std::string_view preset{};
};

constexpr std::array kOptions = {
    OptionText{.interfaceName = kChannelInterface,
               .call = "--server-name",
               .title = "Server name",
               .help = "The telephony server's port"},
    OptionText{.interfaceName = kSimulationInterface,
               .call = "--source",
               .title = "Source",
               .help = "What is played, as kestro-telephonyd --source takes it",
               .preset = kSimulationSource},
    OptionText{.interfaceName = kSimulationInterface,
               .call = "--technology",
               .title = "Technology",
               .help = "Of the source simulation",
               .isTechnology = true,
               .preset = kTqLogChannelTechnology_Ondrel_LTE},
};

std::string optionAnswer(const OptionText& option, unsigned number) {
  std::string text = fmt::format("arg {{number={}}}{{call={}}}{{display={}}}{{tooltip={}}}", number,
                                 option.call, option.title, option.help);
  auto end = std::back_inserter(text);
  if (!option.isTechnology) {
    const std::string serverName = LiveOptions().serverName;
    fmt::format_to(end, "{{type=string}}{{default={}}}\n",
                   option.preset.empty() ? std::string_view(serverName) : option.preset);
    return text;
  }
  text += "{type=selector}\n";
  for (const std::string_view technology : LogGenerator::technologies()) {
    fmt::format_to(end, "value {{arg={}}}{{value={}}}{{display={}}}{{default={}}}\n", number,
                   technology, technology, technology == option.preset);
  }
  return text;
}

}  // namespace

bool isExtcapInterface(std::string_view name) noexcept {
  return std::ranges::find(kInterfaces, name, &InterfaceRow::name) != kInterfaces.end();
}

std::string interfacesAnswer(std::string_view version) {
  std::string text = fmt::format("extcap {{version={}}}{{display=Kestro}}\n", version);
  for (const InterfaceRow& row : kInterfaces) {
    fmt::format_to(std::back_inserter(text), "interface {{value={}}}{{display={}}}\n", row.name,
                   row.title);
  }
  return text;
}

std::string linkTypesAnswer() {
  std::string text;
  for (const std::string_view technology : LogGenerator::technologies()) {
    const auto linkType = linkTypeOfTechnology(technology);
    if (!linkType) continue;
    fmt::format_to(std::back_inserter(text), "dlt {{number={}}}{{name={}}}{{display=Kestro {}}}\n",
                   *linkType, technology, technology);
  }
  return text;
}

std::string optionsAnswer(std::string_view interfaceName) {
  std::string text;
  unsigned number = 0;
  for (const OptionText& option : kOptions) {
    if (option.interfaceName == interfaceName) text += optionAnswer(option, number++);
  }
  return text;
}

}  // namespace kestro
