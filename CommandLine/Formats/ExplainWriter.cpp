// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ExplainWriter.h"

#include "CommandLine/Formats/ExplainJson.h"
#include "CommandLine/Formats/ExplainTable.h"

namespace kestro {
namespace {

template <class Writer>
std::unique_ptr<ExplainWriter> makeExplainWriter(Output& output) {
  return std::make_unique<Writer>(output);
}

}  // namespace

const std::vector<ExplainFormat>& explainFormats() {
  static const std::vector<ExplainFormat> kFormats = {
      {"table", "for people, a table a packet", makeExplainWriter<ExplainTable>},
      {"json", R"(one object: "technology" and "messages", one packet a line)",
       makeExplainWriter<ExplainJson>},
  };
  return kFormats;
}

}  // namespace kestro
