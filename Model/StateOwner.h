// SPDX-License-Identifier: MIT
// Whose display a generator state holds.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// Follows the technology of a state that outlives its generators: a display of another technology
/// would be neither shown right nor ever updated again.
class StateOwner {
 public:
  /// Says that `next`, which speaks `technology`, writes the state from now on. When the technology
  /// is another than before, what belonged to the generator before alone leaves the state, and the
  /// result is true.
  bool handTo(const LogGenerator& next, std::string_view technology, Dictionary& state);

  /// The last one that had a generator; empty before.
  [[nodiscard]] const std::string& technology() const noexcept { return _technology; }

 private:
  std::string _technology;
  std::vector<std::string_view> _keys;
};

}  // namespace kestro
