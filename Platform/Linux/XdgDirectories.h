// SPDX-License-Identifier: MIT
// Where a user's files live.
#pragma once

#include <filesystem>

namespace kestro {

/// $XDG_CONFIG_HOME, else ~/.config. Relative values are ignored, as the convention asks.
[[nodiscard]] std::filesystem::path xdgConfigHome();

/// $XDG_DATA_HOME, else ~/.local/share.
[[nodiscard]] std::filesystem::path xdgDataHome();

}  // namespace kestro
