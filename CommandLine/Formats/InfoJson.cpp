// SPDX-License-Identifier: MIT
// The summaries of inputs, for programs.
#include <functional>

#include "CommandLine/Formats/InputSummary.h"
#include "CommandLine/Formats/JsonWriter.h"
#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/TimeText.h"

namespace kestro {
namespace {

void writeCount(JsonWriter& writer, std::string_view name, std::uint64_t count) {
  writer.key(name);
  writer.number(count);
}

void writeText(JsonWriter& writer, std::string_view name, std::string_view text) {
  writer.key(name);
  writer.text(text);
}

void writeSum(JsonWriter& writer, const InputSummary::Sum& sum) {
  writeCount(writer, "messages", sum.messages);
  writeCount(writer, "bytes", sum.bytes);
}

void writeTexts(JsonWriter& writer, std::string_view name, const std::vector<std::string>& texts) {
  writer.key(name);
  writer.beginArray();
  for (const auto& text : texts) writer.text(text);
  writer.endArray();
}

void writeTechnologies(JsonWriter& writer, const InputSummary& summary, const NameOfKind& nameOf) {
  writer.key("technologies");
  writer.beginArray();
  for (const auto& [technology, sum] : summary.technologies) {
    writer.beginObject();
    writeText(writer, "technology", technology);
    writeSum(writer, sum);
    writer.key("codes");
    writer.beginArray();
    for (const auto& [kind, part] : summary.kinds) {
      if (kind.first != technology || !kind.second) continue;
      writer.beginObject();
      writeText(writer, "code", logCodeText(*kind.second));
      if (const auto name = nameOf(kind); !name.empty()) writeText(writer, "name", name);
      writeSum(writer, part);
      writer.endObject();
    }
    writer.endArray();
    writer.endObject();
  }
  writer.endArray();
}

void writeGaps(JsonWriter& writer, const InputSummary& summary) {
  writeCount(writer, "gapCount", summary.gapCount);
  writer.key("gaps");
  writer.beginArray();
  for (const auto& gap : summary.gaps) {
    writer.beginObject();
    writeText(writer, "from", isoTimeText(gap.from));
    writeText(writer, "to", isoTimeText(gap.to));
    writeCount(writer, "message", gap.message);
    writer.endObject();
  }
  writer.endArray();
}

void writeNotes(JsonWriter& writer, const InputSummary& summary) {
  writeCount(writer, "noteCount", summary.noteCount);
  writer.key("notes");
  writer.beginArray();
  for (const auto& note : summary.notes) {
    writer.beginObject();
    if (note.time) {
      writeText(writer, "time", isoTimeText(*note.time));
      writeCount(writer, "message", note.message);
    }
    writeText(writer, "text", note.text);
    writer.endObject();
  }
  writer.endArray();
}

void writeSummary(JsonWriter& writer, const InputSummary& summary, const NameOfKind& nameOf) {
  writer.beginObject();
  writeText(writer, "input", summary.name);
  writeText(writer, "form", summary.form);
  if (summary.first) {
    writeText(writer, "first", isoTimeText(*summary.first));
    writeText(writer, "last", isoTimeText(*summary.last));
  }
  writeSum(writer, summary.all);
  writeTexts(writer, "madeUp", summary.madeUp);
  writeTechnologies(writer, summary, nameOf);
  writeGaps(writer, summary);
  writeNotes(writer, summary);
  writeCount(writer, "positions", summary.positionCount);
  writeCount(writer, "cut", summary.cutCount);
  writeCount(writer, "passedOver", summary.passedOverCount);
  writeCount(writer, "timesBack", summary.timesBackCount);
  writeTexts(writer, "damaged", summary.damage);
  writer.endObject();
}

}  // namespace

void appendInfoJson(std::string& output, const std::vector<InputSummary>& summaries,
                    const NameOfKind& nameOf) {
  JsonWriter writer(output, JsonWriter::Form::Indented);
  writer.beginObject();
  writer.key("inputs");
  writer.beginArray();
  for (const auto& summary : summaries) writeSummary(writer, summary, nameOf);
  writer.endArray();
  writer.endObject();
  output += '\n';
}

}  // namespace kestro
