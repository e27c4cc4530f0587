// SPDX-License-Identifier: MIT
// kestro-cli convert: recordings in another form.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow convertCommand();

}  // namespace kestro
