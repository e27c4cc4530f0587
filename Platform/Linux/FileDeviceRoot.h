// SPDX-License-Identifier: MIT
// The device's file system as a folder of this machine.
#pragma once

#include <filesystem>

#include "Platform/DeviceRoot.h"

namespace kestro {

class FileDeviceRoot final : public DeviceRoot {
 public:
  explicit FileDeviceRoot(std::filesystem::path root) : _root(std::move(root)) {}

  /// $KESTRO_DEVICE_ROOT, else $XDG_DATA_HOME/kestro/device.
  [[nodiscard]] static std::filesystem::path pathFromEnvironment();

  /// Makes the default root with the folders that the program looks for. Does nothing where it
  /// exists already or $KESTRO_DEVICE_ROOT chooses another.
  [[nodiscard]] static Result<void> createDefault();

  [[nodiscard]] bool exists(std::string_view devicePath) const override;
  [[nodiscard]] std::string hostPath(std::string_view devicePath) const override {
    return pathOf(devicePath).string();
  }
  [[nodiscard]] Result<void> write(std::string_view devicePath, ByteView contents) override;

 private:
  [[nodiscard]] std::filesystem::path pathOf(std::string_view devicePath) const;

  std::filesystem::path _root;
};

}  // namespace kestro
