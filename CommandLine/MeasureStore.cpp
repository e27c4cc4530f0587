// SPDX-License-Identifier: MIT
#include "CommandLine/MeasureStore.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <utility>

#include "CommandLine/Output.h"
#include "Measurements/Digest.h"
#include "Measurements/Store.h"

namespace kestro {
namespace {

/// What tells an input from others: its file's bytes; where there is no file that stays, its name.
std::string digestOf(const InputOptions& input) {
  const auto files = filesOf(input);
  if (files.size() == 1 && files.front() != "-") {
    if (const auto digest = sha256OfFile(files.front())) return *digest;
  }
  Sha256 digest;
  const std::string& name = input.inputs.front();
  digest.add({reinterpret_cast<const std::uint8_t*>(name.data()), name.size()});
  return digest.finish();
}

ExitStatus fail(const std::string& message) {
  complain(message);
  return kExitNothingDone;
}

/// Adds one input; nothing where it went wrong in a way that leaves the store as it was.
ExitStatus addRecording(const InputOptions& input, const MeasureChoice& choice, Store& store) {
  auto feed = InputFeed::open(input, false);
  if (!feed) return feed.error();
  store.beginRecording();
  MeasureFeed drives(*std::move(feed), choice, [&store](const Event& event) { store.add(event); });
  const auto add = [&store](const ChosenValues& values) {
    store.add(values.message, values.cellValues);
    if (values.place) store.add(values.message.time, *values.place);
  };
  while (drives.takeNext(add)) {
  }
  if (drives.status() == kExitNothingDone) return kExitNothingDone;
  const auto stored = store.finishRecording(
      {.sha256 = digestOf(input), .name = input.inputs.front(), .madeUp = drives.madeUp()},
      drives.measurer(0).series(), drives.watch(0).cells());
  return stored ? drives.status() : fail(stored.error().message);
}

}  // namespace

ExitStatus writeStore(const InputOptions& inputs, const MeasureChoice& choice,
                      const std::string& path) {
  const auto store = Store::open(path);
  if (!store) return fail(store.error().message);
  ExitStatus status = kExitDone;
  for (const std::string& name : inputs.inputs) {
    InputOptions input = inputs;
    input.inputs = {name};
    const ExitStatus added = addRecording(input, choice, **store);
    if (added == kExitNothingDone || added == kExitWrongUsage) return added;
    status = std::max(status, added);
  }
  const auto committed = (*store)->commit();
  return committed ? status : fail(committed.error().message);
}

}  // namespace kestro
