// SPDX-License-Identifier: MIT
// kestro-cli snapshot: snapshot files from captures, as text, and their packets.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow snapshotCommand();

}  // namespace kestro
