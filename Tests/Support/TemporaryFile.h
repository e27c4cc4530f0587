// SPDX-License-Identifier: MIT
// A file for one test.
#pragma once

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

namespace kestro::testing {

/// A fresh directory with the path of a file in it; both are removed at the end.
class TemporaryFile {
 public:
  explicit TemporaryFile(const std::string& name = "file") {
    std::string pattern = (std::filesystem::temp_directory_path() / "kestro-test-XXXXXX").string();
    _directory = ::mkdtemp(pattern.data()) == nullptr ? "" : pattern;
    _path = _directory + "/" + name;
  }
  ~TemporaryFile() {
    std::error_code error;
    std::filesystem::remove_all(_directory, error);
  }
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  [[nodiscard]] const std::string& directory() const noexcept { return _directory; }
  [[nodiscard]] const std::string& path() const noexcept { return _path; }

  [[nodiscard]] std::string contents() const {
    std::ifstream stream(_path, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
  }

 private:
  std::string _directory;
  std::string _path;
};

}  // namespace kestro::testing
