// SPDX-License-Identifier: MIT
// Exceptions as lines of text.
#pragma once

#include <exception>
#include <string>

namespace kestro {

/// What a failure says, as one line for a person: the message of an internal-consistency failure
/// with its source and line, what a decoder's exception means with its name, the text of any other
/// standard exception, or that it is unknown.
[[nodiscard]] std::string failureText(const std::exception_ptr& failure);

}  // namespace kestro
