// SPDX-License-Identifier: MIT
// One of the inputs of a command: a recording of any form, or a source of the telephony server that
// plays without waiting.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Result.h"
#include "Sources/InputMessage.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {

/// An input that is being read from its beginning to its end, in constant memory.
class InputReader {
 public:
  InputReader() = default;
  virtual ~InputReader() = default;
  InputReader(const InputReader&) = delete;
  InputReader& operator=(const InputReader&) = delete;

  /// What it is: a form of recordings as `nameOfForm` says it, or a kind of sources.
  [[nodiscard]] virtual std::string_view form() const noexcept = 0;

  /// The technology with which it begins, as far as that is known before the first message; else
  /// empty.
  [[nodiscard]] virtual std::string_view technology() const noexcept = 0;

  /// Whether it can go on in another technology.
  [[nodiscard]] virtual bool mayChangeTechnology() const noexcept = 0;

  /// Whether its times never go back, so that nothing of a time follows a later one.
  [[nodiscard]] virtual bool timesGoUp() const noexcept = 0;

  /// The next message, without a number, or nothing at the end. What is cut or damaged
  /// yields every whole message before the damage, then an error that begins with the input's name;
  /// after an error every call yields the same error.
  [[nodiscard]] virtual Result<std::optional<InputMessage>> next() = 0;

  /// The notes that no message follows; complete at the end.
  [[nodiscard]] virtual std::span<const std::string> closingNotes() const noexcept { return {}; }

  /// How many records were passed over because they are no messages of ours.
  [[nodiscard]] virtual std::uint64_t passedOverCount() const noexcept { return 0; }

  /// How much of it has been read, 0 to 1; absent when nobody knows.
  [[nodiscard]] virtual std::optional<double> fractionRead() const noexcept { return std::nullopt; }
};

/// What an INPUT of a command line names. What stands before its first colon and is a kind of
/// sources is the kind, and what follows is its argument; anything else is a file ("-": standard
/// input), so that "./capture:x" is a file of that name. The error says that the kind's argument is
/// none. `technology` is the one asked for, a constant text, "auto" or empty: what is made of a
/// drive-test log (unless given, that is "auto"), a stream or a simulation that does not say it.
[[nodiscard]] Result<SourceRequest> parseInput(std::string_view text, std::string_view technology);

/// Opens an input. The error begins with its name. Missing columns and unusable rows of a
/// drive-test log are told to `report`. What the services refer to must outlive the reader; they
/// need no input streams.
[[nodiscard]] Result<std::unique_ptr<InputReader>> openInput(const SourceRequest& input,
                                                             const SourceServices& services,
                                                             const SourceReporter& report);

}  // namespace kestro
