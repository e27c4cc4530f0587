// SPDX-License-Identifier: MIT
// Times as the machine-readable formats write them.
#pragma once

#include <string>

#include "Platform/Clock.h"

namespace kestro {

/// ISO 8601 in UTC, to the microsecond: "2012-03-04T12:05:09.000250Z".
[[nodiscard]] std::string isoTimeText(Moment moment);

}  // namespace kestro
