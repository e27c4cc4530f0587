// SPDX-License-Identifier: MIT
// kestro-cli decode: a recorded capture as displays.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow decodeCommand();

}  // namespace kestro
