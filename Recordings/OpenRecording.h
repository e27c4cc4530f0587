// SPDX-License-Identifier: MIT
// Opening a recording, whatever its form.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingContext.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

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
