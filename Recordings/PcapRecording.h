// SPDX-License-Identifier: MIT
// A recording: one capture file for as long as the technology stays, then the next.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"
#include "Recordings/PcapWriter.h"

namespace kestro {

/// Writes messages to FILE.pcap; whenever the technology changes it goes on in FILE-2.pcap,
/// FILE-3.pcap and so on (the number stands before the extension). Existing files of these names
/// are replaced.
class PcapRecording {
 public:
  /// Creates the first file; "-" is standard output, which is the only one. None of the files may
  /// be one of `inputs`. The error says why that is not possible; a technology that has no link
  /// type is refused.
  [[nodiscard]] static Result<PcapRecording> create(const std::string& path,
                                                    std::string_view technology,
                                                    std::vector<std::string> inputs = {});

  /// Says which technology the following messages have. A change starts the next file; the error of
  /// creating it leaves the recording on the file before. On standard output a change is an error.
  [[nodiscard]] Result<void> setTechnology(std::string_view technology);

  /// Appends one message. A message that is too long for a capture is counted and left out; that is
  /// no failure.
  [[nodiscard]] Result<void> write(Moment time, ByteView message);

  /// Messages written, and messages left out because they were too long.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _messageCount; }
  [[nodiscard]] std::uint64_t leftOutCount() const noexcept { return _leftOutCount; }

  /// The files written so far, in order.
  [[nodiscard]] const std::vector<std::string>& files() const noexcept { return _files; }

 private:
  PcapRecording(const std::string& path, std::string_view technology, PcapWriter writer,
                std::vector<std::string> inputs);

  std::vector<std::string> _inputs;  ///< what must not be written to
  std::vector<std::string> _files;
  std::string _technology;
  PcapWriter _writer;
  std::uint64_t _messageCount = 0;
  std::uint64_t _leftOutCount = 0;
};

}  // namespace kestro
