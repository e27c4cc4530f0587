// SPDX-License-Identifier: MIT
#include "Platform/SystemLog.h"

namespace kestro {

std::string addressText(const void* object) {
  return object == nullptr ? "(nil)" : fmt::format("{}", object);
}

}  // namespace kestro
