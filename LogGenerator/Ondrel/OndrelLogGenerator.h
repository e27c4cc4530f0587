// SPDX-License-Identifier: MIT
// The base of the generators whose channels deliver raw baseband packets.
#pragma once

#include <cstdint>
#include <optional>

#include "LogGenerator/LogGenerator.h"

namespace kestro {

/// Keys and texts of the element that save contents gain for the DLF log.
inline constexpr std::string_view kSaveContentsDlf = "DLF";

/// What a DLF log holds of the packets that were collected between two refreshes: all but the first
/// byte. Fewer than 2 bytes are not worth an export.
[[nodiscard]] ByteView exportedPart(ByteView collected) noexcept;

/// Collects the raw packets between two refreshes and exports the history as a DLF log: a version
/// report, then the packets of every history entry as they were collected.
class OndrelLogGenerator : public LogGenerator {
 public:
  /// The DLF log of the state's history; absent when an entry's "DisplayState" is no data.
  [[nodiscard]] std::optional<Bytes> generateDlfFromState(const Dictionary& state);

  /// The history's entries, then the DLF log with its description when there is one.
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary& state) override;

 protected:
  explicit OndrelLogGenerator(const GeneratorServices& services) noexcept
      : LogGenerator(services) {}

  /// Keeps a packet for the history's next entry, which holds 16 MiB of them. From the first that
  /// does not fit they are only counted, so that none is missing between two that are kept.
  void collect(ByteView packet);

  /// Stores what was collected in the state under "DisplayState" and begins anew. A line says how
  /// many packets were not kept.
  void handOverCollected(Dictionary& state);

  /// A DLF log's version report, in a buffer of `size` bytes; absent, with a line in the system
  /// log, when it needs more.
  [[nodiscard]] std::optional<Bytes> versionReport(std::size_t size);

 private:
  Bytes _binData;
  std::uint64_t _packetsNotKept = 0;  ///< since the last entry
};

}  // namespace kestro
