// SPDX-License-Identifier: MIT
// Displays in the formats that programs read, and as plain text.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "CommandLine/Formats/JsonWriter.h"
#include "Model/KestroModelNode.h"
#include "Platform/Clock.h"

namespace kestro {

/// Writes a display as one JSON value: a dictionary node as an object in display order, an array
/// node as an array, a leaf as a string. Children of one name are told apart as SiblingNames does.
void writeDisplayJson(JsonWriter& writer, const KestroModelNode& display);

/// What is said of a display beside it.
struct DisplayHead {
  Moment time;
  std::optional<std::uint64_t> message{};  ///< the last one's number, where there are numbers
  std::string_view technology{};           ///< empty: not told
};

/// Appends one line {"time", "message", "technology", "display"}, what is absent left out.
void appendNdjsonLine(std::string& output, const DisplayHead& head, const KestroModelNode& display);

/// The heading of the CSV form: "time,message,path,value", or with "technology" behind the message.
void appendCsvHeading(std::string& output, bool hasTechnology);

/// Appends one line for each leaf; there is a message. Fields are quoted where RFC 4180 wants it,
/// lines end with a single line feed; bytes that are no UTF-8 become U+FFFD. Children of one name
/// are told apart in the path as SiblingNames does.
void appendCsvLines(std::string& output, const DisplayHead& head, const KestroModelNode& display);

/// Appends the display as people read it, in lines of any length without terminal attributes.
void appendPlainTree(std::string& output, const KestroModelNode& display);

}  // namespace kestro
