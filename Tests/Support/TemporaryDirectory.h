// SPDX-License-Identifier: MIT
// A directory of a test's own, removed with everything in it.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>
#include <fstream>
#include <ios>
#include <iterator>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"

namespace kestro {

class TemporaryDirectory {
 public:
  TemporaryDirectory() {
    static std::atomic<unsigned> count{0};
    _path = std::filesystem::path(::testing::TempDir()) /
            ("kestro-test-" + std::to_string(::getpid()) + "-" + std::to_string(++count));
    std::filesystem::create_directories(_path);
  }
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;
  ~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
  }

  [[nodiscard]] std::string pathOf(std::string_view name) const { return (_path / name).string(); }

  /// Writes a whole file and returns its path.
  std::string write(std::string_view name, std::string_view contents) const {
    const auto path = pathOf(name);
    std::ofstream file(path, std::ios::binary);
    file.write(contents.data(), static_cast<std::streamsize>(contents.size()));
    return path;
  }
  std::string write(std::string_view name, ByteView contents) const {
    return write(name,
                 std::string_view(reinterpret_cast<const char*>(contents.data()), contents.size()));
  }

  [[nodiscard]] static Bytes read(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }

 private:
  std::filesystem::path _path;
};

}  // namespace kestro
