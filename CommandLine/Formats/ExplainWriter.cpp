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
      {"table", makeExplainWriter<ExplainTable>},
      {"json", makeExplainWriter<ExplainJson>},
  };
  return kFormats;
}

}  // namespace kestro
