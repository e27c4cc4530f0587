// SPDX-License-Identifier: MIT
// Messages that are decoded, explained and measured, refreshes, saves and reconnections of one
// technology, in any order, with and without its template.
#include "Fuzz/GeneratorChannel.h"
#include "Fuzz/Technology.h"

namespace kestro::fuzz {
namespace {

enum class Step : std::uint8_t { Refresh = 12, Save, Reconnect, Last };

/// Takes one step: mostly messages, whose header the input need not spell out in full.
void takeStep(Input& input, GeneratorChannel& channel) {
  const unsigned choice = input.byte() % static_cast<unsigned>(Step::Last);
  switch (static_cast<Step>(choice)) {
    case Step::Refresh:
      return channel.refresh();
    case Step::Save:
      return channel.save();
    case Step::Reconnect:
      return channel.start();
    default:
      break;
  }
  const ByteView message = input.bytes(input.number16() % 2048);
  channel.receive(message);
  channel.explain(message);
  channel.measure(message);
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  GeneratorChannel channel(kTechnology);
  const unsigned beginning = input.byte();
  if ((beginning & 1) == 0) channel.addTemplates();
  channel.start();
  if ((beginning & 2) == 0) channel.refresh();
  while (!input.isAtEnd()) takeStep(input, channel);
  channel.refresh();
}

}  // namespace kestro::fuzz
