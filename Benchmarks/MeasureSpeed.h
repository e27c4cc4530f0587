// SPDX-License-Identifier: MIT
// Measuring messages into a sink that only adds up, beside decoding the same messages.
#pragma once

#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Benchmarks/MessageMix.h"
#include "LogGenerator/Measurer.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro::benchmarks {

/// A measurer with the program's templates.
class Meter {
 public:
  [[nodiscard]] Measurer& measurer() noexcept { return _measurer; }

 private:
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  std::unique_ptr<Bundle> _bundle = createBundle();
  Measurer _measurer{{*_bundle, *_coding}};
};

/// Whether every message measures the values that the floor formats, in their order.
template <class Values>
[[nodiscard]] bool areMeasuredRight(std::string_view technology,
                                    const std::vector<MessageOf<Values>>& messages) {
  Meter meter;
  std::string expected(kLongestText, '\0');
  for (const MessageOf<Values>& message : messages) {
    std::string measured;
    for (const MeasuredValue& value : meter.measurer().measure(technology, message.bytes).values) {
      TextBuffer text;
      writeShown(value, text);
      measured += text.text();
    }
    const char* end = message.format(message.values, expected.data());
    const std::string_view wanted(expected.data(), static_cast<std::size_t>(end - expected.data()));
    if (measured == wanted) continue;
    fmt::print(stderr, "measured are\n  {}\nnot\n  {}\n", measured, wanted);
    return false;
  }
  return true;
}

/// Measures the messages round and round; "of_decoding" is the time of it over that of decoding.
template <class Display, class Values>
void measureMessages(benchmark::State& state, std::string_view technology, Display& display,
                     const std::vector<MessageOf<Values>>& messages) {
  Meter meter;
  const auto measure = [&] {
    double sum = 0;
    for (const MessageOf<Values>& message : messages) {
      for (const MeasuredValue& value :
           meter.measurer().measure(technology, message.bytes).values) {
        sum += value.number;
      }
    }
    benchmark::DoNotOptimize(sum);
  };
  timeDecoding(state, messages.size(), measure);
  display.startAfresh();
  const auto decode = [&] {
    for (const MessageOf<Values>& message : messages) display.receive(message.bytes);
  };
  decode();
  state.counters["of_decoding"] = leastNanoseconds(measure) / leastNanoseconds(decode);
}

/// Registers the benchmark "measured mixed drive", once the values have proved right.
template <class Display, class Values, std::size_t kCount>
[[nodiscard]] bool registerMeasured(std::string_view technology, Display& display,
                                    const KindOf<Values> (&kinds)[kCount]) {
  std::vector<MessageOf<Values>> messages = driveOf(kinds);
  if (!areMeasuredRight(technology, messages)) return false;
  const auto run = [technology, &display, messages = std::move(messages)](benchmark::State& state) {
    measureMessages(state, technology, display, messages);
  };
  benchmark::RegisterBenchmark("measured mixed drive", run);
  return true;
}

}  // namespace kestro::benchmarks
