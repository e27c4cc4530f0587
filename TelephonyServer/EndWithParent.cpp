// SPDX-License-Identifier: MIT
#include "TelephonyServer/EndWithParent.h"

#include <sys/prctl.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <system_error>
#include <utility>

namespace kestro {
namespace {

/// Whether the process's first thread has ended. The state is the letter behind the name, which
/// stands in parentheses and may hold some itself.
bool isZombie(int process) {
  std::ifstream file("/proc/" + std::to_string(process) + "/stat");
  const std::string stat{std::istreambuf_iterator<char>(file), {}};
  const std::size_t name = stat.rfind(") ");
  return name != std::string::npos && (stat[name + 2] == 'Z' || stat[name + 2] == 'X');
}

/// A killed parent's other threads may outlive the one that started this process: the signal has
/// come then, while the parent still is the parent.
bool hasEnded(int parent) {
  return ::getppid() != parent || isZombie(parent) || ::kill(parent, 0) != 0;
}

}  // namespace

bool endWithParent(std::optional<int> parent) {
  const int expected = parent.value_or(::getppid());
  if (::prctl(PR_SET_PDEATHSIG, SIGTERM) != 0) return false;
  // A parent that ended before the call above sends no signal; another process stands in for it.
  return ::getppid() == expected;
}

void ignoreParentsEnd() noexcept { ::prctl(PR_SET_PDEATHSIG, 0); }

OrphanedDirectory::OrphanedDirectory(std::string path, std::optional<int> parent)
    : _path(std::move(path)), _parent(parent) {}

OrphanedDirectory::~OrphanedDirectory() {
  const std::filesystem::path path(_path);
  if (!path.filename().string().starts_with(kDemoDirectoryPrefix)) return;
  if (!_parent || !hasEnded(*_parent)) return;
  std::error_code error;
  std::filesystem::remove_all(path, error);
}

}  // namespace kestro
