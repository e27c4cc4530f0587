// SPDX-License-Identifier: MIT
// A generator that is fed packets, and its display looked at section by section.
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "LogGenerator/LogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {

/// Shows what a technology's generator makes of messages, with the program's own template.
class DisplayReader {
 public:
  explicit DisplayReader(std::string_view technology) {
    addTemplates(_platform);
    _platform.systemLog().setThreshold(LogPriority::Error);
    _generator = LogGenerator::generatorFromTechnology(generatorServices(_platform), technology);
    static_cast<void>(_generator->generateLogUsingState(_state));
    static_cast<void>(_platform.systemLog().take());
  }

  void receive(ByteView message) { _generator->updateStateWithData(_state, message); }

  /// The container of a section, wherever the template shows it; null when it is nowhere.
  [[nodiscard]] Value section(std::string_view name) const { return find(_state["Display"], name); }
  /// A key's text in a key/value section, or "(none)".
  [[nodiscard]] std::string text(std::string_view sectionName, std::string_view key) const {
    const Dictionary dictionary = section(sectionName).dictionary();
    const Value& value = dictionary[key];
    return value.isText() ? std::string(value.text()) : "(none)";
  }
  /// Row `index` of a list section; empty when there is none.
  [[nodiscard]] Dictionary row(std::string_view sectionName, std::size_t index) const {
    const Array rows = section(sectionName).array();
    return index < rows.size() ? rows[index].dictionary() : Dictionary::null();
  }

  [[nodiscard]] LogGenerator& generator() { return *_generator; }
  [[nodiscard]] RecordingSystemLog& systemLog() { return _platform.systemLog(); }
  [[nodiscard]] const PropertyListCoding& coding() const { return *_coding; }
  [[nodiscard]] Value display() const { return _state["Display"]; }

 private:
  static Value find(const Value& object, std::string_view name) {
    for (const auto& [key, value] : object.dictionary()) {
      if (key.text() == name) return value;
      if (Value found = find(value, name); !found.isNull()) return found;
    }
    return {};
  }

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  VirtualPlatform _platform{*_coding};
  std::unique_ptr<LogGenerator> _generator;
  Dictionary _state;
};

}  // namespace kestro::testing
