// SPDX-License-Identifier: MIT
// The application bundle as a folder of resource files.
#pragma once

#include <filesystem>

#include "Platform/Bundle.h"

namespace kestro {

class FileBundle final : public Bundle {
 public:
  /// A folder that does not exist holds no resources.
  explicit FileBundle(std::filesystem::path resources) : _resources(std::move(resources)) {}

  /// The resource folder of the running program: "Resources" beside the executable (a build tree),
  /// else ../share/kestro (an installation).
  [[nodiscard]] static std::filesystem::path resourcesOfProgram();

  [[nodiscard]] std::vector<std::string> resourcesOfType(std::string_view extension) const override;
  [[nodiscard]] std::optional<Bytes> resource(std::string_view name,
                                              std::string_view extension) const override;
  [[nodiscard]] std::optional<std::string> version() const override;
  [[nodiscard]] std::string buildDate() const override;

 private:
  std::filesystem::path _resources;
};

}  // namespace kestro
