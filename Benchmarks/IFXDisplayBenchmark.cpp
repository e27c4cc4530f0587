// SPDX-License-Identifier: MIT
// What one IFX message costs from its bytes to the screen: parsing, cleaning, and the tree of nodes
// that is built when the display is refreshed.
#include <benchmark/benchmark.h>
#include <fmt/format.h>

#include <cstdlib>
#include <memory>

#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "Model/KestroModelNode.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro::benchmarks {
namespace {

constexpr std::size_t kCells = 333;
/// The root, the list's section, each cell and its five values.
constexpr std::size_t kNodes = 2 + 6 * kCells;

/// A message whose one list has a header, as the channel's lists have.
Bytes message(const PropertyListCoding& coding) {
  Array cells{"Neighbours"};
  for (std::size_t i = 0; i < kCells; ++i) {
    cells.append(Dictionary{{"ARFCN", fmt::format("{}", 60 + i)},
                            {"BSIC", fmt::format("{}-{}", i % 8, i % 5)},
                            {"RxLev", fmt::format("-{} dBm", 60 + i % 50)},
                            {"C1", fmt::format("{}", i % 40)},
                            {"C2", fmt::format("{}", i % 30)}});
  }
  return coding.binary(Dictionary{{"Neighbours", cells}, {"_sorted", ""}}).value_or(Bytes());
}

std::size_t treeOf(const Value& display) {
  NodesByPath nodes;
  benchmark::DoNotOptimize(KestroModelNode::makeTreeFromObjectWithPathDictionary(display, nodes));
  return nodes.size();
}

void clean(benchmark::State& state, const Value& object) {
  for (auto _ : state) benchmark::DoNotOptimize(GSMLogGenerator::processObject(object));
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(kNodes));
}

void buildTree(benchmark::State& state, const Value& display) {
  for (auto _ : state) benchmark::DoNotOptimize(treeOf(display));
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(kNodes));
}

void messageToTree(benchmark::State& state, const PropertyListCoding& coding, const Bytes& bytes) {
  for (auto _ : state) {
    const auto object = coding.parse(bytes);
    benchmark::DoNotOptimize(treeOf(GSMLogGenerator::processObject(*object)));
  }
  state.SetItemsProcessed(state.iterations());
}

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro;              // NOLINT(google-build-using-namespace)
  using namespace kestro::benchmarks;  // NOLINT(google-build-using-namespace)
  const auto coding = createPropertyListCoding();
  const Bytes bytes = message(*coding);
  const Value object = coding->parse(bytes).value_or(Value());
  const Value display = GSMLogGenerator::processObject(object);
  if (treeOf(display) != kNodes) {
    fmt::print(stderr, "the tree has {} nodes, not {}\n", treeOf(display), kNodes);
    return EXIT_FAILURE;
  }
  benchmark::RegisterBenchmark("clean/2000 nodes", clean, object);
  benchmark::RegisterBenchmark("tree/2000 nodes", buildTree, display);
  benchmark::RegisterBenchmark("message to tree/2000 nodes", [&](benchmark::State& state) {
    messageToTree(state, *coding, bytes);
  });
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return EXIT_SUCCESS;
}
