// SPDX-License-Identifier: MIT
// Packets explained for programs: one JSON object, a packet a line of it.
#pragma once

#include <string>

#include "CommandLine/Formats/ExplainWriter.h"
#include "CommandLine/Formats/JsonWriter.h"

namespace kestro {

/// {"technology", "messages": [...]}. Only one packet is held in memory.
class ExplainJson : public ExplainWriter {
 public:
  /// `output` must outlive the writer.
  ExplainJson(Output& output, const ExplainStyle& style) : _output(output), _style(style) {}

  void begin(std::string_view technology) override;
  void beginPacket(const PacketHead& head) override;
  void value(const ExplainedValue& value) override;
  void endPacket(std::string_view remark) override;
  void finish() override;

 private:
  void writeSource(const ExplainedSource& source);

  Output& _output;
  ExplainStyle _style;
  ByteView _packet;
  std::string _text;
  JsonWriter _writer{_text};  ///< of one message after the other
  bool _isFirst = true;
};

}  // namespace kestro
