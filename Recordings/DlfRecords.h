// SPDX-License-Identifier: MIT
// Reading the records of a DLF log.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingContext.h"

namespace kestro {

/// Yields a log's packets in order. In front of a record may stand its type byte, and before that a
/// prefix, as in an exported history; which it is, is told at each record anew.
class DlfRecords {
 public:
  /// `technologiesOfCode` helps to tell, where several readings are possible; may be empty.
  DlfRecords(RecordedFile file, TechnologiesOfCode technologiesOfCode)
      : _file(std::move(file)), _technologiesOfCode(std::move(technologiesOfCode)) {}

  [[nodiscard]] const RecordedFile& file() const noexcept { return _file; }

  /// The next packet, its type byte first, valid until the next call; nothing at the end of the
  /// log. Version reports are passed over. The error names the offset.
  [[nodiscard]] Result<std::optional<ByteView>> next();

  /// Begins anew. The error says that the file cannot be read twice.
  [[nodiscard]] Result<void> rewind();

 private:
  /// One way to read what comes next.
  struct Reading {
    std::size_t start = 0;   ///< of the record
    std::size_t length = 0;  ///< of the record
    std::optional<std::uint8_t> type = std::nullopt;

    [[nodiscard]] std::size_t end() const noexcept { return start + length; }
  };
  /// How believable a reading is: compared field by field, greater is better.
  struct Likelihood {
    bool hasKnownCode = false;
    bool isFollowed = false;  ///< by another record, or by the end
    std::uint64_t nearness = 0;
    auto operator<=>(const Likelihood&) const = default;
  };
  using Readings = std::array<Reading, 4>;

  /// The readings of `bytes` whose lengths are possible: the first `count` of them.
  [[nodiscard]] static std::size_t readingsOf(ByteView bytes, Readings& readings) noexcept;
  [[nodiscard]] Likelihood likelihoodOf(const Reading& reading, ByteView bytes) const;
  [[nodiscard]] Reading best(const Readings& readings, std::size_t count, ByteView bytes) const;
  [[nodiscard]] bool isCode(std::uint16_t code) const;
  [[nodiscard]] tl::unexpected<Error> damaged(ByteView bytes) const;

  RecordedFile _file;
  TechnologiesOfCode _technologiesOfCode;
  std::uint64_t _lastTime = 0;
  Bytes _packet;
};

}  // namespace kestro
