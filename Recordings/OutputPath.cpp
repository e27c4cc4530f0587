// SPDX-License-Identifier: MIT
#include "Recordings/OutputPath.h"

#include <fmt/format.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <system_error>

namespace kestro {
namespace {

namespace fs = std::filesystem;

constexpr const char* kStandardInput = "/dev/stdin";

}  // namespace

Result<void> checkOutputIsNoInput(const std::string& output, std::span<const std::string> inputs) {
  std::error_code error;
  if (!fs::is_regular_file(output, error)) return {};
  for (const std::string& input : inputs) {
    const fs::path path = input == "-" ? kStandardInput : input;
    if (fs::equivalent(path, output, error)) {
      return failure(fmt::format("{}: the output would replace the input", output));
    }
  }
  return {};
}

std::string outputName(const std::string& path) {
  return path == kStandardOutputPath ? "standard output" : path;
}

Result<void> checkOutputCanBeCreated(const std::string& path) {
  if (path == kStandardOutputPath) return {};
  const auto refused = [&path](int reason) {
    return failure(fmt::format("{}: cannot create: {}", path, std::strerror(reason)));
  };
  std::error_code error;
  if (fs::is_directory(path, error)) return refused(EISDIR);
  if (fs::exists(path, error))
    return ::access(path.c_str(), W_OK) == 0 ? Result<void>() : refused(errno);
  const fs::path folder = fs::path(path).parent_path() / ".";
  if (::access(folder.c_str(), W_OK | X_OK) != 0) return refused(errno);
  return {};
}

}  // namespace kestro
