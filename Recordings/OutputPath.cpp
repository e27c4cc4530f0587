// SPDX-License-Identifier: MIT
#include "Recordings/OutputPath.h"

#include <fmt/format.h>

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

}  // namespace kestro
