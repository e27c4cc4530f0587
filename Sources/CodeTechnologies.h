// SPDX-License-Identifier: MIT
// Which technologies a log code belongs to, for recordings that do not name theirs.
#pragma once

#include "LogGenerator/GeneratorServices.h"
#include "Recordings/OpenRecording.h"

namespace kestro {

/// The technologies whose generators ask for the packets of a code. What the services refer to must
/// live until the first code is asked for; nothing is written to their logs.
[[nodiscard]] TechnologiesOfCode technologiesByCode(const GeneratorServices& services);

}  // namespace kestro
