// SPDX-License-Identifier: MIT
// Lines of the system log as the virtual platform keeps them.
#pragma once

#include <string>
#include <utility>

#include "Platform/Virtual/VirtualServices.h"

namespace kestro::testing {

using Line = RecordingSystemLog::Line;

inline Line errorLine(std::string text) { return {LogPriority::Error, std::move(text)}; }
inline Line warningLine(std::string text) { return {LogPriority::Warning, std::move(text)}; }

/// What a decoder says of a value that the message does not have.
inline Line failedToRetrieve(const std::string& section, const std::string& value) {
  return errorLine(section + ": Failed to retrieve " + value + "\n");
}

}  // namespace kestro::testing
