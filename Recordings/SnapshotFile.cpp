// SPDX-License-Identifier: MIT
#include "Recordings/SnapshotFile.h"

#include <fmt/format.h>

#include <utility>

#include "Recordings/StorableValue.h"

namespace kestro {

Result<Bytes> snapshotFile(const PropertyListCoding& coding, const Dictionary& snapshot) {
  auto xml = coding.xml(storableValue(snapshot));
  if (!xml) return failure("the snapshot cannot be serialised");
  return *std::move(xml);
}

Result<Dictionary> parseSnapshot(const PropertyListCoding& coding, ByteView file) {
  const auto root = coding.parse(file, PropertyListLimits::snapshotFile());
  if (!root) return tl::unexpected(root.error());
  if (!root->isDictionary()) {
    return failure(
        fmt::format("no snapshot: the list is no dictionary but of type {}", root->typeName()));
  }
  const Dictionary snapshot = root->dictionary();
  if (!snapshot[kSnapshotTimestamp].isText()) {
    return failure(fmt::format("no snapshot: it has no \"{}\"", kSnapshotTimestamp));
  }
  return snapshot;
}

Value dlfOfSnapshot(const Dictionary& snapshot) {
  for (const Value& entry : snapshot[kSnapshotData].array()) {
    Value dlf = entry.dictionary()[kSnapshotDlf];
    if (dlf.isData()) return dlf;
  }
  return {};
}

}  // namespace kestro
