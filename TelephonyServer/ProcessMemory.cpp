// SPDX-License-Identifier: MIT
#include "TelephonyServer/ProcessMemory.h"

#include <malloc.h>

namespace kestro {

void giveBackLargeBlocks() {
  constexpr int kLarge = 128 * 1024;
  ::mallopt(M_MMAP_THRESHOLD, kLarge);
}

}  // namespace kestro
