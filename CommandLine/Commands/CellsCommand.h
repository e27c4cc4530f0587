// SPDX-License-Identifier: MIT
// `kestro-cli cells`: one row a cell seen.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow cellsCommand();

}  // namespace kestro
