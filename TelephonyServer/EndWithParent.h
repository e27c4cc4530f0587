// SPDX-License-Identifier: MIT
// A process that ends with the one that started it.
#pragma once

#include <optional>

namespace kestro {

/// From now on this process is asked to end (SIGTERM) when its parent ends, however that ends.
/// False when the parent has ended already: `parent` is the process that it should be, where that
/// is known.
[[nodiscard]] bool endWithParent(std::optional<int> parent);

}  // namespace kestro
