// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/DecodeWriter.h"

#include <string>

#include "CommandLine/Formats/DisplayFormats.h"

namespace kestro {
namespace {

NodePointer treeOf(const Value& display) {
  NodesByPath nodesByPath;
  return KestroModelNode::makeTreeFromObjectWithPathDictionary(display, nodesByPath);
}

/// The last display, for people.
class TreeWriter : public DecodeWriter {
 public:
  explicit TreeWriter(Output& output) : _output(output) {}

  void finish(const DecodeResult& result) override {
    std::string text;
    appendPlainTree(text, *treeOf(result.display));
    _output.write(text);
  }

 private:
  Output& _output;
};

/// The last display in one object.
class JsonObjectWriter : public DecodeWriter {
 public:
  explicit JsonObjectWriter(Output& output) : _output(output) {}

  void finish(const DecodeResult& result) override {
    std::string text;
    JsonWriter writer(text, JsonWriter::Form::Indented);
    writer.beginObject();
    writer.key("technology");
    writer.text(result.technology);
    writer.key("messages");
    writer.number(result.messages);
    writer.key("display");
    writeDisplayJson(writer, *treeOf(result.display));
    writer.endObject();
    _output.write(text + "\n");
  }

 private:
  Output& _output;
};

/// One object a refresh.
class NdjsonWriter : public DecodeWriter {
 public:
  explicit NdjsonWriter(Output& output) : _output(output) {}

  void refreshed(const ReplayRefresh& refresh) override {
    _text.clear();
    appendNdjsonLine(_text, refresh.time, refresh.message, *treeOf(refresh.display));
    _output.write(_text);
  }

 private:
  Output& _output;
  std::string _text;
};

/// One line for each leaf and refresh.
class CsvWriter : public DecodeWriter {
 public:
  explicit CsvWriter(Output& output) : _output(output) {}

  void begin() override { appendCsvHeading(_text); }

  void refreshed(const ReplayRefresh& refresh) override {
    appendCsvLines(_text, refresh.time, refresh.message, *treeOf(refresh.display));
    _output.write(_text);
    _text.clear();
  }

  void finish(const DecodeResult&) override { _output.write(_text); }

 private:
  Output& _output;
  std::string _text;
};

template <class Writer>
std::unique_ptr<DecodeWriter> makeWriter(Output& output) {
  return std::make_unique<Writer>(output);
}

}  // namespace

const std::vector<DecodeFormat>& decodeFormats() {
  static const std::vector<DecodeFormat> kFormats = {
      {"tree", "the display after the last message, for people", makeWriter<TreeWriter>},
      {"json", R"(one object: "technology", "messages" (how many) and the last "display")",
       makeWriter<JsonObjectWriter>},
      {"ndjson", R"(one line a refresh: "time", "message" (the last one's number) and "display")",
       makeWriter<NdjsonWriter>},
      {"csv", "one line for each value and refresh: time,message,path,value",
       makeWriter<CsvWriter>},
  };
  return kFormats;
}

}  // namespace kestro
