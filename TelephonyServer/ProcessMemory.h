// SPDX-License-Identifier: MIT
// How this process uses memory.
#pragma once

namespace kestro {

/// From now on large blocks (128 KiB and more) go back to the system as soon as they are freed.
/// Left alone, the allocator keeps such blocks for later once it has seen a few.
void giveBackLargeBlocks();

}  // namespace kestro
