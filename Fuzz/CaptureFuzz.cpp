// SPDX-License-Identifier: MIT
// Bytes as a capture.
#include "Captures/CaptureReader.h"
#include "Fuzz/Harness.h"
#include "Fuzz/MemoryFile.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace kestro;
  const fuzz::MemoryFile file({data, size});
  auto reader = CaptureReader::open(file.path());
  if (!reader) return 0;
  std::size_t bytes = 0;
  for (;;) {
    const auto message = reader->next();
    if (!message || !*message) break;
    bytes += (*message)->bytes.size();
    fuzz::require(bytes <= size, "messages are no longer than their file");
  }
  return 0;
}
