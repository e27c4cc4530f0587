// SPDX-License-Identifier: MIT
// A file for one test.
#pragma once

#include <string>

#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {

/// A fresh directory with the path of a file in it; both are removed at the end.
class TemporaryFile {
 public:
  explicit TemporaryFile(const std::string& name = "file") : _path(_directory.pathOf(name)) {}

  [[nodiscard]] std::string directory() const { return _directory.path().string(); }
  [[nodiscard]] const std::string& path() const noexcept { return _path; }
  [[nodiscard]] std::string contents() const { return TemporaryDirectory::text(_path); }

 private:
  TemporaryDirectory _directory;
  std::string _path;
};

}  // namespace kestro::testing
