// SPDX-License-Identifier: MIT
#include "CommandLine/DriveFeed.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "CommandLine/Output.h"
#include "Sources/LogSource.h"

namespace kestro {

DriveFeed::DriveFeed(InputFeed feed, const std::vector<Rule>& rules, Sink sink)
    : _feed(std::move(feed)), _services(std::make_unique<OfflineServices>()) {
  const GeneratorServices services = _services->forGenerator();
  const MeasurerServices measuring{services.bundle, services.propertyListCoding};
  for (std::size_t i = 0; i < _feed.inputs().size(); ++i) {
    const auto tell = [sink, i](const Event& event) { sink(i, event); };
    _drives.push_back(std::make_unique<Drive>(measuring, rules, tell));
  }
}

bool DriveFeed::takeNext() {
  return _feed.takeNext([this](const InputMessage& message) -> Result<void> {
    take(message);
    return {};
  });
}

void DriveFeed::take(const InputMessage& message) {
  Drive& drive = *_drives[message.input];
  drive.watch.take({.time = message.time,
                    .number = message.number,
                    .technology = message.technology,
                    .isFromDriveTest = message.madeUp == kMadeUpFromDriveTest,
                    .measured = drive.measurer.measure(message.technology, message.bytes)});
}

std::string_view DriveFeed::nameOf(std::size_t input) const {
  if (_drives.size() == 1) return {};
  return _feed.inputs().nameOf(input);
}

void DriveFeed::tellWhatWasMissed() const {
  const std::vector<Rule>& rules = watchOf(0).alarms().rules();
  for (std::size_t rule = 0; rule < rules.size(); ++rule) {
    const auto hasMet = [&](const auto& drive) { return drive->watch.alarms().hasMet(rule); };
    if (std::ranges::any_of(_drives, hasMet)) continue;
    complain(fmt::format("rule \"{}\": no series of this name{} came up", rules[rule].text,
                         rules[rule].unit.empty() ? "" : " and unit"));
  }
  for (std::size_t i = 0; i < _drives.size(); ++i) {
    const Cells& cells = watchOf(i).cells();
    if (cells.notKeptCount() == 0) continue;
    complain(fmt::format("{}: more than {} cells: the later ones are not listed",
                         _feed.inputs().nameOf(i), Cells::kMaximumCells));
  }
}

}  // namespace kestro
