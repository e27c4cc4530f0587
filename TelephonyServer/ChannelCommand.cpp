// SPDX-License-Identifier: MIT
#include "TelephonyServer/ChannelCommand.h"

#include <fmt/format.h>

#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>
#include <vector>

#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

/// Adds the codes in the array under `key`, if there is one, to `codes`.
Result<void> addCodes(const Dictionary& command, std::string_view key, LogCode offset,
                      std::vector<LogCode>& codes) {
  const Value& list = command[key];
  if (list.isNull()) return {};
  if (!list.isArray()) return failure(fmt::format("{} is no array", key));
  for (const Value& element : list.array()) {
    const auto number = element.integerBits();
    if (!element.isInteger() || number < 0 || number > std::numeric_limits<std::uint16_t>::max()) {
      return failure(fmt::format("an element of {} is no 16-bit code", key));
    }
    codes.push_back(offset | static_cast<LogCode>(number));
  }
  return {};
}

Result<ChannelCommand> startCommand(const Dictionary& command) {
  if (command[kTelephonySetState].text() != kTelephonyStreaming) {
    return failure(fmt::format("{} is not \"{}\"", kTelephonySetState, kTelephonyStreaming));
  }
  StartCommand start;
  if (const Value& times = command[kTelephonyTimes]; !times.isNull()) {
    if (times.type() != ValueType::Boolean) {
      return failure(fmt::format("{} is no boolean", kTelephonyTimes));
    }
    start.wantsTimes = times.flag();
  }
  if (!command.contains(kTelephonySetOndrelLogCodes) &&
      !command.contains(kTelephonySetTqExtraCodes)) {
    return start;
  }
  std::vector<LogCode> codes;
  if (auto added = addCodes(command, kTelephonySetOndrelLogCodes, 0, codes); !added) {
    return tl::unexpected(added.error());
  }
  if (auto added = addCodes(command, kTelephonySetTqExtraCodes, kExtraCodes, codes); !added) {
    return tl::unexpected(added.error());
  }
  start.filter = CodeFilter(std::move(codes));
  return start;
}

}  // namespace

Result<ChannelCommand> parseChannelCommand(const PropertyListCoding& coding, ByteView message) {
  const auto parsed = coding.parse(message);
  if (!parsed) return tl::unexpected(parsed.error());
  if (!parsed->isDictionary()) return failure("the property list is no dictionary");
  const auto command = parsed->dictionary();
  if (command.contains(kTelephonyGetTechnology)) return GetTechnologyCommand{};
  if (command.contains(kTelephonySetState)) return startCommand(command);
  return failure("the dictionary holds no command");
}

}  // namespace kestro
