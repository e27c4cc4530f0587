// SPDX-License-Identifier: MIT
// Bytes as a capture.
#include "Fuzz/Harness.h"
#include "Fuzz/MemoryFile.h"
#include "Recordings/PcapReader.h"

namespace kestro::fuzz {

void tryInput(ByteView bytes) {
  const MemoryFile file(bytes);
  auto reader = PcapReader::open(file.path());
  if (!reader) return;
  std::size_t total = 0;
  for (;;) {
    const auto message = reader->next();
    if (!message || !*message) break;
    total += (*message)->bytes.size();
    require(total <= bytes.size(), "messages are no longer than their file");
  }
}

}  // namespace kestro::fuzz
