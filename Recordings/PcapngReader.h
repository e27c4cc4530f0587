// SPDX-License-Identifier: MIT
// Reads recordings in pcapng form.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Result.h"
#include "Recordings/PcapngBlocks.h"
#include "Recordings/PcapngInterface.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// A pcapng file, of any byte order, resolution of times and number of sections and interfaces.
/// Packets of other link types are passed over and counted. A packet without a time has that of the
/// packet before it, the first one 1970-01-01. Comments are as written; they may be of any bytes.
class PcapngReader final : public RecordingReader {
 public:
  /// Opens a file that is unread still. It is read up to the first interface of a technology of
  /// ours; when it has interfaces, but none of these, it is refused.
  [[nodiscard]] static Result<std::unique_ptr<PcapngReader>> open(RecordedFile file);

  [[nodiscard]] RecordingForm form() const noexcept override { return RecordingForm::Pcapng; }
  [[nodiscard]] std::span<const std::string_view> technologies() const noexcept override {
    return _technologies;
  }
  [[nodiscard]] std::string_view madeUp() const noexcept override { return _madeUp; }
  /// Damage is also a time outside the years 1 to 9999.
  [[nodiscard]] Result<std::optional<RecordedMessage>> next() override;
  [[nodiscard]] std::span<const std::string> closingNotes() const noexcept override {
    return _notes;
  }
  [[nodiscard]] std::uint64_t passedOverCount() const noexcept override { return _passedOver; }
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _blocks.file().fractionRead();
  }

 private:
  /// Where the parts of a packet lie in its block, and what is known of them.
  struct Packet {
    std::size_t interface = 0;
    std::optional<std::uint64_t> time = std::nullopt;
    std::size_t length = 0;
    std::size_t originalLength = 0;
    std::size_t data = 0;  ///< the offset of its first byte
  };

  explicit PcapngReader(RecordedFile file) : _blocks(std::move(file)) {}

  [[nodiscard]] Result<void> readToFirstTechnology();
  /// The message in the block; nothing when it holds none of ours.
  [[nodiscard]] Result<std::optional<RecordedMessage>> take(const PcapngBlock& block);
  [[nodiscard]] Result<std::optional<RecordedMessage>> messageIn(const PcapngBlock& block);

  // The errors of these say what is wrong, without a place.
  [[nodiscard]] Result<void> beginSection(PcapngBytes body);
  [[nodiscard]] Result<void> addInterface(PcapngBytes body);
  [[nodiscard]] Result<Packet> packetIn(const PcapngBlock& block) const;
  [[nodiscard]] Result<void> takeComments(const PcapngBlock& block, std::size_t options);
  [[nodiscard]] Result<void> addNote(std::string text);

  void addMadeUp(const std::string& text);
  /// The error of every call from now on.
  [[nodiscard]] tl::unexpected<Error> failed(const Error& error);

  PcapngBlocks _blocks;
  std::vector<PcapngInterface> _interfaces;       ///< of this section
  std::optional<std::uint16_t> _foreignLinkType;  ///< the first that is none of ours
  std::vector<std::string_view> _technologies;
  std::string _madeUp;
  Moment _lastTime;
  std::uint64_t _passedOver = 0;
  std::vector<std::string> _notes;     ///< that wait for the next message
  std::size_t _notesSize = 0;          ///< in bytes
  std::vector<std::string> _comments;  ///< of the message that was yielded last
  std::optional<Error> _error;
};

}  // namespace kestro
