// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/ReplayedInputs.h"

#include <utility>

namespace kestro {

ReplayedInputs::ReplayedInputs(InputFeed& feed, OfflineServices& services,
                               const ReplayOptions& options, Replay::RefreshHandler refreshed)
    : _feed(feed),
      _replay(
          [&services](std::string_view technology) {
            return LogGenerator::generatorFromTechnology(services.forGenerator(), technology);
          },
          services.clock(), options, std::move(refreshed)) {
  _replay.begin(feed.technology());
}

}  // namespace kestro
