// SPDX-License-Identifier: MIT
// Bytes as a pcapng file, read by our reader and, as far as it can, by libpcap.
#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <memory>
#include <optional>
#include <string>

#include "Fuzz/Harness.h"
#include "Fuzz/MemoryFile.h"
#include "Recordings/PcapReader.h"
#include "Recordings/PcapngReader.h"

namespace kestro::fuzz {
namespace {

/// What our reader refuses and libpcap does not look at.
constexpr std::array kOwnChecks = {"an option of ", "a time outside ", "more than ", "no length of",
                                   "a packet that is too short"};

/// libpcap multiplies in 64 bits: from 2^-45 s on its microseconds are wrong.
constexpr std::uint8_t kFirstWrongResolution = 0x80 + 44;

bool mayHaveFineResolution(ByteView bytes) {
  for (std::size_t i = 0; i + 4 < bytes.size(); ++i) {
    const bool isOption = loadLittleEndian<std::uint32_t>(bytes, i) == 0x00010009U ||
                          loadBigEndian<std::uint32_t>(bytes, i) == 0x00090001U;
    if (isOption && bytes[i + 4] >= kFirstWrongResolution) return true;
  }
  return false;
}

/// Reads on with one of the readers. What it yields is valid until it is read on again.
class Reading {
 public:
  explicit Reading(RecordingReader& reader) : _reader(reader) {}

  /// The next message; nothing at the end or at damage.
  std::optional<RecordedMessage> next() {
    auto message = _reader.next();
    if (!message) _error = message.error().message;
    return message ? *std::move(message) : std::nullopt;
  }
  [[nodiscard]] const std::string& error() const noexcept { return _error; }

 private:
  RecordingReader& _reader;
  std::string _error;
};

void requireSame(const RecordedMessage& own, const RecordedMessage& others, bool comparesTimes) {
  require(std::ranges::equal(own.bytes, others.bytes), "both readers yield the same bytes");
  require(own.originalLength == others.originalLength, "both readers know the same length");
  require(own.technology == others.technology, "both readers name the same technology");
  // libpcap puts packets without a time at the beginning of 1970.
  const bool hasTime = others.time.time_since_epoch().count() != 0;
  if (comparesTimes && hasTime) require(own.time == others.time, "both readers tell the same time");
}

bool isOwnCheck(const std::string& error) {
  return std::ranges::any_of(
      kOwnChecks, [&](const char* text) { return error.find(text) != std::string::npos; });
}

/// libpcap reads files of one link type only; what it refuses tells nothing.
void compare(PcapngReader& own, PcapReader& others, bool comparesTimes) {
  Reading ours(own);
  Reading theirs(others);
  while (true) {
    const auto message = ours.next();
    const auto reference = theirs.next();
    if (message && reference) {
      requireSame(*message, *reference, comparesTimes);
    } else {
      const bool readsLess = reference.has_value() || theirs.error().empty();
      if (!message && readsLess && !ours.error().empty() && !isOwnCheck(ours.error())) {
        fmt::print(stderr, "{}\n", ours.error());
        require(false, "what libpcap reads is read");
      }
      if (!message && ours.error().empty()) require(!reference, "no message is passed over");
      return;
    }
  }
}

void requireBounds(PcapngReader& reader, std::size_t size) {
  std::size_t total = 0;
  while (true) {
    const auto message = reader.next();
    if (!message || !*message) break;
    total += (*message)->bytes.size();
    for (const std::string& comment : (*message)->comments) total += comment.size();
  }
  for (const std::string& note : reader.closingNotes()) total += note.size();
  require(total <= size, "messages and comments are no longer than their file");
}

}  // namespace

void tryInput(ByteView bytes) {
  const MemoryFile file(bytes);
  const auto open = [&] { return PcapngReader::open(RecordedFile::open(file.path()).value()); };
  auto own = open();
  if (!own) return;
  requireBounds(**own, bytes.size());
  auto reference = PcapReader::open(file.path());
  own = open();
  if (reference) compare(**own, *reference, !mayHaveFineResolution(bytes));
}

}  // namespace kestro::fuzz
