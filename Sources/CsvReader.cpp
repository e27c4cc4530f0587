// SPDX-License-Identifier: MIT
#include "Sources/CsvReader.h"

#include <fmt/format.h>

#include <utility>

namespace kestro {

Result<std::optional<CsvRecord>> CsvReader::next() {
  if (_line == 1) skipByteOrderMark();
  _record = {.line = _line, .fields = {}};
  _field.clear();
  _problem.clear();
  _place = Place::FieldStart;
  _size = 0;
  char c = 0;
  while (_input.get(c)) {
    const bool isLineEnd = takesLineEnd(c);
    if (isLineEnd) ++_line;
    if (isLineEnd && _place != Place::Quoted) {
      if (!isEmptySoFar()) return endRecord();
      _record.line = _line;
      continue;
    }
    if (++_size > kMaximumRecordSize && _place != Place::Malformed) {
      refuse(fmt::format("the record is longer than {} bytes", kMaximumRecordSize));
      if (isLineEnd) return endRecord();
      continue;
    }
    take(isLineEnd ? '\n' : c);
  }
  if (isEmptySoFar()) return std::nullopt;
  if (_place == Place::Quoted) refuse("a quoted field does not end");
  return endRecord();
}

void CsvReader::skipByteOrderMark() {
  for (const int byte : {0xEF, 0xBB, 0xBF}) {
    if (_input.peek() != byte) return;
    _input.get();
  }
}

// Inside quotes a line end is text; a CRLF becomes one LF there.
bool CsvReader::takesLineEnd(char c) {
  if (c == '\r' && _input.peek() == '\n') _input.get(c);
  return c == '\n';
}

void CsvReader::take(char c) {
  switch (_place) {
    case Place::FieldStart:
    case Place::Unquoted:
      if (c == ',') {
        endField();
      } else if (c != '"') {
        _field += c;
        _place = Place::Unquoted;
      } else if (_place == Place::FieldStart) {
        _place = Place::Quoted;
      } else {
        refuse("a quote stands inside an unquoted field");
      }
      return;
    case Place::Quoted:
    case Place::AfterQuoted:
      takeInQuoted(c);
      return;
    case Place::Malformed:
      return;
  }
}

void CsvReader::takeInQuoted(char c) {
  if (_place == Place::Quoted) {
    if (c == '"') {
      _place = Place::AfterQuoted;
    } else {
      _field += c;
    }
  } else if (c == '"') {
    _field += c;
    _place = Place::Quoted;
  } else if (c == ',') {
    endField();
  } else {
    refuse("text follows a quoted field");
  }
}

void CsvReader::endField() {
  _record.fields.push_back(std::exchange(_field, {}));
  _place = Place::FieldStart;
}

void CsvReader::refuse(std::string problem) {
  _problem = std::move(problem);
  _place = Place::Malformed;
}

Result<std::optional<CsvRecord>> CsvReader::endRecord() {
  if (_place == Place::Malformed) {
    return failure(fmt::format("line {}: {}", _record.line, _problem));
  }
  endField();
  return std::move(_record);
}

}  // namespace kestro
