// SPDX-License-Identifier: MIT
// Reads comma-separated values as RFC 4180 describes them.
#pragma once

#include <cstdint>
#include <istream>
#include <optional>
#include <string>
#include <vector>

#include "Platform/Result.h"

namespace kestro {

struct CsvRecord {
  /// The line on which the record begins; the file's first is 1.
  std::uint64_t line = 0;
  std::vector<std::string> fields;
};

/// Reads records one by one, in constant memory: fields separated by commas, records by LF or CRLF,
/// quotes around fields that hold commas, line ends or (doubled) quotes. Empty lines and a byte
/// order mark in front are passed over.
class CsvReader {
 public:
  /// A record with more bytes than this is malformed: most likely a quote that nothing closes.
  static constexpr std::size_t kMaximumRecordSize = 16'384;

  /// `input` must outlive the reader.
  explicit CsvReader(std::istream& input) : _input(input) {}

  /// The next record, or nothing at the end. An error says what is wrong with one record, and on
  /// which line it begins; the next call goes on with the record after it.
  [[nodiscard]] Result<std::optional<CsvRecord>> next();

  /// Whether reading ended because the system could read no further.
  [[nodiscard]] bool readFailed() const { return _input.bad(); }

 private:
  enum class Place { FieldStart, Unquoted, Quoted, AfterQuoted, Malformed };

  [[nodiscard]] bool isEmptySoFar() const noexcept {
    return _place == Place::FieldStart && _record.fields.empty();
  }
  [[nodiscard]] bool takesLineEnd(char c);
  void take(char c);
  void takeInQuoted(char c);
  void endField();
  void refuse(std::string problem);
  [[nodiscard]] Result<std::optional<CsvRecord>> endRecord();
  void skipByteOrderMark();

  std::istream& _input;
  std::uint64_t _line = 1;
  Place _place = Place::FieldStart;
  CsvRecord _record;
  std::string _field;
  std::size_t _size = 0;
  std::string _problem;
};

}  // namespace kestro
