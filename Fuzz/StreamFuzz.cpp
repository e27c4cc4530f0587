// SPDX-License-Identifier: MIT
// Bytes as a framed stream, arriving in pieces of any size.
#include <variant>

#include "Fuzz/Harness.h"
#include "Platform/TelephonyService.h"
#include "Platform/Virtual/VirtualServices.h"
#include "Sources/StreamSource.h"

namespace kestro::fuzz {
namespace {

/// Takes every message that has arrived and returns their bytes; false when none can follow.
bool takeMessages(StreamSource& source, std::size_t& bytes) {
  for (;;) {
    const auto step = source.next();
    if (!step || std::holds_alternative<SourceEnded>(*step)) return false;
    const auto* event = std::get_if<SourceEvent>(&*step);
    if (event == nullptr) return true;
    require(!event->message.empty(), "a sign of life is no message");
    bytes += event->message.size();
  }
}

void feed(Input& input, const VirtualInputStreams& streams, StreamSource& source) {
  std::size_t arrived = 0;
  std::size_t taken = 0;
  while (!input.isAtEnd()) {
    const ByteView piece = input.bytes(input.byte() + std::size_t{1});
    streams.receive(piece);
    arrived += piece.size();
    const bool goesOn = takeMessages(source, taken);
    require(taken <= arrived, "messages are made of bytes that have arrived");
    if (!goesOn || !streams.isOpen()) return;
  }
  streams.end("");
  require(!takeMessages(source, taken), "an ended stream yields nothing more");
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  VirtualInputStreams streams;
  streams.allow("stream");
  const auto source = StreamSource::open(streams, "stream", kTqLogChannelTechnology_Ondrel_LTE);
  require(source.has_value(), "the stream opens");
  feed(input, streams, **source);
}

}  // namespace kestro::fuzz
