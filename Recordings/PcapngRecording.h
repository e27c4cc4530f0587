// SPDX-License-Identifier: MIT
// A recording of a whole drive in one pcapng file.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"
#include "Recordings/PcapngWriter.h"
#include "Recordings/RecordingWriter.h"

namespace kestro {

/// Writes messages of all technologies, and notes, to one file, which replaces an earlier one.
class PcapngRecording final : public RecordingWriter {
 public:
  /// The most notes that wait for a message.
  static constexpr std::size_t kMostNotes = 1000;

  /// Creates the file; "-" is standard output. It may be none of `inputs`. The error says why that
  /// is not possible; a technology that has no link type is refused, and nothing is created.
  [[nodiscard]] static Result<PcapngRecording> create(const std::string& path,
                                                      std::string_view technology,
                                                      std::string_view madeUp = {},
                                                      const std::vector<std::string>& inputs = {});

  [[nodiscard]] Result<void> setTechnology(std::string_view technology) override;
  [[nodiscard]] Result<void> setMadeUp(std::string_view madeUp) override;
  [[nodiscard]] bool addNote(std::string text) override;
  [[nodiscard]] Result<void> write(Moment time, ByteView message) override;
  [[nodiscard]] Result<void> finish() override;
  [[nodiscard]] const std::vector<std::string>& files() const noexcept override { return _files; }

 private:
  PcapngRecording(const std::string& path, std::string_view technology, PcapngWriter writer);

  std::vector<std::string> _files;
  std::string _technology;
  PcapngWriter _writer;
  std::vector<std::string> _notes;  ///< of the next message
};

}  // namespace kestro
