// SPDX-License-Identifier: MIT
// Packets explained for people: one table a packet.
#pragma once

#include <array>
#include <string>

#include "CommandLine/Formats/ExplainWriter.h"

namespace kestro {

/// A heading for each packet, then a line for each place that a value was read from. What is the
/// same as in the line above is not repeated. Only one packet is held in memory.
class ExplainTable : public ExplainWriter {
 public:
  /// `output` must outlive the writer.
  ExplainTable(Output& output, const ExplainStyle& style) : _output(output), _style(style) {}

  void begin(std::string_view /*technology*/) override {}
  void beginPacket(const PacketHead& head) override;
  void value(const ExplainedValue& value) override;
  void endPacket(std::string_view remark) override;
  void finish() override {}

 private:
  enum Column : std::size_t { kSection, kRow, kKey, kOffset, kBytes, kBits, kRaw, kText };
  static constexpr std::size_t kColumnCount = 8;
  /// One line of the table; its texts are safe for a terminal.
  using Line = std::array<std::string, kColumnCount>;

  Line& addLine();
  void describePlace(const ExplainedSource& source, Line& line) const;
  void appendLine(const Line& line, const std::array<std::size_t, kColumnCount>& widths);
  void appendTable();

  Output& _output;
  ExplainStyle _style;
  ByteView _packet;
  std::vector<Line> _lines;  ///< of the packet; those from _lineCount on are of an earlier one
  std::size_t _lineCount = 0;
  std::string _section;  ///< of the last value
  std::string _row;
  std::string _text;
  bool _isFirst = true;
};

}  // namespace kestro
