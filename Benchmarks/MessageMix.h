// SPDX-License-Identifier: MIT
// Messages of several kinds, what each must show, and how long their decoding takes beside merely
// formatting that.
#pragma once

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include <cstddef>
#include <cstdint>
#include <random>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Benchmarks/DecodeSpeed.h"
#include "Platform/Bytes.h"

namespace kestro::benchmarks {

/// The values that a message shows, ready to be formatted.
struct ShownValues {
  std::vector<std::int64_t> whole{};
  std::vector<double> real{};
};

/// Formats a message's values in the order in which its display shows them; returns the end.
template <class Values>
using FormatOf = char* (*)(const Values& values, char* end);

template <class Values>
struct MessageOf {
  Bytes bytes;
  Values values;
  FormatOf<Values> format;
  Bytes primer{};  ///< what must have come before, if anything
};

using Format = FormatOf<ShownValues>;
using Message = MessageOf<ShownValues>;

/// Different values from message to message, the same in every run.
class Draw {
 public:
  unsigned upTo(unsigned highest) {
    return std::uniform_int_distribution<unsigned>(0, highest)(_engine);
  }
  unsigned between(unsigned lowest, unsigned highest) { return lowest + upTo(highest - lowest); }

 private:
  std::mt19937 _engine{20120304};
};

/// One kind of message, and its share of a drive in per cent. Messages are numbered from 1.
template <class Values>
struct KindOf {
  const char* name;
  MessageOf<Values> (*message)(Draw& draw, unsigned number);
  int share;
};

using Kind = KindOf<ShownValues>;

inline constexpr unsigned kMessagesOfAKind = 200;
inline constexpr std::size_t kLongestText = 16384;

template <class Values>
[[nodiscard]] std::vector<MessageOf<Values>> messagesOf(const KindOf<Values>& kind) {
  Draw draw;
  std::vector<MessageOf<Values>> messages;
  for (unsigned i = 1; i <= kMessagesOfAKind; ++i) messages.push_back(kind.message(draw, i));
  return messages;
}

/// Messages by the kinds' shares, in an order in which kinds take turns.
template <class Values, std::size_t kCount>
[[nodiscard]] std::vector<MessageOf<Values>> driveOf(const KindOf<Values> (&kinds)[kCount]) {
  Draw draw;
  std::vector<MessageOf<Values>> messages;
  int sent[kCount] = {};
  for (int i = 1; i <= 2 * static_cast<int>(kMessagesOfAKind); ++i) {
    std::size_t next = 0;
    const auto owed = [&](std::size_t kind) { return kinds[kind].share * i - 100 * sent[kind]; };
    for (std::size_t kind = 1; kind < kCount; ++kind) {
      if (owed(kind) > owed(next)) next = kind;
    }
    ++sent[next];
    messages.push_back(kinds[next].message(draw, static_cast<unsigned>(sent[next])));
  }
  return messages;
}

/// Whether every message, after its primer alone, shows what the floor formats.
template <class Display, class Values>
[[nodiscard]] bool areShownRight(Display& display, const std::vector<MessageOf<Values>>& messages,
                                 const char* name) {
  std::string expected(kLongestText, '\0');
  for (const MessageOf<Values>& message : messages) {
    display.startAfresh();
    if (!message.primer.empty()) display.receive(message.primer);
    display.receive(message.bytes);
    std::string shown;
    for (const std::string& text : display.texts()) shown += text;
    const char* end = message.format(message.values, expected.data());
    const std::string_view wanted(expected.data(), static_cast<std::size_t>(end - expected.data()));
    if (shown == wanted) continue;
    fmt::print(stderr, "{} shows\n  {}\nnot\n  {}\n", name, shown, wanted);
    return false;
  }
  return true;
}

/// Decodes the messages round and round.
template <class Display, class Values>
void decodeMessages(benchmark::State& state, Display& display,
                    const std::vector<MessageOf<Values>>& messages) {
  display.startAfresh();
  const auto decode = [&] {
    for (const MessageOf<Values>& message : messages) display.receive(message.bytes);
  };
  timeDecoding(state, messages.size(), decode);
  std::string buffer(kLongestText, '\0');
  const auto format = [&] {
    for (const MessageOf<Values>& message : messages) {
      benchmark::DoNotOptimize(message.format(message.values, buffer.data()));
    }
  };
  compareWithFloor(state, decode, format);
}

/// Registers a benchmark of these messages, once they have shown what they must.
template <class Display, class Values>
[[nodiscard]] bool registerChecked(Display& display, const char* name,
                                   std::vector<MessageOf<Values>> messages) {
  if (!areShownRight(display, messages, name)) return false;
  benchmark::RegisterBenchmark(name,
                               [&display, messages = std::move(messages)](benchmark::State& state) {
                                 decodeMessages(state, display, messages);
                               });
  return true;
}

/// Registers one benchmark for each kind, and one for a drive of all of them.
template <class Display, class Values, std::size_t kCount>
[[nodiscard]] bool registerKinds(Display& display, const KindOf<Values> (&kinds)[kCount]) {
  for (const KindOf<Values>& kind : kinds) {
    if (!registerChecked(display, kind.name, messagesOf(kind))) return false;
  }
  return registerChecked(display, "mixed drive", driveOf(kinds));
}

}  // namespace kestro::benchmarks
