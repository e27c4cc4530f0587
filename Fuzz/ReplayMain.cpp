// SPDX-License-Identifier: MIT
// Runs a harness on files, and on the files in folders: the fuzzers' corpus as a test.
#include <fmt/format.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <string>
#include <vector>

#include "Fuzz/Harness.h"

namespace {

/// The input stands in memory that ends with it, so that a sanitizer sees a look beyond.
void replay(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  const std::vector<char> bytes{std::istreambuf_iterator<char>(file), {}};
  const auto memory = std::make_unique<std::uint8_t[]>(bytes.size());
  for (std::size_t i = 0; i < bytes.size(); ++i) memory[i] = static_cast<std::uint8_t>(bytes[i]);
  kestro::fuzz::tryInput({memory.get(), bytes.size()});
}

}  // namespace

int main(int argc, char** argv) {
  std::size_t count = 0;
  for (int i = 1; i < argc; ++i) {
    if (!std::filesystem::exists(argv[i])) {
      fmt::print(stderr, "no such input: {}\n", argv[i]);
      return EXIT_FAILURE;
    }
    if (!std::filesystem::is_directory(argv[i])) {
      replay(argv[i]);
      ++count;
      continue;
    }
    for (const auto& entry : std::filesystem::directory_iterator(argv[i])) {
      replay(entry.path());
      ++count;
    }
  }
  fmt::print("{} inputs replayed\n", count);
  return count == 0 ? EXIT_FAILURE : EXIT_SUCCESS;
}
