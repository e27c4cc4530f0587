// SPDX-License-Identifier: MIT
#include "TelephonyServer/EndWithParent.h"

#include <sys/prctl.h>
#include <unistd.h>

#include <csignal>

namespace kestro {

bool endWithParent(std::optional<int> parent) {
  const int expected = parent.value_or(::getppid());
  if (::prctl(PR_SET_PDEATHSIG, SIGTERM) != 0) return false;
  // A parent that ended before the call above sends no signal; another process stands in for it.
  return ::getppid() == expected;
}

}  // namespace kestro
