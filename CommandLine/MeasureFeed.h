// SPDX-License-Identifier: MIT
// What the messages of a command's INPUTs say, as far as it was asked for.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "LogGenerator/Measurer.h"
#include "Measurements/DriveWatch.h"
#include "Measurements/Track.h"

namespace kestro {

/// Which values are wanted.
struct MeasureChoice {
  std::vector<std::string> series;  ///< patterns of `Section/Key`; empty: all
  bool changesOnly = false;         ///< only values that differ from the series' last one
  Track track{};                    ///< empty: a message's own position counts
  bool followsCells = false;        ///< whether cells are wanted, too
};

/// The wanted values of one message.
struct ChosenValues {
  MeasuredMessage message;  ///< with these values only
  std::size_t input = 0;
  std::optional<Coordinates> place{};
  /// Of followed cells: their levels and qualities among these values.
  std::span<const CellValue> cellValues{};
};

/// Measures each input by itself, in the order of the messages' times. What cannot be read is named
/// on standard error, as InputFeed does.
class MeasureFeed {
 public:
  using Sink = std::function<void(const ChosenValues& values)>;
  using Events = std::function<void(const Event& event)>;

  MeasureFeed(InputFeed feed, MeasureChoice choice, const Events& events = {});

  /// Hands on what the next message says, if anything that is wanted; false at the end of all.
  bool takeNext(const Sink& sink);

  [[nodiscard]] ExitStatus status() const noexcept { return _feed.status(); }
  [[nodiscard]] const Measurer& measurer(std::size_t input) const {
    return _drives[input]->measurer;
  }
  [[nodiscard]] const DriveWatch& watch(std::size_t input) const { return _drives[input]->watch; }
  /// What made up the messages so far, in whole or in part; empty: a baseband.
  [[nodiscard]] const std::string& madeUp() const noexcept { return _madeUp; }

 private:
  /// What is known of a series: whether it is wanted, and its last value.
  struct Known {
    bool isLooked = false;
    bool isWanted = false;
    bool isOfLog = false;
    bool hasValue = false;
    double number = 0;
    std::string text{};
  };
  struct Drive {
    Drive(const MeasurerServices& services, const EventSink& sink)
        : measurer(services), watch({}, sink) {}

    Measurer measurer;
    DriveWatch watch;
    std::vector<Known> known{};  ///< by the series' identifiers
  };

  void take(const InputMessage& message, const Sink& sink);
  void choose(Drive& drive, const MeasuredMessage& message);
  [[nodiscard]] bool isChosen(Drive& drive, const MeasuredMessage& message,
                              const MeasuredValue& value) const;
  [[nodiscard]] Known& knownOf(Drive& drive, const Series& series) const;
  [[nodiscard]] static bool isNew(Known& known, const MeasuredValue& value);
  [[nodiscard]] std::optional<Coordinates> placeOf(const InputMessage& message) const;

  InputFeed _feed;
  MeasureChoice _choice;
  std::unique_ptr<OfflineServices> _services;
  std::vector<std::unique_ptr<Drive>> _drives;
  std::vector<MeasuredValue> _chosen;
  std::vector<CellValue> _chosenCells;
  std::string _madeUp;
};

}  // namespace kestro
