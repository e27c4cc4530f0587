// SPDX-License-Identifier: MIT
// Writes a recording in pcapng form.
#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/OutputFile.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// A pcapng file that is being written: messages of all technologies, one interface each with the
/// technology's name, which is written before its first message. What was written has reached the
/// system when an operation returns, so that a file whose writer was killed can be read up to its
/// last message.
class PcapngWriter {
 public:
  /// Creates the file, or empties an existing one; "-" is standard output. `madeUp` says what in
  /// the recording is made up, if anything, as RecordingReader::madeUp does.
  [[nodiscard]] static Result<PcapngWriter> create(const std::string& path,
                                                   std::string_view madeUp = {});

  /// The same for messages from now on. A change begins a new section of the file.
  [[nodiscard]] Result<void> setMadeUp(std::string_view madeUp);

  /// Appends a message, whose number does not count, with its comments. One of more than
  /// kMaximumPcapMessageSize bytes, or of an unknown technology, is refused and leaves the file as
  /// it was. Times are kept to the microsecond; one outside the years 1970 to 9999 is written as
  /// the nearest one inside. When the system refuses the bytes (a full disk), the file may end in
  /// half a block, and every later call yields the same error.
  [[nodiscard]] Result<void> write(const RecordedMessage& message);

  /// Appends notes that no message follows, if there are any: as the comments of a section without
  /// messages.
  [[nodiscard]] Result<void> writeClosingNotes(std::span<const std::string> notes);

 private:
  explicit PcapngWriter(OutputFile file) : _file(std::move(file)) {}

  [[nodiscard]] Result<void> beginSection(std::span<const std::string> notes);

  OutputFile _file;
  std::string _madeUp;
  std::vector<std::string_view> _interfaces;  ///< of this section: their technologies
  Bytes _blocks;                              ///< that are being written
};

}  // namespace kestro
