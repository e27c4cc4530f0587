// SPDX-License-Identifier: MIT
// A generator that counts what reaches it.
#pragma once

#include <cstdint>
#include <memory>
#include <utility>

#include "LogGenerator/LogGenerator.h"

namespace kestro::soak {

/// Counts each message, then hands it to the technology's own generator, as everything else.
class CountingGenerator : public LogGenerator {
 public:
  CountingGenerator(const GeneratorServices& services, std::unique_ptr<LogGenerator> generator,
                    std::uint64_t& count)
      : LogGenerator(services), _generator(std::move(generator)), _count(count) {}

  void updateStateWithData(Dictionary& state, ByteView data) override {
    ++_count;
    _generator->updateStateWithData(state, data);
  }
  Value generateLogUsingState(Dictionary& state) override {
    return _generator->generateLogUsingState(state);
  }
  [[nodiscard]] Dictionary getStartCommand() const override {
    return _generator->getStartCommand();
  }
  [[nodiscard]] std::span<const std::string_view> stateKeys() const override {
    return _generator->stateKeys();
  }
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary& state) override {
    return _generator->getSaveContentsFromState(state);
  }

 private:
  std::unique_ptr<LogGenerator> _generator;
  std::uint64_t& _count;
};

}  // namespace kestro::soak
