// SPDX-License-Identifier: MIT
// Recorded messages at any times, replayed as one of the technologies, and the snapshot that is
// saved then.
#include "Fuzz/SavedSnapshot.h"
#include "Model/Replay.h"

namespace kestro::fuzz {
namespace {

/// A recording that is replayed to its end.
class Recording {
 public:
  Recording(std::string_view technology, std::chrono::microseconds interval)
      : _channel(technology), _technology(technology), _options{.refreshInterval = interval} {
    _channel.addTemplates();
    require(_replay.begin(technology), "every technology has a generator");
  }

  /// Feeds the input's messages, each up to 13 s after or before the one before.
  void replay(Input& input) {
    while (!input.isAtEnd()) {
      const auto step = static_cast<std::int8_t>(input.byte());
      _time += std::chrono::milliseconds(100) * step;
      const ByteView message = input.bytes(input.number16() % 2048);
      // A message that would end the application is an error; the next can be fed all the same.
      static_cast<void>(_replay.feed(
          {.number = ++_number, .time = _time, .technology = _technology, .bytes = message}));
      static_cast<void>(_channel.platform().systemLog().take());
    }
    _replay.finish();
  }

  /// Saves the last displays; their log is that of the history.
  void save() {
    const Array contents = _replay.generator()->getSaveContentsFromState(_replay.state());
    const Dictionary snapshot = checkSaving(_clock, contents, "drive");
    const Value log = dlfOfSnapshot(snapshot);
    if (log.isNull()) return;
    require(reframedDlf(log.bytes(), snapshot[kSnapshotData].array()).has_value(),
            "a snapshot's log is its history's");
  }

 private:
  void didRefresh(const ReplayRefresh& refresh) {
    require(refresh.message <= _number && refresh.message > _refreshed,
            "a refresh shows messages that no refresh before it has shown");
    _refreshed = refresh.message;
  }

  GeneratorChannel _channel;
  std::string_view _technology;
  ReplayOptions _options;
  ReplayClock _clock{_channel.platform().clock()};
  Replay _replay{[this](std::string_view technology) {
                   return LogGenerator::generatorFromTechnology(
                       generatorServices(_channel.platform()), technology);
                 },
                 _clock, _options, [this](const ReplayRefresh& refresh) { didRefresh(refresh); }};
  Moment _time{std::chrono::seconds(1'330'862'709)};
  std::uint64_t _number = 0;
  std::uint64_t _refreshed = 0;
};

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  const auto technologies = LogGenerator::technologies();
  const unsigned choice = input.byte();
  Recording recording(technologies[choice % technologies.size()],
                      choice < 128 ? kDisplayUpdateInterval : std::chrono::seconds(0));
  recording.replay(input);
  recording.save();
}

}  // namespace kestro::fuzz
