// SPDX-License-Identifier: MIT
#include "Platform/Linux/FileBundle.h"

#include <fmt/format.h>

#include <algorithm>
#include <fstream>
#include <iterator>

#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {

namespace fs = std::filesystem;

fs::path FileBundle::resourcesOfProgram() {
  std::error_code error;
  const fs::path folder = fs::read_symlink("/proc/self/exe", error).parent_path();
  const fs::path beside = folder / "Resources";
  return fs::is_directory(beside, error) ? beside : folder.parent_path() / "share" / "kestro";
}

std::vector<std::string> FileBundle::resourcesOfType(std::string_view extension) const {
  const std::string suffix = fmt::format(".{}", extension);
  std::vector<std::string> result;
  std::error_code error;
  auto entry = fs::recursive_directory_iterator(_resources, error);
  for (; !error && entry != fs::recursive_directory_iterator(); entry.increment(error)) {
    std::error_code ignored;  // what cannot be looked at is no resource
    if (entry->path().extension() == suffix && entry->is_regular_file(ignored)) {
      result.push_back(entry->path().lexically_relative(_resources).native());
    }
  }
  std::ranges::sort(result);
  return result;
}

std::optional<Bytes> FileBundle::resource(std::string_view name, std::string_view extension) const {
  const fs::path path = _resources / fmt::format("{}.{}", name, extension);
  std::error_code error;
  if (!fs::is_regular_file(path, error)) return std::nullopt;
  std::ifstream file(path, std::ios::binary);
  if (!file) return std::nullopt;
  return Bytes{std::istreambuf_iterator<char>(file), {}};
}

std::optional<std::string> FileBundle::version() const { return KESTRO_VERSION; }

std::string FileBundle::buildDate() const { return __DATE__ " " __TIME__; }

std::unique_ptr<Bundle> createBundle() {
  return std::make_unique<FileBundle>(FileBundle::resourcesOfProgram());
}

}  // namespace kestro
