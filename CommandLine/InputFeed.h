// SPDX-License-Identifier: MIT
// The messages of a command's INPUTs, handed on one after the other.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "CommandLine/ExitStatus.h"
#include "CommandLine/InputOptions.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Progress.h"
#include "Platform/Result.h"
#include "Sources/Inputs.h"

namespace kestro {

/// Names on standard error what cannot be read or done, and goes on as far as that is possible; on
/// a terminal it shows how far it is.
class InputFeed {
 public:
  /// Opens the inputs; else there is a line on standard error that says why not, and the error is
  /// the exit status. `printsResults` as for Progress.
  [[nodiscard]] static tl::expected<InputFeed, ExitStatus> open(const InputOptions& options,
                                                                bool printsResults);

  /// Whether the messages that are wanted are of several technologies; `options` are those of the
  /// feed, which is unread still. See `haveSeveralTechnologies`.
  [[nodiscard]] bool hasSeveralTechnologies(const InputOptions& options) const;

  /// What is done with a whole message; an error is named with the message's number.
  using Handler = std::function<Result<void>(const InputMessage&)>;

  /// Hands the next message that is wanted to `take`, unless the recorder had cut it; false at the
  /// end of all inputs.
  bool takeNext(const Handler& take);

  /// What is done with messages that the recorder had cut; without it they are named as left out.
  void setCutHandler(Handler takeCut) { _takeCut = std::move(takeCut); }

  /// How it went so far. Nothing is done when damaged inputs yielded no message.
  [[nodiscard]] ExitStatus status() const noexcept;

  /// Names on standard error what is wrong with a message, which counts as not done.
  void skip(const InputMessage& message, const std::string& reason);

  /// What has been named of damaged inputs.
  [[nodiscard]] const std::vector<std::string>& damage() const noexcept { return _damage; }

  [[nodiscard]] const Inputs& inputs() const noexcept { return _inputs; }
  /// What lines call the first input.
  [[nodiscard]] const std::string& name() const { return _inputs.nameOf(0); }
  [[nodiscard]] std::string_view technology() const noexcept { return _inputs.technology(); }
  /// How many messages have been numbered so far, wanted or not, and how many were wanted.
  [[nodiscard]] std::uint64_t messageCount() const noexcept { return _inputs.messageCount(); }
  [[nodiscard]] std::uint64_t wantedCount() const noexcept { return _wantedCount; }

 private:
  InputFeed(std::unique_ptr<OfflineServices> services, Inputs inputs, bool printsResults)
      : _services(std::move(services)), _inputs(std::move(inputs)), _progress(printsResults) {}

  std::unique_ptr<OfflineServices> _services;  ///< of the inputs
  Inputs _inputs;
  Progress _progress;
  Handler _takeCut;
  std::uint64_t _wantedCount = 0;
  std::vector<std::string> _damage;
  bool _hasSkipped = false;
};

}  // namespace kestro
