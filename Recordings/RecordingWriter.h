// SPDX-License-Identifier: MIT
// A recording that is being made, of the form that its file's name asks for.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// What was written has reached the system when an operation returns, so that what a killed program
/// was recording can be read up to its last message. After an error nothing more is written.
class RecordingWriter {
 public:
  RecordingWriter() = default;
  virtual ~RecordingWriter() = default;
  RecordingWriter(const RecordingWriter&) = delete;
  RecordingWriter& operator=(const RecordingWriter&) = delete;

  /// Says which technology the following messages have, and what of them is made up
  /// (`RecordingReader::madeUp`). One that cannot be recorded is an error.
  [[nodiscard]] virtual Result<void> setTechnology(std::string_view technology) = 0;
  [[nodiscard]] virtual Result<void> setMadeUp(std::string_view madeUp) = 0;

  /// Keeps a note for the next message; false when the form holds none, or too many wait.
  [[nodiscard]] virtual bool addNote(std::string text) = 0;

  /// Appends one message. One that is too long is counted and left out; that is no failure.
  [[nodiscard]] virtual Result<void> write(Moment time, ByteView message) = 0;

  /// Writes the notes that no message has followed. Nothing may be written after that.
  [[nodiscard]] virtual Result<void> finish() = 0;

  /// Messages written, and messages left out because they were too long.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _messageCount; }
  [[nodiscard]] std::uint64_t leftOutCount() const noexcept { return _leftOutCount; }

  /// The files written so far, in order.
  [[nodiscard]] virtual const std::vector<std::string>& files() const noexcept = 0;

 protected:
  RecordingWriter(RecordingWriter&&) noexcept = default;
  RecordingWriter& operator=(RecordingWriter&&) noexcept = default;

  void countMessage() noexcept { ++_messageCount; }
  void countLeftOut() noexcept { ++_leftOutCount; }

 private:
  std::uint64_t _messageCount = 0;
  std::uint64_t _leftOutCount = 0;
};

/// Begins a recording of this technology: a file whose name ends in `.pcap` becomes a pcap capture
/// and goes on in others (PcapRecording), any other, and standard output ("-"), is a pcapng file
/// (PcapngRecording). No file may be one of `inputs`. The error says why it cannot be begun.
[[nodiscard]] Result<std::unique_ptr<RecordingWriter>> createRecording(
    const std::string& path, std::string_view technology, std::string_view madeUp,
    const std::vector<std::string>& inputs);

}  // namespace kestro
