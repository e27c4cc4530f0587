// SPDX-License-Identifier: MIT
// What a command with INPUTs reads: one or several of them, merged by time and narrowed.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Packets/PacketKind.h"
#include "Platform/Result.h"
#include "Sources/InputBound.h"
#include "Sources/InputMessage.h"
#include "Sources/InputReader.h"

namespace kestro {

/// Which messages are wanted.
struct InputNarrowing {
  /// The first and, as a time, the first one that is not wanted any more; a number is that of the
  /// last one.
  std::optional<InputBound> from = std::nullopt;
  std::optional<InputBound> to = std::nullopt;
  /// Packets of this log code only.
  std::optional<LogCode> code = std::nullopt;
  /// A constant text of Platform/TelephonyService.h; empty: all.
  std::string_view technology = {};
};

/// Inputs that are being read from their beginning to their end, in constant memory. Of several the
/// earliest next message comes first, that of the first-named input on a tie; the messages of one
/// input keep their order, whatever their times. Without an end, a simulation never ends.
class Inputs {
 public:
  /// Opens all inputs; the error is that of the first one that cannot be opened, or says that two
  /// are standard input. What they leave out is told to `report`; the services must outlive the
  /// inputs.
  [[nodiscard]] static Result<Inputs> open(std::span<const SourceRequest> requests,
                                           const InputNarrowing& narrowing,
                                           const SourceServices& services,
                                           const SourceReporter& report);

  /// The next message that is wanted, or nothing at the end. An error means that one input can be
  /// read no further, for the reason that it says once; the next call goes on with the others.
  [[nodiscard]] Result<std::optional<InputMessage>> next();

  /// How many messages have been numbered so far, wanted or not.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _count; }

  /// The technology of the last message; before the first, that with which the first input begins,
  /// as far as it is known, else empty.
  [[nodiscard]] std::string_view technology() const noexcept;

  /// Whether more than one technology is to be expected, before any message is read.
  [[nodiscard]] bool mayHaveSeveralTechnologies() const noexcept;

  /// What messages call an input.
  [[nodiscard]] const std::string& nameOf(std::size_t input) const { return _inputs[input].name; }
  [[nodiscard]] std::size_t size() const noexcept { return _inputs.size(); }
  [[nodiscard]] const InputReader& reader(std::size_t input) const {
    return *_inputs[input].reader;
  }

  /// How much has been read, 0 to 1; absent when nobody knows.
  [[nodiscard]] std::optional<double> fractionRead() const noexcept;

 private:
  struct Input {
    std::string name;
    std::unique_ptr<InputReader> reader;
    std::optional<InputMessage> head = std::nullopt;
    bool hasEnded = false;
  };
  /// Where an input's next message stands: its time and the input.
  using Place = std::pair<Moment, std::size_t>;

  explicit Inputs(const InputNarrowing& narrowing) : _narrowing(narrowing) {}

  [[nodiscard]] Result<void> fill(std::size_t index);
  /// Takes the earliest next message; absent at the end of all.
  [[nodiscard]] std::optional<InputMessage> takeEarliest();
  [[nodiscard]] bool isPastEnd() const noexcept;
  [[nodiscard]] bool isWanted(const InputMessage& message) const;
  void begin(Moment first);
  [[nodiscard]] double shareOfEnd() const noexcept;

  InputNarrowing _narrowing;
  std::optional<Moment> _from;  ///< once the first message is known
  std::optional<Moment> _to;
  std::vector<Input> _inputs;
  std::vector<Place> _places;        ///< a heap, the earliest in front
  std::vector<std::size_t> _unread;  ///< inputs whose next message is to be read, the next one last
  std::uint64_t _count = 0;
  Moment _first;
  Moment _last;
  std::string_view _technology;
};

/// Whether the messages that are wanted are of several technologies. Files that can hold several
/// are read to the second one, or through; what cannot be read twice counts as if it did.
[[nodiscard]] bool haveSeveralTechnologies(std::span<const SourceRequest> requests,
                                           const InputNarrowing& narrowing,
                                           const SourceServices& services);

}  // namespace kestro
