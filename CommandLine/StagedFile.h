// SPDX-License-Identifier: MIT
// Making a large file without losing the one before.
#pragma once

#include <string>

#include "Platform/Result.h"

namespace kestro {

/// A file that takes its place only when it is complete: until then an earlier one stays as it was,
/// and where the file system allows it the new one has no name, so that nothing is left of it when
/// the process ends. What is no regular file (a device, a pipe, "-" for standard output) is written
/// to as it is.
class StagedFile {
 public:
  /// The error says why the file cannot be created.
  [[nodiscard]] static Result<StagedFile> create(const std::string& path);

  StagedFile(StagedFile&& other) noexcept;
  StagedFile& operator=(StagedFile&&) = delete;
  /// Gives the new file up, unless it is in its place.
  ~StagedFile();

  /// Where to write; it may be opened and emptied by this name.
  [[nodiscard]] const std::string& writtenPath() const noexcept { return _writtenPath; }

  /// Puts the file in its place; everything must have been written.
  [[nodiscard]] Result<void> commit();

  /// The text with the file's own name in place of the one that it is written by.
  [[nodiscard]] std::string named(std::string text) const;

 private:
  explicit StagedFile(std::string path) : _path(std::move(path)) {}
  [[nodiscard]] Result<void> stage();

  std::string _path;
  std::string _writtenPath;
  std::string _target;  ///< whose place it takes; empty: it is written to as it is
  std::string _part;    ///< the new file's name; empty: none yet
  int _descriptor = -1;
};

}  // namespace kestro
