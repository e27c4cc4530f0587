// SPDX-License-Identifier: MIT
// JSON as a stream: nothing is built in memory but the text itself.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestro {

/// Appends one JSON value to a text, in the order of the calls; every key is followed by its value.
/// After a whole value the next one may follow.
/// Texts are escaped as JSON wants it, and bytes in them that are no UTF-8 become U+FFFD.
class JsonWriter {
 public:
  enum class Form {
    Compact,   ///< one line
    Indented,  ///< one member or element a line
  };

  /// `output` must outlive the writer.
  explicit JsonWriter(std::string& output, Form form = Form::Compact)
      : _output(output), _form(form) {}

  void beginObject() { begin('{'); }
  void endObject() { end('}'); }
  void beginArray() { begin('['); }
  void endArray() { end(']'); }
  /// Names the next member of the current object.
  void key(std::string_view name);
  void text(std::string_view value);
  void number(std::uint64_t value);
  /// A number that may be negative.
  void integer(std::int64_t value);
  /// A finite number, in as few digits as tell it from every other.
  void real(double value);
  void boolean(bool value);

 private:
  void begin(char bracket);
  void end(char bracket);
  /// A number or a name, which stands without quotes.
  void word(std::string_view text);
  void separate();
  void breakLine();
  void appendQuoted(std::string_view value);

  std::string& _output;
  Form _form;
  std::size_t _depth = 0;
  bool _isFirst = true;  ///< nothing stands yet in the current object or array
  bool _afterKey = false;
};

}  // namespace kestro
