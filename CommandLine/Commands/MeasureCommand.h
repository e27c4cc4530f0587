// SPDX-License-Identifier: MIT
// `kestro-cli measure`: numbers, states and texts over time.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow measureCommand();

}  // namespace kestro
