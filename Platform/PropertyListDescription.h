// SPDX-License-Identifier: MIT
// Values as people read them in a line of a log.
#pragma once

#include <string>

#include "Platform/PropertyList.h"

namespace kestro {

/// The value on one line: `{ State = "Cell DCH"; }`, `( 1, two )`, `<0fbd77>`. Texts of letters and
/// digits alone stand without quotes; in quoted ones a quote, a backslash and a newline follow a
/// backslash. A date is its seconds since 1970 UTC, a null value "(null)". Containers may be nested
/// to any depth that the call stack bears.
[[nodiscard]] std::string describe(const Value& value);

}  // namespace kestro
