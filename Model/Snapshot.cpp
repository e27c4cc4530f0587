// SPDX-License-Identifier: MIT
#include "Model/Snapshot.h"

#include <fmt/format.h>

#include <chrono>

#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "Platform/DeviceRoot.h"
#include "Platform/SystemLog.h"
#include "Recordings/StorableValue.h"

namespace kestro {

std::string snapshotPath(Moment moment) {
  const auto seconds = std::chrono::floor<std::chrono::seconds>(moment.time_since_epoch());
  return fmt::format("{}/KestroSnapshot-{}.kestro", kSnapshotDirectory, seconds.count());
}

Snapshot::Snapshot(const Clock& clock, const Value& saveContents)
    : _timeStamp(dateText(clock, clock.now())), _saveHistory(saveContents.deepCopy()) {}

Dictionary Snapshot::dictionary(std::string_view description) const {
  Dictionary result{{kSnapshotTimestamp, _timeStamp}};
  if (_saveHistory.isNull()) return result;
  result.set(kSnapshotData, _saveHistory);
  result.set(kSnapshotDescription, description);
  return result;
}

Result<Bytes> Snapshot::file(const PropertyListCoding& coding, std::string_view description) const {
  auto xml = coding.xml(storableValue(dictionary(description)));
  if (!xml) return failure("the snapshot cannot be serialised");
  return *std::move(xml);
}

bool Snapshot::save(Platform& platform, std::string_view description) const {
  const std::string path = snapshotPath(platform.clock().now());
  const auto contents = file(platform.propertyListCoding(), description);
  if (contents && platform.deviceRoot().write(path, *contents)) return true;
  platform.systemLog().log(LogPriority::Error, "Unable to write snapshot to {}", path);
  return false;
}

std::string entryDescription(const Value& entry) {
  const Dictionary dictionary = entry.dictionary();
  return std::string(dictionary[kHistoryDescription].text());
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
    Value dlf = entry.dictionary()[kSaveContentsDlf];
    if (dlf.isData()) return dlf;
  }
  return {};
}

}  // namespace kestro
