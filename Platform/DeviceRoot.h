// SPDX-License-Identifier: MIT
// The device's file system, as far as the program uses it: absolute device paths under one root.
#pragma once

#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

class DeviceRoot {
 public:
  DeviceRoot() = default;
  virtual ~DeviceRoot() = default;
  DeviceRoot(const DeviceRoot&) = delete;
  DeviceRoot& operator=(const DeviceRoot&) = delete;

  /// Whether something exists at the absolute device path.
  [[nodiscard]] virtual bool exists(std::string_view devicePath) const = 0;

  /// Where the absolute device path lies in this system's own files.
  [[nodiscard]] virtual std::string hostPath(std::string_view devicePath) const = 0;

  /// Writes a whole file in place (not atomically), replacing an earlier one. Makes no directory.
  /// A failure says why and may leave part of the file.
  [[nodiscard]] virtual Result<void> write(std::string_view devicePath, ByteView contents) = 0;
};

}  // namespace kestro
