// SPDX-License-Identifier: MIT
#include "CommandLine/MeasureFeed.h"

#include <fnmatch.h>

#include <algorithm>
#include <utility>

#include "Measurements/DriveTestSeries.h"
#include "Recordings/PositionComment.h"
#include "Sources/LogSource.h"

namespace kestro {

MeasureFeed::MeasureFeed(InputFeed feed, MeasureChoice choice, const Events& events)
    : _feed(std::move(feed)),
      _choice(std::move(choice)),
      _services(std::make_unique<OfflineServices>()) {
  const GeneratorServices services = _services->forGenerator();
  const MeasurerServices measuring{services.bundle, services.propertyListCoding};
  const EventSink tell = [events](const Event& event) {
    if (events) events(event);
  };
  for (std::size_t i = 0; i < _feed.inputs().size(); ++i) {
    _drives.push_back(std::make_unique<Drive>(measuring, tell));
  }
}

bool MeasureFeed::takeNext(const Sink& sink) {
  return _feed.takeNext([&](const InputMessage& message) -> Result<void> {
    take(message, sink);
    return {};
  });
}

void MeasureFeed::take(const InputMessage& message, const Sink& sink) {
  Drive& drive = *_drives[message.input];
  if (!message.madeUp.empty()) _madeUp = message.madeUp;
  MeasuredMessage measured{.time = message.time,
                           .number = message.number,
                           .technology = message.technology,
                           .isFromDriveTest = message.madeUp == kMadeUpFromDriveTest,
                           .measured = drive.measurer.measure(message.technology, message.bytes)};
  if (_choice.followsCells) drive.watch.take(measured);
  choose(drive, measured);
  measured.measured.values = _chosen;
  sink({.message = measured,
        .input = message.input,
        .place = placeOf(message),
        .cellValues = _chosenCells});
}

void MeasureFeed::choose(Drive& drive, const MeasuredMessage& message) {
  const std::span<const MeasuredValue> all = message.measured.values;
  const std::span<const CellValue> cells =
      _choice.followsCells ? drive.watch.cellValues() : std::span<const CellValue>();
  _chosen.clear();
  _chosenCells.clear();
  for (std::size_t i = 0; i < all.size(); ++i) {
    if (!isChosen(drive, message, all[i])) continue;
    const auto cell = std::ranges::find(cells, i, &CellValue::at);
    if (cell != cells.end()) {
      _chosenCells.push_back(*cell);
      _chosenCells.back().at = _chosen.size();
    }
    _chosen.push_back(all[i]);
  }
}

bool MeasureFeed::isChosen(Drive& drive, const MeasuredMessage& message,
                           const MeasuredValue& value) const {
  Known& known = knownOf(drive, *value.series);
  if (!known.isWanted || (message.isFromDriveTest && !known.isOfLog)) return false;
  return !_choice.changesOnly || isNew(known, value);
}

MeasureFeed::Known& MeasureFeed::knownOf(Drive& drive, const Series& series) const {
  if (series.id >= drive.known.size()) drive.known.resize(series.id + 1);
  Known& known = drive.known[series.id];
  if (known.isLooked) return known;
  const std::string name = series.group->name();
  known.isLooked = true;
  known.isOfLog = isOfDriveTestLog(*series.group);
  known.isWanted = _choice.series.empty() ||
                   std::ranges::any_of(_choice.series, [&](const std::string& pattern) {
                     return fnmatch(pattern.c_str(), name.c_str(), 0) == 0;
                   });
  return known;
}

bool MeasureFeed::isNew(Known& known, const MeasuredValue& value) {
  const bool isText = !value.hasNumber();
  const bool isSame =
      known.hasValue && (isText ? known.text == value.text : known.number == value.number);
  if (isSame) return false;
  known.hasValue = true;
  known.number = value.number;
  if (isText) known.text = value.text;
  return true;
}

std::optional<Coordinates> MeasureFeed::placeOf(const InputMessage& message) const {
  if (!_choice.track.fixes().empty()) return _choice.track.at(message.time);
  const auto position = positionAmong(message.comments);
  if (!position) return std::nullopt;
  return Coordinates{.latitude = position->latitude, .longitude = position->longitude};
}

}  // namespace kestro
