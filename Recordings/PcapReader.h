// SPDX-License-Identifier: MIT
// Reads recorded captures, one message at a time.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// One message of a capture.
struct RecordedMessage {
  Moment time;
  /// The message as recorded. Valid until the reader's next `next` or its end.
  ByteView bytes;
  /// The message's place in the capture: 1 for the first record, counting every record.
  std::uint64_t number = 0;
  /// The message's length when it was recorded; more than `bytes.size()` when the recorder cut it.
  std::size_t originalLength = 0;

  [[nodiscard]] bool isCut() const noexcept { return bytes.size() < originalLength; }
};

/// A capture that is being read from its beginning to its end, in constant memory.
class PcapReader {
 public:
  /// Opens a capture (pcap, or pcapng as far as libpcap reads it). The error says why it cannot be
  /// opened: no such file, empty, no capture, or of a link type that stands for no technology.
  [[nodiscard]] static Result<PcapReader> open(const std::string& path);

  PcapReader(PcapReader&&) noexcept;
  PcapReader& operator=(PcapReader&&) noexcept;
  ~PcapReader();

  /// The technology of all messages; a constant text.
  [[nodiscard]] std::string_view technology() const noexcept { return _technology; }

  /// The next message, or nothing at the end of the capture. A capture that is cut or damaged
  /// yields every whole record before the damage, then an error that names the record; after an
  /// error every call yields the same error. Damage is also a time that no capture can hold: beyond
  /// the year 2106, or of more than 999,999 microseconds.
  [[nodiscard]] Result<std::optional<RecordedMessage>> next();

  /// How many messages `next` has yielded so far, and how many of them the recorder had cut.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _messageCount; }
  [[nodiscard]] std::uint64_t cutMessageCount() const noexcept { return _cutMessageCount; }

 private:
  struct Handle;
  PcapReader(std::string path, std::unique_ptr<Handle> handle, std::string_view technology);

  /// The error of the record after the last one, from now on.
  [[nodiscard]] tl::unexpected<Error> damaged(std::string_view reason);

  std::string _path;
  std::unique_ptr<Handle> _handle;
  std::string_view _technology;
  std::uint64_t _messageCount = 0;
  std::uint64_t _cutMessageCount = 0;
  std::optional<Error> _error;
};

}  // namespace kestro
