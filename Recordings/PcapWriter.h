// SPDX-License-Identifier: MIT
// Writes one capture file.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Platform/Result.h"

namespace kestro {

/// A capture file of one technology that is being written. Every record has reached the system when
/// `write` returns, so that a file whose writer was killed can be read up to its last message.
class PcapWriter {
 public:
  /// Creates the file, or empties an existing one, and writes its header; "-" is standard output.
  /// The error says why that was not possible; an unknown technology is refused.
  [[nodiscard]] static Result<PcapWriter> create(const std::string& path,
                                                 std::string_view technology);

  PcapWriter(PcapWriter&&) noexcept;
  PcapWriter& operator=(PcapWriter&&) noexcept;
  ~PcapWriter();

  /// Appends one message of at most kMaximumPcapMessageSize bytes; a longer one is refused and
  /// leaves the file as it was. Times are kept to the microsecond; the format holds the years 1970
  /// to 2106, and a time outside is written as the nearest one inside. When the system refuses the
  /// bytes (a full disk), the file may end in half a record, and every later call yields the same
  /// error.
  [[nodiscard]] Result<void> write(Moment time, ByteView message);

 private:
  struct Handle;
  PcapWriter(std::string path, std::unique_ptr<Handle> handle);

  std::string _path;
  std::unique_ptr<Handle> _handle;
  std::optional<Error> _error;
};

}  // namespace kestro
