// SPDX-License-Identifier: MIT
// `kestro-cli events`: what happened on a drive.
#pragma once

#include "Options/CommandRow.h"

namespace kestro {

[[nodiscard]] CommandRow eventsCommand();

}  // namespace kestro
