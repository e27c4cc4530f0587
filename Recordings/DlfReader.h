// SPDX-License-Identifier: MIT
// Reads DLF logs.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "Platform/Result.h"
#include "Recordings/DlfRecords.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingContext.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// A DLF log: every packet is a message, with its type byte in front, at the packet's own time.
/// Where that lies outside the years 1970 to 9999, it is the time of the message before.
class DlfReader final : public RecordingReader {
 public:
  /// The longest log that is looked through for its codes when it is no file on a disk.
  static constexpr std::size_t kLongestInMemory = std::size_t{64} * 1024 * 1024;

  /// Opens a log that is unread still. Unless the context names the technology, all its codes are
  /// read to find it; what cannot be decided is refused.
  [[nodiscard]] static Result<std::unique_ptr<DlfReader>> open(RecordedFile file,
                                                               const RecordingContext& context);

  [[nodiscard]] RecordingForm form() const noexcept override { return RecordingForm::Dlf; }
  [[nodiscard]] std::span<const std::string_view> technologies() const noexcept override {
    return {&_technology, _technology.empty() ? std::size_t{0} : 1};
  }
  [[nodiscard]] Result<std::optional<RecordedMessage>> next() override;
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _records.file().fractionRead();
  }

 private:
  explicit DlfReader(DlfRecords records) : _records(std::move(records)) {}

  [[nodiscard]] Result<void> decideTechnology(const RecordingContext& context);

  DlfRecords _records;
  std::string_view _technology;
  Moment _lastTime;
  std::optional<Error> _error;
};

}  // namespace kestro
