// SPDX-License-Identifier: MIT
// Reads recorded captures, one message at a time.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Result.h"
#include "Recordings/RecordedFile.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// A capture that is being read from its beginning to its end, in constant memory.
class PcapReader final : public RecordingReader {
 public:
  /// Opens a capture (pcap, or pcapng as far as libpcap reads it); "-" is standard input. The error
  /// says why it cannot be opened: no such file, empty, no capture, or of a link type that stands
  /// for no technology.
  [[nodiscard]] static Result<PcapReader> open(const std::string& path);
  /// The same for a file that is unread still.
  [[nodiscard]] static Result<PcapReader> open(RecordedFile file);

  PcapReader(PcapReader&&) noexcept;
  PcapReader& operator=(PcapReader&&) noexcept;
  ~PcapReader() override;

  [[nodiscard]] RecordingForm form() const noexcept override { return RecordingForm::Pcap; }
  [[nodiscard]] std::span<const std::string_view> technologies() const noexcept override {
    return {&_technology, 1};
  }

  /// The technology of all messages; a constant text.
  [[nodiscard]] std::string_view technology() const noexcept { return _technology; }

  /// Damage is also a time that no capture can hold: beyond the year 2106, or of more than 999,999
  /// microseconds.
  [[nodiscard]] Result<std::optional<RecordedMessage>> next() override;

  [[nodiscard]] std::optional<double> fractionRead() const noexcept override;

 private:
  struct Handle;
  PcapReader(std::unique_ptr<Handle> handle, std::string_view technology);

  /// The error of the record after the last one, from now on.
  [[nodiscard]] tl::unexpected<Error> damaged(std::string_view reason);

  std::unique_ptr<Handle> _handle;
  std::string_view _technology;
  std::optional<Error> _error;
};

}  // namespace kestro
