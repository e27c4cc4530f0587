// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ExplainWriter.h"

#include "CommandLine/Formats/ExplainJson.h"
#include "CommandLine/Formats/ExplainTable.h"

namespace kestro {
namespace {

template <class Writer>
std::unique_ptr<ExplainWriter> makeExplainWriter(Output& output, const ExplainStyle& style) {
  return std::make_unique<Writer>(output, style);
}

}  // namespace

const std::vector<ExplainFormat>& explainFormats() {
  static const std::vector<ExplainFormat> kFormats = {
      {"table", "for people, a table a packet", makeExplainWriter<ExplainTable>},
      {"json",
       "one object: \"technology\" (of every message where there are several) and\n"
       "\"messages\", one packet a line",
       makeExplainWriter<ExplainJson>},
  };
  return kFormats;
}

}  // namespace kestro
