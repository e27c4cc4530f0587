// SPDX-License-Identifier: MIT
// kestro-cli explain: where every value of a recorded packet comes from.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow explainCommand();

}  // namespace kestro
