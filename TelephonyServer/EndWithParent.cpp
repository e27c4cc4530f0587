// SPDX-License-Identifier: MIT
#include "TelephonyServer/EndWithParent.h"

#include <sys/prctl.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <system_error>
#include <utility>

namespace kestro {

bool endWithParent(std::optional<int> parent) {
  const int expected = parent.value_or(::getppid());
  if (::prctl(PR_SET_PDEATHSIG, SIGTERM) != 0) return false;
  // A parent that ended before the call above sends no signal; another process stands in for it.
  return ::getppid() == expected;
}

OrphanedDirectory::OrphanedDirectory(std::string path, std::optional<int> parent)
    : _path(std::move(path)), _parent(parent) {}

OrphanedDirectory::~OrphanedDirectory() {
  const std::filesystem::path path(_path);
  if (!path.filename().string().starts_with(kDemoDirectoryPrefix)) return;
  if (!_parent || ::getppid() == *_parent) return;
  std::error_code error;
  std::filesystem::remove_all(path, error);
}

}  // namespace kestro
