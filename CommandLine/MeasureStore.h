// SPDX-License-Identifier: MIT
// The drives in a command's INPUTs, written into a store.
#pragma once

#include <string>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/InputOptions.h"
#include "CommandLine/MeasureFeed.h"

namespace kestro {

/// Writes each input as a recording of its own into the store at `path`, which stays as it was
/// unless all went well. What goes wrong is named on standard error.
[[nodiscard]] ExitStatus writeStore(const InputOptions& inputs, const MeasureChoice& choice,
                                    const std::string& path);

}  // namespace kestro
