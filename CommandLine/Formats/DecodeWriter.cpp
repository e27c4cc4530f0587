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

DisplayHead headOf(const ReplayRefresh& refresh, bool hasTechnology) {
  return {.time = refresh.time,
          .message = refresh.message,
          .technology = hasTechnology ? refresh.technology : ""};
}

/// The last display, for people.
class TreeWriter : public DecodeWriter {
 public:
  TreeWriter(Output& output, bool /*hasTechnology*/) : _output(output) {}

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
  JsonObjectWriter(Output& output, bool /*hasTechnology*/) : _output(output) {}

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
  NdjsonWriter(Output& output, bool hasTechnology)
      : _output(output), _hasTechnology(hasTechnology) {}

  void refreshed(const ReplayRefresh& refresh) override {
    _text.clear();
    appendNdjsonLine(_text, headOf(refresh, _hasTechnology), *treeOf(refresh.display));
    _output.write(_text);
  }

 private:
  Output& _output;
  bool _hasTechnology;
  std::string _text;
};

/// One line for each leaf and refresh.
class CsvWriter : public DecodeWriter {
 public:
  CsvWriter(Output& output, bool hasTechnology) : _output(output), _hasTechnology(hasTechnology) {}

  void begin() override { appendCsvHeading(_text, _hasTechnology); }

  void refreshed(const ReplayRefresh& refresh) override {
    appendCsvLines(_text, headOf(refresh, _hasTechnology), *treeOf(refresh.display));
    _output.write(_text);
    _text.clear();
  }

  void finish(const DecodeResult&) override { _output.write(_text); }

 private:
  Output& _output;
  bool _hasTechnology;
  std::string _text;
};

template <class Writer>
std::unique_ptr<DecodeWriter> makeWriter(Output& output, bool hasTechnology) {
  return std::make_unique<Writer>(output, hasTechnology);
}

}  // namespace

const std::vector<DecodeFormat>& decodeFormats() {
  static const std::vector<DecodeFormat> kFormats = {
      {"tree", "the display after the last message, for people", makeWriter<TreeWriter>, false},
      {"json",
       "one object: \"technology\" (the last one), \"messages\" (how many) and the last\n"
       "\"display\"",
       makeWriter<JsonObjectWriter>, false},
      {"ndjson",
       "one line a refresh: \"time\", \"message\" (the last one's number), \"technology\"\n"
       "(where there are several) and \"display\"",
       makeWriter<NdjsonWriter>, true},
      {"csv",
       "one line for each value and refresh: time,message,path,value; technology\n"
       "behind the message where there are several",
       makeWriter<CsvWriter>, true},
  };
  return kFormats;
}

}  // namespace kestro
