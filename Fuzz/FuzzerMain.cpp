// SPDX-License-Identifier: MIT
// What libFuzzer calls.
#include "Fuzz/Harness.h"

// NOLINTNEXTLINE(readability-identifier-naming): the library's name
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  kestro::fuzz::tryInput({data, size});
  return 0;
}
