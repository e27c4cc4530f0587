// SPDX-License-Identifier: MIT
// The file form of a snapshot: an XML property list that holds one dictionary. Its fields are
// described in Documentation/snapshots.md.
#pragma once

#include <optional>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"

namespace kestro {

/// Keys of the file's dictionary, in its order.
inline constexpr std::string_view kSnapshotTimestamp = "Timestamp";
inline constexpr std::string_view kSnapshotData = "Data";
inline constexpr std::string_view kSnapshotDescription = "Description";

/// Key of the DLF log in that element of the data that holds it.
inline constexpr std::string_view kSnapshotDlf = "DLF";

/// Keys of an entry of the history: what it was made of, and when.
inline constexpr std::string_view kSnapshotEntryState = "DisplayState";
inline constexpr std::string_view kSnapshotEntryDate = "Date";

/// The file of a snapshot's dictionary. What XML cannot hold in it is replaced, see
/// `storableValue`. It fails only when the dictionary cannot be serialised.
[[nodiscard]] Result<Bytes> snapshotFile(const PropertyListCoding& coding,
                                         const Dictionary& snapshot);

/// The dictionary of a snapshot file. Whatever else it holds, it has a timestamp, a text. Files
/// beyond `PropertyListLimits::snapshotFile` are refused.
[[nodiscard]] Result<Dictionary> parseSnapshot(const PropertyListCoding& coding, ByteView file);

/// The DLF log of a snapshot's dictionary, a data value; null when it has none.
[[nodiscard]] Value dlfOfSnapshot(const Dictionary& snapshot);

/// The moment of a date as snapshots hold them, "2012-03-04 13:05:09 +0100"; absent when the text
/// is none, or is of a year before 1 or after 9999.
[[nodiscard]] std::optional<Moment> momentOfDate(std::string_view text) noexcept;

}  // namespace kestro
