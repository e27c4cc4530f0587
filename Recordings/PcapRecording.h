// SPDX-License-Identifier: MIT
// A recording: one capture file for as long as the technology stays, then the next.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"
#include "Recordings/PcapWriter.h"
#include "Recordings/RecordingWriter.h"

namespace kestro {

/// Writes messages to FILE.pcap; whenever the technology changes it goes on in FILE-2.pcap,
/// FILE-3.pcap and so on (the number stands before the extension). Existing files of these names
/// are replaced.
class PcapRecording final : public RecordingWriter {
 public:
  /// Creates the first file; "-" is standard output, which is the only one. None of the files may
  /// be one of `inputs`. The error says why that is not possible; a technology that has no link
  /// type is refused.
  [[nodiscard]] static Result<PcapRecording> create(const std::string& path,
                                                    std::string_view technology,
                                                    std::vector<std::string> inputs = {});

  /// Says which technology the following messages have. A change starts the next file; the error of
  /// creating it leaves the recording on the file before. On standard output a change is an error.
  [[nodiscard]] Result<void> setTechnology(std::string_view technology) override;
  /// The form has no room for it.
  [[nodiscard]] Result<void> setMadeUp(std::string_view /*madeUp*/) override { return {}; }
  /// Likewise.
  [[nodiscard]] bool addNote(std::string /*text*/) override { return false; }
  [[nodiscard]] Result<void> write(Moment time, ByteView message) override;
  [[nodiscard]] Result<void> finish() override { return {}; }
  [[nodiscard]] const std::vector<std::string>& files() const noexcept override { return _files; }

 private:
  PcapRecording(const std::string& path, std::string_view technology, PcapWriter writer,
                std::vector<std::string> inputs);

  std::vector<std::string> _inputs;  ///< what must not be written to
  std::vector<std::string> _files;
  std::string _technology;
  PcapWriter _writer;
};

}  // namespace kestro
