// SPDX-License-Identifier: MIT
// What a generator asks the baseband for.
#pragma once

#include <set>
#include <string_view>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Packets/Section.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro::testing {

/// The log codes in the generator's start command, extra ones with their offset.
inline std::set<LogCode> subscribedCodes(const LogGenerator& generator) {
  const Dictionary command = generator.getStartCommand();
  std::set<LogCode> codes;
  const auto add = [&](std::string_view key, LogCode offset) {
    const Array numbers = command[key].array();
    for (const Value& number : numbers) {
      codes.insert(offset + static_cast<LogCode>(number.integerBits()));
    }
  };
  add(kTelephonySetOndrelLogCodes, 0);
  add(kTelephonySetTqExtraCodes, kExtraCodes);
  return codes;
}

}  // namespace kestro::testing
