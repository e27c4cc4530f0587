// SPDX-License-Identifier: MIT
// Messages of several kinds, what each must show, and how long their decoding takes beside merely
// formatting that.
#pragma once

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include <cstdint>
#include <random>
#include <span>
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
using Format = char* (*)(const ShownValues& values, char* end);

struct Message {
  Bytes bytes;
  ShownValues values;
  Format format;
  Bytes primer{};  ///< what must have come before, if anything
};

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
struct Kind {
  const char* name;
  Message (*message)(Draw& draw, unsigned number);
  int share;
};

inline constexpr unsigned kMessagesOfAKind = 200;
inline constexpr std::size_t kLongestText = 16384;

[[nodiscard]] inline std::vector<Message> messagesOf(const Kind& kind) {
  Draw draw;
  std::vector<Message> messages;
  for (unsigned i = 1; i <= kMessagesOfAKind; ++i) messages.push_back(kind.message(draw, i));
  return messages;
}

/// Messages by the kinds' shares, in an order in which kinds take turns.
[[nodiscard]] inline std::vector<Message> driveOf(std::span<const Kind> kinds) {
  Draw draw;
  std::vector<Message> messages;
  std::vector<int> sent(kinds.size(), 0);
  for (int i = 1; i <= 2 * static_cast<int>(kMessagesOfAKind); ++i) {
    std::size_t next = 0;
    const auto owed = [&](std::size_t kind) { return kinds[kind].share * i - 100 * sent[kind]; };
    for (std::size_t kind = 1; kind < kinds.size(); ++kind) {
      if (owed(kind) > owed(next)) next = kind;
    }
    ++sent[next];
    messages.push_back(kinds[next].message(draw, static_cast<unsigned>(sent[next])));
  }
  return messages;
}

/// Whether every message, after its primer alone, shows what the floor formats.
template <class Display>
[[nodiscard]] bool areShownRight(Display& display, std::span<const Message> messages,
                                 const char* name) {
  std::string expected(kLongestText, '\0');
  for (const Message& message : messages) {
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

/// Decodes the messages round and round. Counts messages per second; "of_floor" is the time for one
/// round over that of merely formatting its values.
template <class Display>
void decodeMessages(benchmark::State& state, Display& display, std::span<const Message> messages) {
  display.startAfresh();
  const auto decode = [&] {
    for (const Message& message : messages) display.receive(message.bytes);
  };
  for (auto _ : state) decode();
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(messages.size()));
  std::string buffer(kLongestText, '\0');
  const auto format = [&] {
    for (const Message& message : messages) {
      benchmark::DoNotOptimize(message.format(message.values, buffer.data()));
    }
  };
  state.counters["of_floor"] = leastNanoseconds(decode) / leastNanoseconds(format);
  countedDecoding(decode);
  countedFormatting(format);
}

/// Registers a benchmark of these messages, once they have shown what they must.
template <class Display>
[[nodiscard]] bool registerChecked(Display& display, const char* name,
                                   std::vector<Message> messages) {
  if (!areShownRight(display, messages, name)) return false;
  benchmark::RegisterBenchmark(name,
                               [&display, messages = std::move(messages)](benchmark::State& state) {
                                 decodeMessages(state, display, messages);
                               });
  return true;
}

/// Registers one benchmark for each kind, and one for a drive of all of them.
template <class Display>
[[nodiscard]] bool registerKinds(Display& display, std::span<const Kind> kinds) {
  for (const Kind& kind : kinds) {
    if (!registerChecked(display, kind.name, messagesOf(kind))) return false;
  }
  return registerChecked(display, "mixed drive", driveOf(kinds));
}

}  // namespace kestro::benchmarks
