// SPDX-License-Identifier: MIT
#include "Model/Snapshot.h"

#include <fmt/format.h>

#include <chrono>

#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "Platform/DeviceRoot.h"
#include "Platform/SystemLog.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {

// The file's reader finds the log that the generators have stored.
static_assert(kSnapshotDlf == kSaveContentsDlf);

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
  return snapshotFile(coding, dictionary(description));
}

std::optional<std::string> Snapshot::save(Platform& platform, std::string_view description) const {
  const std::string path = snapshotPath(platform.clock().now());
  const auto contents = file(platform.propertyListCoding(), description);
  if (contents && platform.deviceRoot().write(path, *contents)) return path;
  platform.systemLog().log(LogPriority::Error, "Unable to write snapshot to {}", path);
  return std::nullopt;
}

std::string entryDescription(const Value& entry) {
  const Dictionary dictionary = entry.dictionary();
  return std::string(dictionary[kHistoryDescription].text());
}

}  // namespace kestro
