// SPDX-License-Identifier: MIT
// Turns collected messages into records of a DLF log, and leaves out bytes that are no record.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// How many records the messages hold that a generator collected between two refreshes.
struct CollectedRecords {
  std::uint64_t count = 0;
  /// The bytes behind the last record, from the first message on whose length cannot be its own.
  std::size_t unframedSize = 0;
};

/// Appends the record of every message in `collected` to `dlf`: a message is a type byte and a
/// record, which begins with its length in 16 bits, and may have a 2-byte prefix. Ends at the first
/// message whose length cannot be right: where the next one begins is not known then.
CollectedRecords appendRecords(Bytes& dlf, ByteView collected);

/// A DLF log in which every packet is a whole record.
struct ReframedDlf {
  Bytes dlf;
  std::uint64_t packetCount = 0;
  /// The bytes of one history entry that are no whole record, and are left out.
  struct Unframed {
    std::size_t entry;  ///< number in the history, from 1
    std::size_t size;   ///< how many bytes at its end
  };
  std::vector<Unframed> unframed;
};

/// The log `exported` of the history's entries with one record a packet: its version report, then
/// every entry's packets without their type bytes. Absent when the log is not these entries'. What
/// follows the history among `entries` is passed over.
[[nodiscard]] std::optional<ReframedDlf> reframedDlf(ByteView exported, const Array& entries);

}  // namespace kestro
