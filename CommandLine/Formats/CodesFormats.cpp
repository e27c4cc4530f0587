// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CodesFormats.h"

#include <fmt/format.h>

#include <iterator>
#include <utility>

#include "CommandLine/Formats/CodesLua.h"
#include "CommandLine/Formats/CodesMarkdown.h"
#include "CommandLine/Formats/JsonWriter.h"
#include "CommandLine/Formats/LayoutData.h"
#include "CommandLine/Formats/LayoutText.h"
#include "LogGenerator/DisplayKeys.h"

namespace kestro {
namespace {

constexpr std::size_t kLineWidth = 100;

std::string_view nameOf(const ListedCode& code) {
  return code.name.empty() ? "(contents not known)" : code.name;
}

// --- For a terminal ------------------------------------------------------------------------------

/// Appends words after an indentation, with line breaks between them where a line is full.
class WrappedWords {
 public:
  WrappedWords(std::string& output, std::string_view indentation)
      : _output(output), _indentation(indentation) {}

  void append(std::string_view word) {
    const bool isFirst = _column == 0;
    if (!isFirst) _output += ',';
    if (isFirst || _column + 2 + word.size() > kLineWidth) {
      if (!isFirst) _output += '\n';
      _output += _indentation;
      _column = _indentation.size();
    } else {
      _output += ' ';
      _column += 2;
    }
    _output += word;
    _column += word.size();
  }
  void end() { _output += '\n'; }

 private:
  std::string& _output;
  std::string_view _indentation;
  std::size_t _column = 0;
};

bool isTakenOut(const CatalogueKey& key) {
  return key.fields.size() == 1 && key.fields[0]->text.kind == TextRule::Kind::Removed;
}

std::string nameOf(const CatalogueKey& key) {
  return fmt::format("{}{}", key.key, isTakenOut(key) ? " (taken out)" : "");
}

/// What the first key of a list has in front; empty: nothing.
std::string_view labelOf(const CatalogueKey& key) { return key.isKept ? "kept" : key.list; }

/// Keys in lines of their own, after the label, if any, of what they belong to.
void appendKeys(std::string& output, std::span<const CatalogueKey> keys, std::string_view first) {
  if (keys.empty()) return;
  WrappedWords words(output, "      ");
  std::string_view label;
  for (const CatalogueKey& key : keys) {
    if (key.key.empty()) {
      words.append(key.list);  // plain texts
      continue;
    }
    const std::string_view own = first.empty() ? labelOf(key) : first;
    const bool isNew = own != label && !own.empty();
    words.append(isNew ? fmt::format("{}: {}", own, nameOf(key)) : nameOf(key));
    label = own;
  }
  words.end();
}

void appendCode(std::string& output, const ListedCode& code) {
  auto end = std::back_inserter(output);
  fmt::format_to(end, "  {:<8}  {}", logCodeText(code.code), nameOf(code));
  if (code.minimumLength > 0) fmt::format_to(end, ", from {} bytes", code.minimumLength);
  for (const std::string& text : requirementTexts(code.entries.front().requirements)) {
    fmt::format_to(end, ", {}", text);
  }
  output += '\n';
  for (const CatalogueEntry& entry : code.entries) {
    fmt::format_to(end, "    {}\n", entry.section);
    appendKeys(output, entry.keys, "");
    appendKeys(output, entry.shorterKeys, "from a shorter packet");
  }
}

std::string tableText(std::span<const TechnologyCodes> technologies) {
  std::string text;
  for (const TechnologyCodes& technology : technologies) {
    if (!text.empty()) text += '\n';
    if (technology.families.empty()) {
      text += technology.technology;
      text += "\n  no log codes: its messages are property lists, shaped for display\n";
    }
    bool isFirst = true;
    for (const CodeFamily& family : technology.families) {
      if (!std::exchange(isFirst, false)) text += '\n';
      fmt::format_to(std::back_inserter(text), "{}: {}\n", technology.technology, family.name);
      for (const ListedCode& code : family.codes) appendCode(text, code);
    }
  }
  return text;
}

// --- For programs --------------------------------------------------------------------------------

void writeText(JsonWriter& writer, std::string_view key, std::string_view text) {
  writer.key(key);
  writer.text(text);
}

void writeKeys(JsonWriter& writer, std::string_view name, std::span<const CatalogueKey> keys) {
  writer.key(name);
  writer.beginArray();
  for (const CatalogueKey& key : keys) {
    writer.beginObject();
    if (!key.list.empty()) writeText(writer, "list", key.list);
    writeText(writer, "key", key.key);
    writeText(writer, "from", sourcesText(key));
    writeText(writer, "shown", shownText(key));
    if (key.isKept) {
      writer.key("kept");
      writer.boolean(true);
    }
    writer.endObject();
  }
  writer.endArray();
}

void writeEntry(JsonWriter& writer, const CatalogueEntry& entry) {
  writer.beginObject();
  writeText(writer, "section", entry.section);
  writeText(writer, "group", nameInSortedDictionary(entry.group));
  writeText(writer, "kind", entry.kind == SectionKind::List ? "list" : "dictionary");
  writeKeys(writer, "keys", entry.keys);
  if (!entry.shorterKeys.empty()) writeKeys(writer, "shorterKeys", entry.shorterKeys);
  writer.endObject();
}

void writeCode(JsonWriter& writer, const ListedCode& code) {
  writer.beginObject();
  writeText(writer, "code", logCodeText(code.code));
  writeText(writer, "name", code.name);
  writer.key("minimumLength");
  writer.number(code.minimumLength);
  const std::vector<std::string> requirements = requirementTexts(code.entries.front().requirements);
  if (!requirements.empty()) {
    writer.key("requirements");
    writer.beginArray();
    for (const std::string& text : requirements) writer.text(text);
    writer.endArray();
  }
  writer.key("sections");
  writer.beginArray();
  for (const CatalogueEntry& entry : code.entries) writeEntry(writer, entry);
  writer.endArray();
  writer.key("takers");
  writeTakers(writer, code.takers);
  writer.endObject();
}

std::string jsonText(std::span<const TechnologyCodes> technologies) {
  std::string text;
  JsonWriter writer(text, JsonWriter::Form::Indented);
  writer.beginArray();
  for (const TechnologyCodes& technology : technologies) {
    writer.beginObject();
    writeText(writer, "technology", technology.technology);
    writer.key("codes");
    writer.beginArray();
    for (const CodeFamily& family : technology.families) {
      for (const ListedCode& code : family.codes) writeCode(writer, code);
    }
    writer.endArray();
    writer.endObject();
  }
  writer.endArray();
  return text + "\n";
}

}  // namespace

const std::vector<CodesFormat>& codesFormats() {
  static const std::vector<CodesFormat> kFormats = {
      {"table", "code by code: the packet, its least length, the sections and their keys",
       tableText},
      {"markdown", "a document, with where every key is read and how it is shown", codesMarkdown},
      {"json", "all of that for programs, with all places as numbers: an array of technologies",
       jsonText},
      {"lua", "a dissector for Wireshark, to be put into its folder of personal plugins", codesLua,
       dissectorParts()},
  };
  return kFormats;
}

}  // namespace kestro
