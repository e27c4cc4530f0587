// SPDX-License-Identifier: MIT
// Decoding against merely formatting the same values: what the benchmarks of all binary families
// measure, and how.
#pragma once

#include <benchmark/benchmark.h>
#include <fmt/compile.h>

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <limits>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/QuietPlatform.h"

namespace kestro::benchmarks {

/// One packet and every text that it must put on an empty display, in display order.
struct BenchmarkPacket {
  std::string name;
  Bytes bytes;
  std::vector<std::string> texts;
  Bytes earlier{};  ///< a packet that shows nothing itself but must come first; may be empty
};

/// The floor: the values of a packet, formatted one after the other into one buffer by formats that
/// fmt has compiled. Knows the values beforehand; reads, stores and publishes nothing.
class PlainFormatting {
 public:
  explicit PlainFormatting(std::span<const std::string> texts) {
    for (const std::string& text : texts) _values.push_back(parse(text));
    _buffer.resize(64 * texts.size() + 512);
  }

  /// Formats all values; the result is valid until the next call.
  std::string_view format() {
    char* end = _buffer.data();
    for (const FormattedValue& value : _values) end = append(value, end);
    return {_buffer.data(), static_cast<std::size_t>(end - _buffer.data())};
  }

 private:
  struct FormattedValue {
    enum class Kind : std::uint8_t { Text, Integer, Real } kind = Kind::Text;
    std::int64_t integer = 0;
    double real = 0;
    int decimals = 0;
    std::string suffix{};
  };

  static char* append(const FormattedValue& value, char* end) {
    switch (value.kind) {
      case FormattedValue::Kind::Integer:
        return fmt::format_to(end, FMT_COMPILE("{}{}"), value.integer, value.suffix);
      case FormattedValue::Kind::Real:
        return fmt::format_to(end, FMT_COMPILE("{:.{}f}{}"), value.real, value.decimals,
                              value.suffix);
      case FormattedValue::Kind::Text:
        break;
    }
    return fmt::format_to(end, FMT_COMPILE("{}"), value.suffix);
  }

  /// Takes a shown text apart into a number and its unit.
  static FormattedValue parse(const std::string& text) {
    const std::size_t end = std::min(text.find_first_not_of("-0123456789."), text.size());
    const std::string number = text.substr(0, end);
    FormattedValue value{.suffix = text.substr(end)};
    const std::size_t point = number.find('.');
    if (number.empty()) return value;
    if (point == std::string::npos) {
      value.kind = FormattedValue::Kind::Integer;
      std::from_chars(number.data(), number.data() + number.size(), value.integer);
    } else {
      value.kind = FormattedValue::Kind::Real;
      std::from_chars(number.data(), number.data() + number.size(), value.real);
      value.decimals = static_cast<int>(number.size() - point - 1);
    }
    return value;
  }

  std::vector<FormattedValue> _values;
  std::string _buffer;
};

/// A generator with its display, fed without collecting what it is fed with.
template <class Generator>
class LiveDisplay {
 public:
  /// `templateName` is a resource beside the program.
  explicit LiveDisplay(std::string_view templateName) {
    const auto resource = createBundle()->resource(templateName, "plist");
    if (resource) _platform.bundle().setResource(std::string(templateName) + ".plist", *resource);
    _platform.systemLog().setThreshold(LogPriority::Error);
    startAfresh();
  }

  /// An empty display.
  void startAfresh() {
    _state = Dictionary();
    _generator = Generator::generator(generatorServices(_platform));
    _generator->getDisplayFromState(_state);
    static_cast<void>(_platform.systemLog().take());
  }

  void receive(ByteView packet) { _generator->updateWithData(packet); }

  /// Every text of the display, in order.
  [[nodiscard]] std::vector<std::string> texts() const {
    std::vector<std::string> found;
    collect(_state[kStateDisplay], found);
    return found;
  }

 private:
  static void collect(const Value& value, std::vector<std::string>& found) {
    if (value.isText()) found.emplace_back(value.text());
    for (const Value& element : value.array()) collect(element, found);
    for (const auto& entry : value.dictionary()) {
      if (entry.key.text() != "_sorted") collect(entry.value, found);
    }
  }

  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  QuietPlatform _platform{*_coding};
  std::unique_ptr<Generator> _generator;
  Dictionary _state;
};

/// The least time of one call among many batches: what the call costs when nothing disturbs it.
template <class Call>
[[nodiscard]] double leastNanoseconds(Call&& call) {
  using Clock = std::chrono::steady_clock;
  constexpr int kBatches = 60;
  constexpr auto kBatchTime = std::chrono::microseconds(500);
  int calls = 1;
  double least = std::numeric_limits<double>::max();
  for (int batch = 0; batch < kBatches;) {
    const auto start = Clock::now();
    for (int i = 0; i < calls; ++i) call();
    const auto time = Clock::now() - start;
    if (time < kBatchTime && batch == 0) {
      calls *= 2;
      continue;
    }
    least = std::min(least, std::chrono::duration<double, std::nano>(time).count() / calls);
    ++batch;
  }
  return least;
}

/// How often the counted functions call: Benchmarks/instructions counts what they execute, and
/// divides by this number.
inline constexpr int kCountedRounds = 200;

template <class Call>
[[gnu::noinline]] void countedDecoding(Call&& call) {
  for (int round = 0; round < kCountedRounds; ++round) call();
}

template <class Call>
[[gnu::noinline]] void countedFormatting(Call&& call) {
  for (int round = 0; round < kCountedRounds; ++round) call();
}

/// Calls `decode`, which decodes `packets` packets, again and again; counts packets per second.
template <class Decode>
void timeDecoding(benchmark::State& state, std::size_t packets, Decode&& decode) {
  for (auto _ : state) decode();
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(packets));
}

/// Counts "of_floor": the time of one call of `decode` over that of `format`, which formats the
/// same packets' values.
template <class Decode, class Format>
void compareWithFloor(benchmark::State& state, Decode&& decode, Format&& format) {
  state.counters["of_floor"] = leastNanoseconds(decode) / leastNanoseconds(format);
  countedDecoding(decode);
  countedFormatting(format);
}

/// Decodes the packets one after the other, round and round. Where nothing is shown there is no
/// floor.
template <class Generator>
void decodePackets(benchmark::State& state, LiveDisplay<Generator>& display,
                   std::span<const BenchmarkPacket* const> packets) {
  std::vector<PlainFormatting> floors;
  for (const BenchmarkPacket* packet : packets) floors.emplace_back(packet->texts);
  display.startAfresh();
  for (const BenchmarkPacket* packet : packets) display.receive(packet->earlier);
  const auto decode = [&] {
    for (const BenchmarkPacket* packet : packets) display.receive(packet->bytes);
  };
  timeDecoding(state, packets.size(), decode);
  const bool showsNothing = std::ranges::all_of(
      packets, [](const BenchmarkPacket* packet) { return packet->texts.empty(); });
  if (showsNothing) return;
  const auto format = [&] {
    for (PlainFormatting& formatting : floors) benchmark::DoNotOptimize(formatting.format());
  };
  compareWithFloor(state, decode, format);
}

/// Whether every packet shows what it must, and the floor formats just that. Says what is wrong.
template <class Generator>
[[nodiscard]] bool showsWhatItMust(LiveDisplay<Generator>& display,
                                   std::span<const BenchmarkPacket> packets) {
  bool isRight = true;
  for (const BenchmarkPacket& packet : packets) {
    display.startAfresh();
    display.receive(packet.earlier);
    display.receive(packet.bytes);
    const std::vector<std::string> shown = display.texts();
    std::string expected;
    for (const std::string& text : packet.texts) expected += text;
    if (shown == packet.texts && PlainFormatting(shown).format() == expected) continue;
    fmt::print(stderr, "{} shows:\n", packet.name);
    for (const std::string& text : shown) fmt::print(stderr, "  {}\n", text);
    isRight = false;
  }
  return isRight;
}

}  // namespace kestro::benchmarks
