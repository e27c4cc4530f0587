// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CsvField.h"

#include "CommandLine/Formats/DisplayText.h"

namespace kestro {

void appendCsvField(std::string& output, std::string_view text) {
  if (validUtf8Prefix(text) != text.size()) return appendCsvField(output, validUtf8(text));
  if (text.find_first_of(",\"\r\n") == std::string_view::npos) {
    output += text;
    return;
  }
  output += '"';
  for (const char character : text) {
    if (character == '"') output += '"';
    output += character;
  }
  output += '"';
}

}  // namespace kestro
