// SPDX-License-Identifier: MIT
// Any property list as a technology's template, then messages into what became of it.
#include "Fuzz/GeneratorChannel.h"
#include "Fuzz/Technology.h"

namespace kestro::fuzz {
namespace {

void addTemplate(GeneratorChannel& channel, ByteView contents) {
  for (const char* name : {"LTE.plist", "Ondrel_GSM.plist", "UTRAN.plist", "C2KTemplate.plist"}) {
    channel.platform().bundle().setResource(name, {contents.begin(), contents.end()});
  }
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  GeneratorChannel channel(kTechnology);
  addTemplate(channel, input.bytes(input.number16()));
  channel.start();
  channel.refresh();
  while (!input.isAtEnd()) channel.receive(input.bytes(input.number16() % 512));
  channel.refresh();
  channel.start();
  channel.refresh();
}

}  // namespace kestro::fuzz
