// SPDX-License-Identifier: MIT
// kestro-cli watch: the live display.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow watchCommand();

}  // namespace kestro
