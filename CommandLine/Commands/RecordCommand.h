// SPDX-License-Identifier: MIT
// kestro-cli record: the log channel as a capture.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow recordCommand();

}  // namespace kestro
