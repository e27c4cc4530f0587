// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CodesMarkdown.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <iterator>
#include <vector>

#include "CommandLine/Formats/LayoutText.h"

namespace kestro {
namespace {

constexpr std::string_view kIntroduction = R"(# Log codes

Every log code that Kestro asks a baseband for, and what it shows of the packets: made from the
tables that decode them, by `kestro-cli codes --format=markdown`. What lies in the packets of a
recording, byte by byte, is told by `kestro-cli explain`.

- A packet begins with a header of 13 bytes: its type (1 byte), then length (2), log code (2) and
  time (8), little-endian. Offsets count from the packet's first byte. A message may carry a prefix
  of 2 bytes, the first of them 0x81, in front of its packet; it is no part of the packet.
- "From 33 bytes" is the least length of a packet that is decoded. Shorter ones change nothing,
  unless a section says what it takes from a shorter packet. What follows ("exactly that long") a
  packet must have, too. A byte past the end reads as 0.
- `u16 at 19, bits 0-8` are the 9 least significant bits of the unsigned 16-bit integer in the bytes
  19 and 20. Integers are little-endian unless said otherwise, `s` stands for signed ones (two's
  complement). In tables of records `+4` counts from the record's first byte.
- Shown is the raw value x in the format of C's `printf`, perhaps after a formula; or the text that
  a list gives to the value. Where a condition after `when` does not hold, the text after its `else`
  is shown; without an `else` the key is left out. A key without a place, and without a word on how
  it is shown, is worked out by its decoder, perhaps from several packets.
- Codes of 0xFF0000 and above are extra packets: they come from the telephony server, not from the
  baseband, and carry a property list after the header. They have no least length. `From` names the
  key of the value in the list.
)";

/// A text within a cell of a table.
std::string cell(std::string_view text) {
  std::string result;
  for (const char character : text) {
    if (character == '|' || character == '<' || character == '*' || character == '_' ||
        character == '[' || character == ']') {
      result += '\\';
    }
    result += character;
  }
  return result;
}

std::string_view titleOf(const ListedCode& code) {
  return code.name.empty() ? "(contents not known)" : code.name;
}

void appendOverview(std::string& output, const TechnologyCodes& technology) {
  output += "| Code | Packet | At least | Sections |\n|---|---|---|---|\n";
  for (const CodeFamily& family : technology.families) {
    for (const ListedCode& code : family.codes) {
      std::vector<std::string> sections;
      for (const CatalogueEntry& entry : code.entries) sections.push_back(cell(entry.section));
      fmt::format_to(std::back_inserter(output), "| {} | {} | {} | {} |\n", logCodeText(code.code),
                     cell(titleOf(code)),
                     code.minimumLength == 0 ? "" : fmt::format("{} bytes", code.minimumLength),
                     fmt::join(sections, ", "));
    }
  }
}

void appendKeyTable(std::string& output, std::span<const CatalogueKey> keys) {
  output += "\n| Key | From | Shown as |\n|---|---|---|\n";
  for (const CatalogueKey& key : keys) {
    fmt::format_to(std::back_inserter(output), "| {} | {} | {} |\n",
                   key.key.empty() ? "(no key)" : cell(key.key), cell(sourcesText(key)),
                   cell(shownText(key)));
  }
}

/// What a packet does to a section that shows nothing of it.
std::string_view textWithoutKeys(const CatalogueEntry& entry) {
  return entry.packetName.empty() ? "takes nothing from it" : "is emptied by it";
}

/// What becomes of a table's records.
std::string rowsText(const CatalogueKey& key) {
  if (key.isKept) return "Not shown, but kept for the rows that other packets make";
  const std::string_view what = key.key.empty() ? "texts" : "rows";
  return key.list.empty() ? "Rows" : fmt::format("{}: {}", cell(key.list), what);
}

/// The keys of a packet, then those of each table's records, apart.
void appendKeyTables(std::string& output, std::span<const CatalogueKey> keys) {
  while (!keys.empty()) {
    std::size_t size = 1;
    while (size < keys.size() && keys[size].table == keys[0].table) ++size;
    if (keys[0].table != nullptr) {
      fmt::format_to(std::back_inserter(output), "\n{}, {}.\n", rowsText(keys[0]),
                     cell(tableText(*keys[0].table)));
    }
    appendKeyTable(output, keys.first(size));
    keys = keys.subspan(size);
  }
}

/// What one section takes from the packet.
void appendEntry(std::string& output, const CatalogueEntry& entry) {
  auto end = std::back_inserter(output);
  fmt::format_to(end, "\n**{}**", entry.section);
  if (entry.propertyList != nullptr)
    fmt::format_to(end, ", {}", cell(partText(*entry.propertyList, entry.kind)));
  if (entry.keys.empty() && entry.propertyList == nullptr) {
    fmt::format_to(end, ": {}", textWithoutKeys(entry));
  }
  output += '\n';
  appendKeyTables(output, entry.keys);
  if (entry.shorterKeys.empty()) return;
  output += "\nFrom a shorter packet:\n";
  appendKeyTables(output, entry.shorterKeys);
}

void appendCodeChapter(std::string& output, const ListedCode& code) {
  auto end = std::back_inserter(output);
  fmt::format_to(end, "\n#### {} {}\n", logCodeText(code.code), titleOf(code));
  if (code.minimumLength != 0) {
    fmt::format_to(end, "\nFrom {} bytes", code.minimumLength);
    for (const std::string& text : requirementTexts(code.entries.front().requirements)) {
      fmt::format_to(end, ", {}", text);
    }
    output += ".\n";
  }
  for (const CatalogueEntry& entry : code.entries) appendEntry(output, entry);
}

}  // namespace

std::string codesMarkdown(std::span<const TechnologyCodes> technologies) {
  std::string text(kIntroduction);
  for (const TechnologyCodes& technology : technologies) {
    fmt::format_to(std::back_inserter(text), "\n## {}\n\n", technology.technology);
    if (technology.families.empty()) {
      text += "No log codes: the messages are property lists, shaped for display.\n";
      continue;
    }
    appendOverview(text, technology);
    for (const CodeFamily& family : technology.families) {
      fmt::format_to(std::back_inserter(text), "\n### {}: {}\n", technology.technology,
                     family.name);
      for (const ListedCode& code : family.codes) appendCodeChapter(text, code);
    }
  }
  return text;
}

}  // namespace kestro
