// SPDX-License-Identifier: MIT
// A generator as the model uses it, without the model: its state, its failures, its tree.
#pragma once

#include <fmt/format.h>

#include <cmath>
#include <memory>
#include <optional>
#include <string_view>

#include "Fuzz/Harness.h"
#include "LogGenerator/InternalConsistencyFailure.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Measurer.h"
#include "LogGenerator/Ondrel/Base.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Model/KestroModelNode.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/QuietPlatform.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::fuzz {

inline const PropertyListCoding& propertyListCoding() {
  static const std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  return *coding;
}

class GeneratorChannel {
 public:
  explicit GeneratorChannel(std::string_view technology) : _technology(technology) {
    _platform.systemLog().setThreshold(LogPriority::Error);
  }

  /// Gives the generator the program's own templates.
  void addTemplates() { testing::addTemplates(_platform); }

  /// A generator that goes on with the state, as after a reconnection.
  void start() {
    _generator = LogGenerator::generatorFromTechnology(generatorServices(_platform), _technology);
  }

  /// Hands a message over. It may raise what messages are known to raise, and nothing else; false
  /// when it does.
  bool receive(ByteView message) {
    bool isSurvived = true;
    try {
      _generator->updateStateWithData(_state, message);
    } catch (const ArrayOutOfBoundsException&) {
      isSurvived = false;
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
      isSurvived = false;
    } catch (const InternalConsistencyFailure&) {
      isSurvived = false;
    }
    static_cast<void>(_platform.systemLog().take());
    return isSurvived;
  }

  /// Looks at every value that a message yields.
  void explain(ByteView message) const {
    std::size_t count = 0;
    _generator->explainMessage(message, [&](const auto&...) { ++count; });
  }

  /// Measures a message; values are numbers that can be written down.
  void measure(ByteView message) {
    if (!_measurer) {
      _measurer.emplace(MeasurerServices{_platform.bundle(), propertyListCoding()});
    }
    for (const MeasuredValue& value : _measurer->measure(_technology, message).values) {
      require(std::isfinite(value.number), "a number that is measured is one");
      TextBuffer text;
      writeShown(value, text);
    }
    require(_measurer->series().all().size() <= SeriesTable::kMaximumSeries,
            "a recording has no more series than there may be");
  }

  /// Refreshes and builds the tree.
  void refresh() {
    NodesByPath nodes;
    const Value display = _generator->generateLogUsingState(_state);
    static_cast<void>(KestroModelNode::makeTreeFromObjectWithPathDictionary(display, nodes));
    const Array history = _state[kStateHistory].array();
    require(history.size() <= kMaximumHistoryEntries, "a history keeps at most five entries");
    static_cast<void>(_platform.systemLog().take());
  }

  void save() {
    const Array contents = _generator->getSaveContentsFromState(_state);
    static_cast<void>(propertyListCoding().binary(contents));
  }

  /// What `start` made.
  [[nodiscard]] const LogGenerator& generator() const noexcept { return *_generator; }
  [[nodiscard]] VirtualPlatform& platform() noexcept { return _platform; }
  [[nodiscard]] Dictionary& state() noexcept { return _state; }

 private:
  std::string_view _technology;
  QuietPlatform _platform{propertyListCoding()};
  std::unique_ptr<LogGenerator> _generator;
  std::optional<Measurer> _measurer;
  Dictionary _state;
};

}  // namespace kestro::fuzz
