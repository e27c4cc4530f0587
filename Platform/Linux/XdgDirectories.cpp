// SPDX-License-Identifier: MIT
#include "Platform/Linux/XdgDirectories.h"

#include <QDir>
#include <cstdlib>

namespace kestro {
namespace {

std::filesystem::path directory(const char* variable, const char* belowHome) {
  const char* value = std::getenv(variable);
  if (value != nullptr && value[0] == '/') return value;
  return std::filesystem::path(QDir::homePath().toStdString()) / belowHome;
}

}  // namespace

std::filesystem::path xdgConfigHome() { return directory("XDG_CONFIG_HOME", ".config"); }

std::filesystem::path xdgDataHome() { return directory("XDG_DATA_HOME", ".local/share"); }

}  // namespace kestro
