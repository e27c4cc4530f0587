// SPDX-License-Identifier: MIT
// A generator that has a catalogue and nothing else.
#pragma once

#include <utility>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro::testing {

class CatalogueGenerator : public LogGenerator {
 public:
  CatalogueGenerator(const GeneratorServices& services, std::vector<CatalogueEntry> entries)
      : LogGenerator(services), _entries(std::move(entries)) {}

  void updateStateWithData(Dictionary&, ByteView) override {}
  Value generateLogUsingState(Dictionary&) override { return {}; }
  [[nodiscard]] Dictionary getStartCommand() const override { return {}; }
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary&) override { return {}; }
  void catalogue(const CatalogueVisitor& visit) const override {
    for (const CatalogueEntry& entry : _entries) visit(entry);
  }

 private:
  std::vector<CatalogueEntry> _entries;
};

}  // namespace kestro::testing
