// SPDX-License-Identifier: MIT
// What `info` tells of one input.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "CommandLine/Output.h"
#include "LogGenerator/Packets/PacketKind.h"
#include "Platform/Clock.h"
#include "Sources/InputMessage.h"

namespace kestro {

/// Sums up one input's messages, in bounded memory.
class InputSummary {
 public:
  /// Nothing for so long is a gap.
  static constexpr std::chrono::seconds kGap{5};
  /// No more gaps and notes than these are kept; the others are counted.
  static constexpr std::size_t kMostKept = 1'000;

  struct Sum {
    std::uint64_t messages = 0;
    std::uint64_t bytes = 0;
    void add(const InputMessage& message) {
      ++messages;
      bytes += message.bytes.size();
    }
  };
  struct Gap {
    Moment from;
    Moment to;
    std::uint64_t message = 0;  ///< the first behind it
  };
  struct Note {
    std::optional<Moment> time;  ///< of its message; absent where none follows
    std::uint64_t message = 0;
    std::string text;
  };
  /// A technology, and a log code; none for what has no code.
  using Kind = std::pair<std::string_view, std::optional<LogCode>>;

  void add(const InputMessage& message);
  void addClosingNote(const std::string& text);

  std::string name;
  std::string form;
  Sum all;
  std::optional<Moment> first;  ///< the earliest time
  std::optional<Moment> last;   ///< the latest
  std::map<std::string_view, Sum> technologies;
  std::map<Kind, Sum> kinds;
  std::vector<Gap> gaps;
  std::uint64_t gapCount = 0;
  std::vector<Note> notes;
  std::uint64_t noteCount = 0;
  std::uint64_t positionCount = 0;   ///< messages that say where the phone was
  std::uint64_t timesBackCount = 0;  ///< messages that are earlier than the one before
  std::uint64_t cutCount = 0;        ///< messages that the recorder had cut
  std::uint64_t passedOverCount = 0;
  std::vector<std::string> madeUp;
  std::vector<std::string> damage;

 private:
  void addComment(const InputMessage& message, const std::string& text);

  std::optional<Moment> _before;
};

/// Names a kind of messages; empty when nobody knows.
using NameOfKind = std::function<std::string_view(const InputSummary::Kind& kind)>;

/// Appends the summary as people read it.
void appendInfoTable(std::string& output, const InputSummary& summary, const NameOfKind& nameOf);

/// Appends {"inputs": [...]}, times in ISO 8601.
void appendInfoJson(std::string& output, const std::vector<InputSummary>& summaries,
                    const NameOfKind& nameOf);

}  // namespace kestro
