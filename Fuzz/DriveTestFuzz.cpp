// SPDX-License-Identifier: MIT
// Bytes as a drive-test log, played as each technology, its messages decoded.
#include <memory>
#include <variant>

#include "Fuzz/GeneratorChannel.h"
#include "Fuzz/MemoryFile.h"
#include "Sources/SourceCatalogue.h"

namespace kestro::fuzz {
namespace {

/// Plays the source to its end into a channel of whatever technology its messages have.
void play(LogSource& source) {
  std::unique_ptr<GeneratorChannel> channel;
  std::string_view technology;
  for (;;) {
    const auto step = source.next();
    if (!step) return;
    const auto* event = std::get_if<SourceEvent>(&*step);
    if (event == nullptr) return;
    if (event->technology != technology) {
      technology = event->technology;
      channel = std::make_unique<GeneratorChannel>(technology);
      channel->addTemplates();
      channel->start();
      channel->refresh();
    }
    if (!event->message.empty()) channel->receive(event->message);
  }
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  const auto choices = technologyChoices();
  const std::string_view technology = choices[input.byte() % choices.size()];
  const MemoryFile file(input.rest());
  VirtualPlatform platform(propertyListCoding());
  const SourceReporter ignore = [](std::string_view) {};
  const auto source =
      openSource({.kind = "drive-test", .argument = file.path(), .technology = technology},
                 sourceServices(platform), ignore);
  if (source) play(**source);
}

}  // namespace kestro::fuzz
