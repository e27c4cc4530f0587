// SPDX-License-Identifier: MIT
// A process that ends with the one that started it.
#pragma once

#include <optional>
#include <string>

namespace kestro {

/// From now on this process is asked to end (SIGTERM) when its parent ends, however that ends.
/// False when the parent has ended already: `parent` is the process that it should be, where that
/// is known.
[[nodiscard]] bool endWithParent(std::optional<int> parent);

/// Takes `endWithParent` back. A killed parent's threads each send the signal as they end: who is
/// ending already wants no further one, which could come when nothing catches it any more.
void ignoreParentsEnd() noexcept;

/// What the temporary port directory of a demo is called, with something behind it.
inline constexpr const char* kDemoDirectoryPrefix = "kestro-demo-";

/// Removes the directory of a demo when this is destroyed and the process that made it is gone, so
/// could not do so itself. A parent whose first thread has ended counts as gone.
class OrphanedDirectory {
 public:
  /// `parent` made the directory; an empty path, or one that is not named as a demo's, is left
  /// alone.
  OrphanedDirectory(std::string path, std::optional<int> parent);
  ~OrphanedDirectory();
  OrphanedDirectory(const OrphanedDirectory&) = delete;
  OrphanedDirectory& operator=(const OrphanedDirectory&) = delete;

 private:
  std::string _path;
  std::optional<int> _parent;
};

}  // namespace kestro
