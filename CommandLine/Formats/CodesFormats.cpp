// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CodesFormats.h"

#include <fmt/format.h>

#include <iterator>
#include <utility>

#include "CommandLine/Formats/CodesMarkdown.h"
#include "CommandLine/Formats/JsonWriter.h"
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
      : _output(output), _indentation(indentation), _column(kLineWidth) {}

  void append(std::string_view word) {
    const bool isFirst = _column == kLineWidth;
    if (!isFirst) _output += ',';
    if (_column + 2 + word.size() > kLineWidth) {
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
  std::size_t _column;
};

void appendKeys(std::string& output, const CatalogueEntry& entry) {
  if (entry.keys.empty()) return;
  WrappedWords words(output, "      ");
  std::string_view list;
  for (const CatalogueKey& key : entry.keys) {
    const bool isNewList = key.list != list && !key.list.empty();
    words.append(isNewList ? fmt::format("{}: {}", key.list, key.key) : std::string(key.key));
    list = key.list;
  }
  words.end();
}

void appendCode(std::string& output, const ListedCode& code) {
  auto end = std::back_inserter(output);
  fmt::format_to(end, "  {:<8}  {}", logCodeText(code.code), nameOf(code));
  if (code.minimumLength > 0) fmt::format_to(end, ", from {} bytes", code.minimumLength);
  output += '\n';
  for (const CatalogueEntry& entry : code.entries) {
    fmt::format_to(end, "    {}\n", entry.section);
    appendKeys(output, entry);
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

void writeEntry(JsonWriter& writer, const CatalogueEntry& entry) {
  writer.beginObject();
  writeText(writer, "section", entry.section);
  writeText(writer, "group", nameInSortedDictionary(entry.group));
  writeText(writer, "kind", entry.kind == SectionKind::List ? "list" : "dictionary");
  writer.key("keys");
  writer.beginArray();
  for (const CatalogueKey& key : entry.keys) {
    writer.beginObject();
    if (!key.list.empty()) writeText(writer, "list", key.list);
    writeText(writer, "key", key.key);
    writeText(writer, "from", sourcesText(key));
    writeText(writer, "shown", shownText(key));
    writer.endObject();
  }
  writer.endArray();
  writer.endObject();
}

void writeCode(JsonWriter& writer, const ListedCode& code) {
  writer.beginObject();
  writeText(writer, "code", logCodeText(code.code));
  writeText(writer, "name", code.name);
  writer.key("minimumLength");
  writer.number(code.minimumLength);
  writer.key("sections");
  writer.beginArray();
  for (const CatalogueEntry& entry : code.entries) writeEntry(writer, entry);
  writer.endArray();
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
      {"table", tableText},
      {"markdown", codesMarkdown},
      {"json", jsonText},
  };
  return kFormats;
}

}  // namespace kestro
