// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/RecordingFeed.h"

#include <fmt/format.h>

#include "CommandLine/Output.h"

namespace kestro {

std::unique_ptr<LogGenerator> RecordingFeed::makeGenerator(
    const GeneratorServices& services) const {
  auto generator = LogGenerator::generatorFromTechnology(services, technology());
  if (!generator) {
    complain(fmt::format("{}: nothing here decodes the technology {}", _path, technology()));
  }
  return generator;
}

bool RecordingFeed::takeNext(const Handler& take) {
  const auto next = _reader.next();
  if (!next) {
    complain(next.error().message);
    _status = _reader.messageCount() == 0 ? kExitNothingDone : kExitPartlyDone;
    return false;
  }
  if (!*next) return false;
  const RecordedMessage& message = **next;
  if (message.isCut()) {
    skip(message, fmt::format("only {} of its {} bytes were recorded", message.bytes.size(),
                              message.originalLength));
  } else if (const auto outcome = take(message); !outcome) {
    skip(message, outcome.error().message);
  }
  return true;
}

bool RecordingFeed::feedNext(Replay& replay) {
  return takeNext([&](const RecordedMessage& message) {
    return replay.feed({.number = message.number, .time = message.time, .bytes = message.bytes});
  });
}

void RecordingFeed::skip(const RecordedMessage& message, const std::string& reason) {
  complain(fmt::format("{}: message {}: {}", _path, message.number, reason));
  _status = kExitPartlyDone;
}

}  // namespace kestro
