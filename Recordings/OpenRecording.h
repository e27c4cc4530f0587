// SPDX-License-Identifier: MIT
// Opening a recording, whatever its form.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// The technologies that have a log code, as constant texts of Platform/TelephonyService.h.
using TechnologiesOfCode = std::function<std::vector<std::string_view>(std::uint16_t logCode)>;

/// What some of the forms need to be read.
struct RecordingContext {
  /// For snapshots. Must outlive the reader.
  const PropertyListCoding& coding;
  /// Decides what the packets of a form are that does not name their technology (DLF logs,
  /// snapshots): the only technology that has all their codes. Extra packets' codes are not asked
  /// for.
  TechnologiesOfCode technologiesOfCode = {};
  /// What such packets are taken for, a constant text of Platform/TelephonyService.h; empty to
  /// decide by their codes.
  std::string_view technology = {};
};

/// As many bytes as it takes to tell a recording's form.
inline constexpr std::size_t kRecordingHeadSize = 512;

/// The form of the recording that begins with `head` (kRecordingHeadSize bytes, or all that there
/// are); absent when it is none. Names of files do not count.
[[nodiscard]] std::optional<RecordingForm> formOfRecording(ByteView head) noexcept;

/// A reader for the file, which is unread still. The error begins with the path: what is empty,
/// unreadable, of no known form, or of no technology of ours is refused.
[[nodiscard]] Result<std::unique_ptr<RecordingReader>> openRecording(
    RecordedFile file, const RecordingContext& context);

/// The same by path; "-" is standard input.
[[nodiscard]] Result<std::unique_ptr<RecordingReader>> openRecording(
    const std::string& path, const RecordingContext& context);

}  // namespace kestro
