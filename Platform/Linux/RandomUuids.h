// SPDX-License-Identifier: MIT
// Random (version 4) UUIDs from the system's source of randomness.
#pragma once

#include "Platform/Uuids.h"

namespace kestro {

class RandomUuids final : public Uuids {
 public:
  [[nodiscard]] std::optional<std::string> create() override;
};

}  // namespace kestro
