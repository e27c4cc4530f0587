// SPDX-License-Identifier: MIT
// How operations that can fail say so: by value, never by a bare boolean.
#pragma once

#include <string>
#include <tl/expected.hpp>
#include <utility>

namespace kestro {

/// Why something could not be done, as one line for a person: what, where, expected against found.
struct Error {
  std::string message;
};

/// A T, or the reason why there is none.
template <class T>
using Result = tl::expected<T, Error>;

/// The failing Result of any type: `return failure("capture: not a pcap file");`
[[nodiscard]] inline tl::unexpected<Error> failure(std::string message) {
  return tl::unexpected<Error>(Error{std::move(message)});
}

}  // namespace kestro
