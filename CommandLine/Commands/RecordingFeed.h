// SPDX-License-Identifier: MIT
// A capture's messages, handed on one after the other.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "CommandLine/ExitStatus.h"
#include "Model/Replay.h"
#include "Recordings/PcapReader.h"

namespace kestro {

/// Names on standard error what cannot be read or decoded, and goes on as far as that is possible.
class RecordingFeed {
 public:
  /// `path` is what messages call the capture.
  RecordingFeed(std::string path, PcapReader reader)
      : _path(std::move(path)), _reader(std::move(reader)) {}

  [[nodiscard]] std::string_view technology() const noexcept { return _reader.technology(); }
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _reader.messageCount(); }

  /// The generator for the capture's technology. Null, with a line that says so, when there is
  /// none.
  [[nodiscard]] std::unique_ptr<LogGenerator> makeGenerator(
      const GeneratorServices& services) const;

  /// What is done with a whole message; an error is named with the message's number.
  using Handler = std::function<Result<void>(const RecordedMessage&)>;

  /// Hands the next message to `take`, unless the recorder had cut it; false at the capture's end,
  /// or where it is damaged.
  bool takeNext(const Handler& take);
  /// Feeds the next message; false at the capture's end, or where it is damaged.
  bool feedNext(Replay& replay);

  /// How it went so far. Nothing is done when a damaged capture yielded no message.
  [[nodiscard]] ExitStatus status() const noexcept { return _status; }

 private:
  void skip(const RecordedMessage& message, const std::string& reason);

  std::string _path;
  PcapReader _reader;
  ExitStatus _status = kExitDone;
};

}  // namespace kestro
