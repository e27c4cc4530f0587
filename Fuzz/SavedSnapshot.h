// SPDX-License-Identifier: MIT
// Saving a snapshot and reading it back.
#pragma once

#include "Fuzz/GeneratorChannel.h"
#include "LogGenerator/Ondrel/Reframing.h"
#include "Model/Snapshot.h"
#include "Recordings/SnapshotFile.h"

namespace kestro::fuzz {

/// Saves the contents and reads them back, twice: the file reads, lists as many entries, and is
/// saved the same again. Returns what was read; nothing for contents that no file can hold.
inline Dictionary checkSaving(const Clock& clock, const Value& contents,
                              std::string_view description) {
  const Snapshot saved(clock, contents);
  const auto file = saved.file(propertyListCoding(), description);
  if (!file) return Dictionary::null();  // for instance a date outside the years of a file
  const auto read = parseSnapshot(propertyListCoding(), *file);
  require(read.has_value(), "a saved snapshot reads");
  require((*read)[kSnapshotData].array().size() == saved.entries().size(),
          "a saved snapshot has its entries");
  const Snapshot again(clock, (*read)[kSnapshotData]);
  const auto fileAgain = again.file(propertyListCoding(), (*read)[kSnapshotDescription].text());
  require(fileAgain && *fileAgain == *file, "a snapshot that was read is saved the same again");
  return *read;
}

}  // namespace kestro::fuzz
