// SPDX-License-Identifier: MIT
#include "Model/StateOwner.h"

namespace kestro {

bool StateOwner::handTo(const LogGenerator& next, std::string_view technology, Dictionary& state) {
  const bool isOther = technology != _technology;
  if (isOther) {
    for (const std::string_view key : _keys) state.remove(key);
  }
  _technology = technology;
  const auto keys = next.stateKeys();
  _keys.assign(keys.begin(), keys.end());
  return isOther;
}

}  // namespace kestro
