// SPDX-License-Identifier: MIT
// Snapshots: the last displays with a description, and how the save screen makes a file of them on
// the device.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Platform.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"

namespace kestro {

/// Where snapshots are saved on the device.
inline constexpr std::string_view kSnapshotDirectory = "/var/mobile/Library/Logs/CrashReporter";

/// The device path of a snapshot that is saved at this moment: the directory and
/// "KestroSnapshot-N.kestro", N being whole seconds since 1970 UTC. Two in one second share it.
[[nodiscard]] std::string snapshotPath(Moment moment);

/// What a save screen keeps while it is open. The platform need not outlive it.
class Snapshot {
 public:
  /// A snapshot of this moment by the clock, with a copy of the save contents (see
  /// `LogGenerator::getSaveContentsFromState`; null when there is no generator).
  Snapshot(const Clock& clock, const Value& saveContents);

  /// The entries that are saved, in order; empty when there are no save contents.
  /// `entryDescription` says what to list them as.
  [[nodiscard]] Array entries() const noexcept { return _saveHistory.array(); }

  /// What the file holds: timestamp, data and description. Without save contents it ends after the
  /// timestamp.
  [[nodiscard]] Dictionary dictionary(std::string_view description) const;

  /// The file of that dictionary, see `snapshotFile`.
  [[nodiscard]] Result<Bytes> file(const PropertyListCoding& coding,
                                   std::string_view description) const;

  /// Writes the file on the device, in place, under the path for this moment, which is returned. A
  /// failure leaves its line in the system log (priority error), perhaps part of the file, and
  /// yields nothing.
  [[nodiscard]] std::optional<std::string> save(Platform& platform,
                                                std::string_view description) const;

 private:
  std::string _timeStamp;
  Value _saveHistory;
};

/// The description of an entry of save contents; empty when it has none.
[[nodiscard]] std::string entryDescription(const Value& entry);

}  // namespace kestro
