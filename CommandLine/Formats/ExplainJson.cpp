// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ExplainJson.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/TimeText.h"
#include "Platform/PropertyListDescription.h"

namespace kestro {
namespace {

/// The bytes that the packet has of the place, in its order.
std::string bytesText(ByteView packet, const ExplainedSource& source) {
  std::string text;
  const std::size_t end = std::min(packet.size(), source.offset + source.width);
  for (std::size_t i = source.offset; i < end; ++i) {
    fmt::format_to(std::back_inserter(text), "{:02x}", packet[i]);
  }
  return text;
}

/// A text as it is, an array as an array; any other value as it is described.
void writeShown(JsonWriter& writer, const Value& value) {
  if (value.isText()) return writer.text(value.text());
  if (!value.isArray()) return writer.text(describe(value));
  writer.beginArray();
  for (const Value& element : value.array()) writeShown(writer, element);
  writer.endArray();
}

}  // namespace

void ExplainJson::begin(std::string_view technology) {
  // The messages are written one by one as they come, so their array is no call of the writer's.
  _text = "{";
  if (!_style.hasTechnology) {
    _text += "\"technology\":";
    _writer.text(technology);
    _text += ',';
  }
  _text += "\"messages\":[";
  _output.write(_text);
}

void ExplainJson::beginPacket(const PacketHead& head) {
  _packet = head.packet;
  _text = _isFirst ? "\n" : ",\n";
  _isFirst = false;
  _writer.beginObject();
  _writer.key("message");
  _writer.number(head.message);
  _writer.key("time");
  _writer.text(isoTimeText(head.time));
  if (_style.hasTechnology) {
    _writer.key("technology");
    _writer.text(head.technology);
  }
  if (head.code) {
    _writer.key("code");
    _writer.text(logCodeText(*head.code));
  }
  if (!head.name.empty()) {
    _writer.key("name");
    _writer.text(head.name);
  }
  _writer.key("length");
  _writer.number(head.packet.size());
  if (head.prefixLength > 0) {
    _writer.key("prefixLength");
    _writer.number(head.prefixLength);
  }
  if (_style.isList) return;
  _writer.key("values");
  _writer.beginArray();
}

void ExplainJson::value(const ExplainedValue& value) {
  _writer.beginObject();
  _writer.key("section");
  _writer.text(value.section);
  if (!value.list.empty()) {
    _writer.key("list");
    _writer.text(value.list);
  }
  if (value.row) {
    _writer.key("row");
    _writer.number(*value.row);
  }
  _writer.key("key");
  _writer.text(value.key);
  _writer.key("sources");
  _writer.beginArray();
  for (const ExplainedSource& source : value.sources) writeSource(source);
  _writer.endArray();
  if (!value.text.isNull()) {
    _writer.key("text");
    writeShown(_writer, value.text);
  }
  _writer.endObject();
}

void ExplainJson::writeSource(const ExplainedSource& source) {
  _writer.beginObject();
  if (source.listKey.empty()) {
    _writer.key("offset");
    _writer.number(source.offset);
    _writer.key("bytes");
    _writer.text(bytesText(_packet, source));
    _writer.key("bits");
    _writer.beginArray();
    _writer.number(source.firstBit);
    _writer.number(source.firstBit + source.bitCount - 1);
    _writer.endArray();
    _writer.key("byteOrder");
    _writer.text(source.isBigEndian ? "big" : "little");
    _writer.key("pastEnd");
    _writer.boolean(source.isPastEnd);
  } else {
    _writer.key("listKey");
    _writer.text(source.listKey);
  }
  if (source.isNumber) {
    _writer.key("raw");
    _writer.integer(source.raw);
  }
  _writer.endObject();
}

void ExplainJson::endPacket(std::string_view remark) {
  if (!_style.isList) _writer.endArray();
  if (!remark.empty()) {
    _writer.key("remark");
    _writer.text(remark);
  }
  _writer.endObject();
  _output.write(_text);
}

void ExplainJson::finish() { _output.write("\n]}\n"); }

}  // namespace kestro
