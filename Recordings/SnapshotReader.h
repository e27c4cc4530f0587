// SPDX-License-Identifier: MIT
// Reads the messages that a snapshot holds.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/PropertyList.h"
#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingContext.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// A snapshot as a recording: what each entry of its history was made of, at the entry's date.
/// These are the packets of a binary log channel, or one message of IFX, which is encoded anew as a
/// binary property list. Where an entry's packets do not frame, the rest of it is left out, and an
/// error names it when all else has been yielded. The snapshot's DLF log holds the same packets and
/// is passed over. The whole snapshot lies in memory.
class SnapshotReader final : public RecordingReader {
 public:
  /// Reads a file that is unread still; the error says, behind the path, why it is no snapshot, or
  /// that its technology must be named.
  [[nodiscard]] static Result<std::unique_ptr<SnapshotReader>> open(
      RecordedFile file, const RecordingContext& context);

  [[nodiscard]] RecordingForm form() const noexcept override { return RecordingForm::Snapshot; }
  [[nodiscard]] std::span<const std::string_view> technologies() const noexcept override {
    return _technologies;
  }
  [[nodiscard]] Result<std::optional<RecordedMessage>> next() override;
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override;

 private:
  /// What one entry of the history was made of.
  struct Entry {
    std::size_t number;  ///< in the history, from 1
    Moment date;
    Value state;  ///< data: packets; else a message of IFX
  };

  SnapshotReader(std::string path, const PropertyListCoding& coding)
      : _path(std::move(path)), _coding(coding) {}

  void takeEntries(const Dictionary& snapshot);
  [[nodiscard]] Result<void> decideTechnology(const RecordingContext& context);
  /// The next message of the current entry; nothing behind its last.
  [[nodiscard]] std::optional<RecordedMessage> nextOf(const Entry& entry);

  std::string _path;
  const PropertyListCoding& _coding;
  std::vector<Entry> _entries;
  std::vector<std::string_view> _technologies;
  std::string_view _packetTechnology;
  std::size_t _entry = 0;   ///< the current one
  std::size_t _offset = 0;  ///< of its next message; behind the end when it has no more
  Bytes _message;           ///< of IFX
  std::string _unframed;    ///< the error at the end
};

}  // namespace kestro
