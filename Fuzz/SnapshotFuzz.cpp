// SPDX-License-Identifier: MIT
// Bytes as a snapshot, and everything that is done with one: shown, its log exported, saved again.
#include "CommandLine/Formats/SnapshotText.h"
#include "Fuzz/SavedSnapshot.h"
#include "Recordings/SnapshotFile.h"

namespace kestro::fuzz {
namespace {

void show(const Dictionary& snapshot) {
  std::size_t size = 0;
  writeSnapshotText(snapshot, [&size](std::string_view text) { size += text.size(); });
  require(size > 0, "a snapshot shows its timestamp");
}

void exportLog(const Dictionary& snapshot) {
  const Value log = dlfOfSnapshot(snapshot);
  static_cast<void>(reframedDlf(log.bytes(), snapshot[kSnapshotData].array()));
}

}  // namespace

void tryInput(ByteView bytes) {
  const auto snapshot = parseSnapshot(propertyListCoding(), bytes);
  if (!snapshot) return;
  show(*snapshot);
  exportLog(*snapshot);
  VirtualPlatform platform(propertyListCoding());
  checkSaving(platform.clock(), (*snapshot)[kSnapshotData],
              (*snapshot)[kSnapshotDescription].text());
}

}  // namespace kestro::fuzz
