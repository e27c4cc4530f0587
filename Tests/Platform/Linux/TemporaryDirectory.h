// SPDX-License-Identifier: MIT
// A folder of a test's own.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>

namespace kestro {

/// An empty folder that is removed, with all in it, at the end.
class TemporaryDirectory {
 public:
  TemporaryDirectory() {
    std::string name = std::filesystem::temp_directory_path() / "kestro-test-XXXXXX";
    _path = ::mkdtemp(name.data());
  }
  ~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
  }
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  [[nodiscard]] const std::filesystem::path& path() const { return _path; }

  /// Makes a file, and the folders that it needs.
  std::filesystem::path makeFile(const std::filesystem::path& name, std::string_view text) const {
    const std::filesystem::path file = _path / name;
    std::filesystem::create_directories(file.parent_path());
    std::ofstream(file) << text;
    return file;
  }

 private:
  std::filesystem::path _path;
};

/// Sets an environment variable, or removes it for a null value; gives the old one back at the end.
class ScopedEnvironment {
 public:
  ScopedEnvironment(const char* name, const char* value) : _name(name) {
    const char* old = std::getenv(name);
    if (old != nullptr) _old = old;
    _wasSet = old != nullptr;
    assign(value);
  }
  ~ScopedEnvironment() { assign(_wasSet ? _old.c_str() : nullptr); }
  ScopedEnvironment(const ScopedEnvironment&) = delete;
  ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

 private:
  void assign(const char* value) const {
    if (value == nullptr) {
      ::unsetenv(_name);
    } else {
      ::setenv(_name, value, 1);
    }
  }

  const char* _name;
  std::string _old;
  bool _wasSet = false;
};

}  // namespace kestro
