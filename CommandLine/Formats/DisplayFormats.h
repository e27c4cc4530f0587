// SPDX-License-Identifier: MIT
// Displays in the formats that programs read, and as plain text.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "CommandLine/Formats/JsonWriter.h"
#include "Model/KestroModelNode.h"
#include "Platform/Clock.h"

namespace kestro {

/// Writes a display as one JSON value: a dictionary node as an object in display order, an array
/// node as an array, a leaf as a string. Children of one name are told apart as SiblingNames does.
void writeDisplayJson(JsonWriter& writer, const KestroModelNode& display);

/// Appends one line {"time", "message", "display"}; "message" only where there are numbers.
void appendNdjsonLine(std::string& output, Moment time, std::optional<std::uint64_t> message,
                      const KestroModelNode& display);

/// The heading of the CSV form: "time,message,path,value".
void appendCsvHeading(std::string& output);

/// Appends one line for each leaf. Fields are quoted where RFC 4180 wants it, lines end with a
/// single line feed; bytes that are no UTF-8 become U+FFFD. Children of one name are told apart in
/// the path as SiblingNames does.
void appendCsvLines(std::string& output, Moment time, std::uint64_t message,
                    const KestroModelNode& display);

/// Appends the display as people read it, in lines of any length without terminal attributes.
void appendPlainTree(std::string& output, const KestroModelNode& display);

}  // namespace kestro
