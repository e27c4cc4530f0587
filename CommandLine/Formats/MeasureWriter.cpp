// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/MeasureWriter.h"

#include <fmt/compile.h>
#include <fmt/format.h>

#include <algorithm>
#include <iterator>

#include "CommandLine/Formats/CsvField.h"
#include "CommandLine/Formats/JsonWriter.h"
#include "CommandLine/Formats/TimeText.h"

namespace kestro {
namespace {

/// A line a value. What does not change of a series' lines is made once.
class MeasureCsv : public MeasureWriter {
 public:
  explicit MeasureCsv(Output& output) : _output(output) {}

  void begin(bool withPlaces) override {
    _withPlaces = withPlaces;
    _output.write("time,technology,series,item,value,unit,text,message");
    _output.write(withPlaces ? ",latitude,longitude\n" : "\n");
  }

  void take(const ChosenValues& values) override {
    const MeasuredMessage& message = values.message;
    const std::string time = isoTimeText(message.time);
    _end.clear();
    fmt::format_to(std::back_inserter(_end), FMT_COMPILE(",{}"), message.number);
    if (_withPlaces) appendPlace(values);
    _end += '\n';
    _lines.clear();
    for (const MeasuredValue& value : message.measured.values) {
      const Parts& parts = partsOf(values.input, *value.series);
      _lines.append(time).append(parts.before);
      if (value.hasNumber()) {
        fmt::format_to(std::back_inserter(_lines), FMT_COMPILE("{}"), value.number);
      }
      _lines += parts.between;
      appendShown(value);
      _lines += _end;
    }
    _output.write(_lines);
  }

 private:
  struct Parts {
    std::string before;   ///< ",LTE,Detected Cells/Physical Cell ID,1300/14,"
    std::string between;  ///< ",dBm,"
  };

  const Parts& partsOf(std::size_t input, const Series& series) {
    if (input >= _parts.size()) _parts.resize(input + 1);
    auto& known = _parts[input];
    if (series.id >= known.size()) known.resize(series.id + 1);
    Parts& parts = known[series.id];
    if (!parts.before.empty()) return parts;
    const SeriesGroup& group = *series.group;
    for (const std::string& text :
         {group.technology, group.name(), std::string(series.itemText())}) {
      parts.before += ',';
      appendCsvField(parts.before, text);
    }
    parts.before += ',';
    parts.between += ',';
    appendCsvField(parts.between, group.unit);
    parts.between += ',';
    return parts;
  }

  void appendShown(const MeasuredValue& value) {
    if (value.format == nullptr || !value.text.empty()) {
      return appendCsvField(_lines, value.text);
    }
    _shown.clear();
    writeShown(value, _shown);
    _lines += _shown.text();
  }

  void appendPlace(const ChosenValues& values) {
    if (values.place) {
      fmt::format_to(std::back_inserter(_end), ",{},{}", values.place->latitude,
                     values.place->longitude);
    } else {
      _end += ",,";
    }
  }

  Output& _output;
  bool _withPlaces = false;
  std::vector<std::vector<Parts>> _parts;  ///< by input and series
  std::string _lines;
  std::string _end;
  TextBuffer _shown;
};

/// An object a value and line.
class MeasureNdjson : public MeasureWriter {
 public:
  explicit MeasureNdjson(Output& output) : _output(output) {}

  void begin(bool /*withPlaces*/) override {}

  void take(const ChosenValues& values) override {
    const std::string time = isoTimeText(values.message.time);
    _lines.clear();
    for (const MeasuredValue& value : values.message.measured.values) {
      writeLine(values, value, time);
      _lines += '\n';
    }
    _output.write(_lines);
  }

 private:
  void writeLine(const ChosenValues& values, const MeasuredValue& value, const std::string& time) {
    const SeriesGroup& group = *value.series->group;
    JsonWriter json(_lines);
    const auto text = [&json](std::string_view key, std::string_view member) {
      if (member.empty()) return;
      json.key(key);
      json.text(member);
    };
    json.beginObject();
    text("time", time);
    text("technology", group.technology);
    text("series", group.name());
    text("item", value.series->itemText());
    if (value.hasNumber()) {
      json.key("value");
      json.real(value.number);
    }
    text("unit", group.unit);
    _shown.clear();
    writeShown(value, _shown);
    text("text", value.format == nullptr ? value.text : _shown.text());
    json.key("message");
    json.number(values.message.number);
    if (values.place) {
      json.key("latitude");
      json.real(values.place->latitude);
      json.key("longitude");
      json.real(values.place->longitude);
    }
    json.endObject();
  }

  Output& _output;
  std::string _lines;
  TextBuffer _shown;
};

template <class Writer>
std::unique_ptr<MeasureWriter> makeMeasures(Output& output) {
  return std::make_unique<Writer>(output);
}

}  // namespace

const std::vector<MeasureFormat>& measureFormats() {
  static const std::vector<MeasureFormat> formats = {
      {"csv", "a line a value; \"value\" is a number or empty, \"text\" what is shown",
       makeMeasures<MeasureCsv>},
      {"ndjson", "an object a value and line, with its position where that is known",
       makeMeasures<MeasureNdjson>},
  };
  return formats;
}

std::unique_ptr<MeasureWriter> makeMeasureWriter(std::string_view format, Output& output) {
  return std::ranges::find(measureFormats(), format, &MeasureFormat::name)->makeWriter(output);
}

}  // namespace kestro
