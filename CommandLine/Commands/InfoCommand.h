// SPDX-License-Identifier: MIT
// kestro-cli info: what recordings hold.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow infoCommand();

}  // namespace kestro
