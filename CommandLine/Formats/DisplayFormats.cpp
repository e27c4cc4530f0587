// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/DisplayFormats.h"

#include <fmt/format.h>

#include "CommandLine/Formats/CsvField.h"
#include "CommandLine/Formats/SiblingNames.h"
#include "CommandLine/Formats/TimeText.h"
#include "CommandLine/Formats/TreeLayout.h"

namespace kestro {
namespace {

/// Appends a display's leaves, each after the same beginning of the line.
class CsvLines {
 public:
  CsvLines(std::string& output, const std::string& beginning)
      : _output(output), _beginning(beginning) {}

  void append(const KestroModelNode& node, const std::string& path) {
    if (node.childNodes() == nullptr) return appendLeaf(path, *node.value());
    const SiblingNames names(node);
    for (std::size_t i = 0; i < node.childNodes()->size(); ++i) {
      append(*(*node.childNodes())[i], pathByAppending(path, names[i]));
    }
  }

 private:
  void appendLeaf(const std::string& path, const std::string& value) {
    _output += _beginning;
    appendCsvField(_output, path);
    _output += ',';
    appendCsvField(_output, value);
    _output += '\n';
  }

  std::string& _output;
  const std::string& _beginning;
};

}  // namespace

void writeDisplayJson(JsonWriter& writer, const KestroModelNode& display) {
  const auto* children = display.childNodes();
  if (children == nullptr) return writer.text(*display.value());
  if (display.isArray()) {
    writer.beginArray();
    for (const NodePointer& child : *children) writeDisplayJson(writer, *child);
    writer.endArray();
    return;
  }
  writer.beginObject();
  const SiblingNames names(display);
  for (std::size_t i = 0; i < children->size(); ++i) {
    writer.key(names[i]);
    writeDisplayJson(writer, *(*children)[i]);
  }
  writer.endObject();
}

void appendNdjsonLine(std::string& output, const DisplayHead& head,
                      const KestroModelNode& display) {
  JsonWriter writer(output);
  writer.beginObject();
  writer.key("time");
  writer.text(isoTimeText(head.time));
  if (head.message) {
    writer.key("message");
    writer.number(*head.message);
  }
  if (!head.technology.empty()) {
    writer.key("technology");
    writer.text(head.technology);
  }
  writer.key("display");
  writeDisplayJson(writer, display);
  writer.endObject();
  output += '\n';
}

void appendCsvHeading(std::string& output, bool hasTechnology) {
  output += hasTechnology ? "time,message,technology,path,value\n" : "time,message,path,value\n";
}

void appendCsvLines(std::string& output, const DisplayHead& head, const KestroModelNode& display) {
  std::string beginning = fmt::format("{},{},", isoTimeText(head.time), head.message.value_or(0));
  if (!head.technology.empty()) beginning += fmt::format("{},", head.technology);
  CsvLines(output, beginning).append(display, "/");
}

void appendPlainTree(std::string& output, const KestroModelNode& display) {
  bool isFirst = true;
  for (const LineBlock& block : layoutTree(display, nullptr)) {
    if (!isFirst) output += '\n';
    isFirst = false;
    for (const StyledLine& line : block) output += line.plainText() + "\n";
  }
}

}  // namespace kestro
