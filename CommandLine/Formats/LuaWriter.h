// SPDX-License-Identifier: MIT
// Lua's tables as a stream, with the calls of JsonWriter.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestro {

/// Appends one Lua value to a text, in the order of the calls: objects and arrays are tables.
/// Keys must be names. Elements of the outer arrays that are tables begin a line.
class LuaWriter {
 public:
  /// `output` must outlive the writer.
  explicit LuaWriter(std::string& output) : _output(output) {}

  void beginObject() { begin(); }
  void endObject() { end(); }
  void beginArray() { begin(); }
  void endArray() { end(); }
  /// Names the next member of the current object.
  void key(std::string_view name);
  void text(std::string_view value);
  void number(std::uint64_t value);
  void integer(std::int64_t value);
  void real(double value);
  void boolean(bool value);

 private:
  void begin();
  void end();
  void word(std::string_view text);
  void separate();
  void appendQuoted(std::string_view value);

  /// Tables deeper than this stand on the line of the one around them.
  static constexpr unsigned kBrokenDepth = 6;

  std::string& _output;
  unsigned _depth = 0;
  bool _isFirst = true;
  bool _afterKey = false;
};

}  // namespace kestro
