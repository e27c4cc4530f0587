// SPDX-License-Identifier: MIT
#include "Tests/Soak/ProcessUse.h"

#include <malloc.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <iterator>

namespace kestro::soak {

std::size_t residentBytes() {
  ::malloc_trim(0);
  std::ifstream statistics("/proc/self/statm");
  std::size_t total = 0;
  std::size_t resident = 0;
  statistics >> total >> resident;
  return resident * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
}

std::size_t openDescriptors() {
  // The listing has one open of its own.
  const std::filesystem::directory_iterator entries("/proc/self/fd");
  return static_cast<std::size_t>(std::distance(begin(entries), end(entries))) - 1;
}

}  // namespace kestro::soak
