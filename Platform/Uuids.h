// SPDX-License-Identifier: MIT
// Fresh universally unique identifiers.
#pragma once

#include <optional>
#include <string>

namespace kestro {

class Uuids {
 public:
  Uuids() = default;
  virtual ~Uuids() = default;
  Uuids(const Uuids&) = delete;
  Uuids& operator=(const Uuids&) = delete;

  /// A fresh UUID as 36 characters ("6BA7B810-9DAD-11D1-80B4-00C04FD430C8"); absent when the system
  /// yields none.
  [[nodiscard]] virtual std::optional<std::string> create() = 0;
};

}  // namespace kestro
