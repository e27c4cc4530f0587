// SPDX-License-Identifier: MIT
// Reading a recording of any form, one message at a time.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

enum class RecordingForm : std::uint8_t { Pcap, Pcapng, Dlf, Snapshot };

/// The form's name: "pcap", "pcapng", "DLF", "snapshot".
[[nodiscard]] constexpr std::string_view nameOfForm(RecordingForm form) noexcept {
  switch (form) {
    case RecordingForm::Pcap:
      return "pcap";
    case RecordingForm::Pcapng:
      return "pcapng";
    case RecordingForm::Dlf:
      return "DLF";
    case RecordingForm::Snapshot:
      return "snapshot";
  }
  return {};
}

/// One message of a recording. What it refers to is valid until the reader's next `next` or its
/// end; the technology is a constant text of Platform/TelephonyService.h.
struct RecordedMessage {
  Moment time;
  std::string_view technology = {};
  /// The message as it came on the log channel.
  ByteView bytes;
  /// The message's place in the recording: 1 for the first, counting every one.
  std::uint64_t number = 0;
  /// The message's length when it was recorded; more than `bytes.size()` when the recorder cut it.
  std::size_t originalLength = 0;
  /// Notes that somebody took and what the recorder remarked, in their order.
  std::span<const std::string> comments = {};

  [[nodiscard]] bool isCut() const noexcept { return bytes.size() < originalLength; }
};

/// A recording that is being read from its beginning to its end, in constant memory.
class RecordingReader {
 public:
  RecordingReader() = default;
  virtual ~RecordingReader() = default;
  RecordingReader(const RecordingReader&) = delete;
  RecordingReader& operator=(const RecordingReader&) = delete;

  [[nodiscard]] virtual RecordingForm form() const noexcept = 0;

  /// The technologies that are known so far, each once: of messages already read, and of what the
  /// recording has announced. A recording without messages may have none. Valid until the next
  /// `next`.
  [[nodiscard]] virtual std::span<const std::string_view> technologies() const noexcept = 0;

  /// What made up the last message, or a part of it, as the recording says itself, for instance
  /// "simulation"; before the first what it says so far, and empty where it says nothing. Valid
  /// until the next `next`.
  [[nodiscard]] virtual std::string_view madeUp() const noexcept { return {}; }

  /// The next message, or nothing at the end of the recording. A recording that is cut or damaged
  /// yields every whole message before the damage, then an error that names the record or the
  /// offset; after an error every call yields the same error.
  [[nodiscard]] virtual Result<std::optional<RecordedMessage>> next() = 0;

  /// The notes that no message follows; complete when `next` has yielded nothing or an error.
  [[nodiscard]] virtual std::span<const std::string> closingNotes() const noexcept { return {}; }

  /// How many records were passed over because they are no messages of ours, such as packets of
  /// another link type.
  [[nodiscard]] virtual std::uint64_t passedOverCount() const noexcept { return 0; }

  /// How much of the recording has been read, 0 to 1; absent when nobody knows, as with a pipe.
  [[nodiscard]] virtual std::optional<double> fractionRead() const noexcept = 0;

  /// How many messages `next` has yielded so far, and how many of them the recorder had cut.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _messageCount; }
  [[nodiscard]] std::uint64_t cutMessageCount() const noexcept { return _cutMessageCount; }

 protected:
  RecordingReader(RecordingReader&&) noexcept = default;
  RecordingReader& operator=(RecordingReader&&) noexcept = default;

  /// Numbers and counts a message that is about to be yielded.
  [[nodiscard]] RecordedMessage counted(RecordedMessage message) noexcept {
    message.number = ++_messageCount;
    if (message.isCut()) ++_cutMessageCount;
    return message;
  }

 private:
  std::uint64_t _messageCount = 0;
  std::uint64_t _cutMessageCount = 0;
};

}  // namespace kestro
