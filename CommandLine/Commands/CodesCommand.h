// SPDX-License-Identifier: MIT
// kestro-cli codes: every log code with its sections and keys.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow codesCommand();

}  // namespace kestro
