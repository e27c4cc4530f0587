// SPDX-License-Identifier: MIT
// Which of ModemManager's modems is meant.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Sources/Modem/ModemObjects.h"

namespace kestro {

/// How a modem is named: by nothing, its number, its path or its equipment identifier.
struct ModemName {
  enum class Kind : std::uint8_t { Any, Number, Path, Equipment };
  Kind kind = Kind::Any;
  std::string text = {};
};

/// Takes apart what stands behind "modem:"; absent when it is none of these.
[[nodiscard]] std::optional<ModemName> modemNamed(std::string_view argument);

/// Chooses a modem and stays with it: once its equipment identifier is known it is found by that,
/// under whatever number it comes back.
class ModemChoice {
 public:
  explicit ModemChoice(ModemName name) : _name(std::move(name)) {}

  /// The path of the modem that is meant among those there are; empty when it is not there. Without
  /// a name it is the first enabled one, as long as it is there; if none is enabled, the first.
  [[nodiscard]] std::string path(const ModemObjects& objects);

  /// Whether a modem has been chosen before, which is why its absence means that it has gone.
  [[nodiscard]] bool hasChosen() const noexcept { return !_path.empty(); }

 private:
  [[nodiscard]] std::string find(const ModemObjects& objects) const;
  [[nodiscard]] std::string firstOf(const ModemObjects& objects) const;
  [[nodiscard]] bool isNamed(const ModemObjects& objects, const std::string& path) const;

  ModemName _name;
  std::string _path;
  std::string _equipment;
};

/// Whether a modem's state is enabled, or more.
[[nodiscard]] bool isEnabled(const ModemObjects& objects, std::string_view path);

}  // namespace kestro
