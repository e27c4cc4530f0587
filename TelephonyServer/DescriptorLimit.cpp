// SPDX-License-Identifier: MIT
#include "TelephonyServer/DescriptorLimit.h"

#include <sys/resource.h>

#include <algorithm>

namespace kestro {

void allowDescriptors(std::size_t count) {
  rlimit limit{};
  if (::getrlimit(RLIMIT_NOFILE, &limit) != 0 || limit.rlim_cur >= count) return;
  limit.rlim_cur = std::min<rlim_t>(count, limit.rlim_max);
  // A refusal leaves things as they are: the server then serves as many clients as it can.
  static_cast<void>(::setrlimit(RLIMIT_NOFILE, &limit));
}

}  // namespace kestro
