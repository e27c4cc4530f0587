// SPDX-License-Identifier: MIT
// The application bundle: its resources, version and build date.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"

namespace kestro {

class Bundle {
 public:
  Bundle() = default;
  virtual ~Bundle() = default;
  Bundle(const Bundle&) = delete;
  Bundle& operator=(const Bundle&) = delete;

  /// The paths of all resources with this extension ("plist"), relative to the resource folder, in
  /// name order.
  [[nodiscard]] virtual std::vector<std::string> resourcesOfType(
      std::string_view extension) const = 0;

  /// The contents of the resource `name`.`extension`; absent when it does not exist or cannot be
  /// read.
  [[nodiscard]] virtual std::optional<Bytes> resource(std::string_view name,
                                                      std::string_view extension) const = 0;

  /// The application property "CFBundleVersion"; absent when the bundle has none.
  [[nodiscard]] virtual std::optional<std::string> version() const = 0;

  /// When the program was compiled, in the compiler's form: "Mar  4 2012 13:05:09".
  [[nodiscard]] virtual std::string buildDate() const = 0;
};

}  // namespace kestro
