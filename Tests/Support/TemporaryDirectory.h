// SPDX-License-Identifier: MIT
// A directory of a test's own.
#pragma once

#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <ios>
#include <iterator>
#include <string>
#include <string_view>
#include <system_error>

#include "Platform/Bytes.h"

namespace kestro::testing {

/// A fresh directory of mode 0700; removed, with everything in it, at the end.
class TemporaryDirectory {
 public:
  TemporaryDirectory() {
    std::string name = std::filesystem::temp_directory_path() / "kestro-test-XXXXXX";
    if (::mkdtemp(name.data()) == nullptr) {
      throw std::system_error(errno, std::generic_category(), name);
    }
    _path = name;
  }
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;
  ~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
  }

  [[nodiscard]] const std::filesystem::path& path() const noexcept { return _path; }
  [[nodiscard]] std::string pathOf(std::string_view name) const { return (_path / name).string(); }

  /// Writes a whole file, and makes the folders that it needs; returns its path.
  std::string write(std::string_view name, std::string_view contents) const {
    const std::filesystem::path path = _path / name;
    std::filesystem::create_directories(path.parent_path());
    std::ofstream file(path, std::ios::binary);
    file.write(contents.data(), static_cast<std::streamsize>(contents.size()));
    return path.string();
  }
  std::string write(std::string_view name, ByteView contents) const {
    return write(name,
                 std::string_view(reinterpret_cast<const char*>(contents.data()), contents.size()));
  }

  [[nodiscard]] static Bytes read(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }
  [[nodiscard]] static std::string text(const std::string& path) {
    const Bytes bytes = read(path);
    return {bytes.begin(), bytes.end()};
  }

 private:
  std::filesystem::path _path;
};

}  // namespace kestro::testing
