// SPDX-License-Identifier: MIT
// Property lists of a live channel: parsed and converted, and written.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {
namespace {

enum class Form { Xml, Binary };

/// A message of about 200 bytes in XML: an element of three values.
Value smallMessage() {
  return Dictionary{
      {"State", "Cell DCH"}, {"RSCP", Value::integer(-87)}, {"Band", Value::integer(1)}};
}

/// A display of 2,000 nodes.
Value largeMessage() {
  Array rows;
  for (int row = 0; row < 153; ++row) {
    rows.append(Dictionary{{"ARFCN", Value::integer(512 + row)},
                           {"Scrambling Code", Value::integer(3 * row)},
                           {"RSCP", Value::integer(-60 - row)},
                           {"EcNo", "-7.5 dB"},
                           {"Cell Type", "Neighbor"},
                           {"Ranked", Value::boolean(row % 2 == 0)}});
  }
  return Dictionary{{"UMTS Neighbor Cell Set", rows},
                    {"Active Set", Value::integer(1)},
                    {"Monitored Set", Value::integer(2)},
                    {"State", Array{"Cell DCH", "RRC"}}};
}

std::size_t nodeCount(const Value& value) {
  std::size_t count = 1;
  for (const Value& element : value.array()) count += nodeCount(element);
  for (const auto& [key, content] : value.dictionary()) count += 1 + nodeCount(content);
  return count;
}

Bytes written(const PropertyListCoding& coding, const Value& value, Form form) {
  const std::optional<Bytes> bytes = form == Form::Xml ? coding.xml(value) : coding.binary(value);
  return bytes.value_or(Bytes());
}

/// Nothing is timed that does not do what it should.
void requireRoundTrip(const PropertyListCoding& coding, const Value& value, const Bytes& bytes) {
  const Result<Value> read = coding.parse(bytes);
  if (read.has_value() && *read == value) return;
  std::fputs("a property list is not read back as it was written\n", stderr);
  std::exit(EXIT_FAILURE);
}

void setCounts(benchmark::State& state, const Value& value, std::size_t bytes) {
  const auto messages = static_cast<std::int64_t>(state.iterations());
  state.SetItemsProcessed(messages);
  state.SetBytesProcessed(messages * static_cast<std::int64_t>(bytes));
  state.counters["nodes"] = static_cast<double>(nodeCount(value));
  state.counters["bytes"] = static_cast<double>(bytes);
}

void parse(benchmark::State& state, Value (*message)(), Form form) {
  const std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  const Value value = message();
  const Bytes bytes = written(*coding, value, form);
  requireRoundTrip(*coding, value, bytes);
  for (auto _ : state) benchmark::DoNotOptimize(coding->parse(bytes));
  setCounts(state, value, bytes.size());
}

void write(benchmark::State& state, Value (*message)(), Form form) {
  const std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  const Value value = message();
  const Bytes bytes = written(*coding, value, form);
  requireRoundTrip(*coding, value, bytes);
  for (auto _ : state) benchmark::DoNotOptimize(written(*coding, value, form));
  setCounts(state, value, bytes.size());
}

BENCHMARK_CAPTURE(parse, small_xml, smallMessage, Form::Xml);
BENCHMARK_CAPTURE(parse, small_binary, smallMessage, Form::Binary);
BENCHMARK_CAPTURE(parse, large_xml, largeMessage, Form::Xml);
BENCHMARK_CAPTURE(parse, large_binary, largeMessage, Form::Binary);
BENCHMARK_CAPTURE(write, small_xml, smallMessage, Form::Xml);
BENCHMARK_CAPTURE(write, small_binary, smallMessage, Form::Binary);
BENCHMARK_CAPTURE(write, large_xml, largeMessage, Form::Xml);
BENCHMARK_CAPTURE(write, large_binary, largeMessage, Form::Binary);

}  // namespace
}  // namespace kestro

BENCHMARK_MAIN();
