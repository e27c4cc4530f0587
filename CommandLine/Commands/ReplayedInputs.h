// SPDX-License-Identifier: MIT
// A command's INPUTs, replayed as the model would show them.
#pragma once

#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "Model/Replay.h"

namespace kestro {

/// A replay on `services`, which must outlive it. Where it can be known, it has the generator of
/// the first message before there is one.
class ReplayedInputs {
 public:
  ReplayedInputs(InputFeed& feed, OfflineServices& services, const ReplayOptions& options,
                 Replay::RefreshHandler refreshed);

  /// Feeds the next message; false at the end.
  bool feedNext() { return _feed.takeNext(_take); }

  [[nodiscard]] Replay& replay() noexcept { return _replay; }

 private:
  InputFeed& _feed;
  Replay _replay;
  const InputFeed::Handler _take = [this](const InputMessage& message) {
    return _replay.feed({.number = message.number,
                         .time = message.time,
                         .technology = message.technology,
                         .bytes = message.bytes});
  };
};

}  // namespace kestro
