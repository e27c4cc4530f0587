// SPDX-License-Identifier: MIT
#include "LogGenerator/Packets/Encode.h"

#include <algorithm>
#include <cmath>

#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {
namespace {

bool fits(const Place& place, std::int64_t value) {
  const std::int64_t span = std::int64_t{1} << place.bitCount;
  return place.isSigned ? value >= -span / 2 && value < span / 2 : value >= 0 && value < span;
}

}  // namespace

std::optional<std::int64_t> rawForNumber(const TextRule& rule, double number) {
  if (rule.kind == TextRule::Kind::Scaled) return std::llround((number - rule.offset) / rule.scale);
  if (rule.kind == TextRule::Kind::Integer) {
    return std::llround((number - rule.addend) / rule.multiplier);
  }
  if (rule.kind == TextRule::Kind::Hidden) return std::llround(number);
  return std::nullopt;
}

std::optional<std::int64_t> rawForText(const TextRule& rule, std::string_view text) {
  if (rule.hasAbsentValue && text == rule.absentText) return rule.absentValue;
  const auto row = std::ranges::find(rule.names, text, &NamedValue::text);
  if (row == rule.names.end()) return std::nullopt;
  return row->value;
}

// --- Fields --------------------------------------------------------------------------------------

const Field* PacketWriter::Fields::find(std::string_view key) {
  const auto field = std::ranges::find(_fields, key, &Field::key);
  if (field != _fields.end()) return &*field;
  _writer._isSpoilt = true;
  return nullptr;
}

PacketWriter::Fields& PacketWriter::Fields::raw(std::string_view key,
                                                std::span<const std::int64_t> values) {
  const Field* field = find(key);
  if (field == nullptr) return *this;
  if (values.size() != field->placeCount) {
    _writer._isSpoilt = true;
    return *this;
  }
  for (std::size_t i = 0; i < values.size(); ++i) {
    _writer.put(field->places[i], _position, values[i]);
  }
  return *this;
}

PacketWriter::Fields& PacketWriter::Fields::raw(std::string_view key,
                                                std::initializer_list<std::int64_t> values) {
  return raw(key, std::span<const std::int64_t>(values.begin(), values.size()));
}

PacketWriter::Fields& PacketWriter::Fields::put(std::string_view key,
                                                const std::optional<std::int64_t>& value) {
  if (value) return raw(key, *value);
  _writer._isSpoilt = true;
  return *this;
}

PacketWriter::Fields& PacketWriter::Fields::number(std::string_view key, double value) {
  const Field* field = find(key);
  return field == nullptr ? *this : put(key, rawForNumber(field->text, value));
}

PacketWriter::Fields& PacketWriter::Fields::text(std::string_view key, std::string_view value) {
  const Field* field = find(key);
  return field == nullptr ? *this : put(key, rawForText(field->text, value));
}

// --- PacketWriter --------------------------------------------------------------------------------

PacketWriter::PacketWriter(LogCode code, std::size_t length)
    : _code(code), _bytes(std::max(length, kPacketHeaderSize), 0) {}

void PacketWriter::setCount(const RecordTable& table, std::size_t count) {
  if (count < table.countAddend) {
    _isSpoilt = true;
    return;
  }
  const auto stored = static_cast<std::int64_t>(count - table.countAddend);
  put(table.boundsCount, {}, stored);
  put(table.count, {}, stored);
}

PacketWriter::Fields PacketWriter::record(const RecordTable& table, std::size_t index) {
  if (_isSpoilt) return fields(table.fields);
  return {*this, table.fields, recordAt(table, PacketView(_bytes), index)};
}

void PacketWriter::put(const Place& place, const RecordPosition& position, std::int64_t value) {
  if (!fits(place, value)) {
    _isSpoilt = true;
    return;
  }
  const std::size_t offset = offsetOf(place, position);
  if (_bytes.size() < offset + place.width) _bytes.resize(offset + place.width, 0);
  for (unsigned bit = 0; bit < place.bitCount; ++bit) {
    const unsigned number = place.firstBit + bit;
    const unsigned byte = place.isBigEndian ? place.width - 1U - number / 8 : number / 8;
    const auto mask = static_cast<std::uint8_t>(1U << (number % 8));
    std::uint8_t& target = _bytes[offset + byte];
    const bool isSet = (value >> bit & 1) != 0;
    target = static_cast<std::uint8_t>(isSet ? target | mask : target & ~mask);
  }
}

void PacketWriter::append(ByteView bytes) {
  _bytes.insert(_bytes.end(), bytes.begin(), bytes.end());
}

std::optional<Bytes> PacketWriter::finish(Moment time) {
  const std::size_t recordLength = _bytes.size() - 1;
  if (_isSpoilt || time.time_since_epoch().count() < 0) return std::nullopt;
  _bytes[kLogTypeOffset] = _code >= kExtraCodes ? kExtraLogType : kBasebandLogType;
  // A property list may be longer than a record's length field can say; nobody reads it there.
  storeLittleEndian(std::span(_bytes), kRecordLengthOffset,
                    static_cast<std::uint16_t>(recordLength));
  storeLittleEndian(std::span(_bytes), kLogCodeOffset, static_cast<std::uint16_t>(_code));
  storeLittleEndian(std::span(_bytes), kRecordTimeOffset,
                    static_cast<std::uint64_t>(time.time_since_epoch().count()));
  return _bytes;
}

}  // namespace kestro
