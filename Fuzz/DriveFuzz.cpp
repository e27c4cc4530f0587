// SPDX-License-Identifier: MIT
// Any rules, and any messages of any technologies at any times, through cells, events and alarms.
#include <memory>
#include <string>
#include <string_view>
#include <utility>

#include "Fuzz/GeneratorChannel.h"
#include "Fuzz/Harness.h"
#include "LogGenerator/Measurer.h"
#include "Measurements/DriveWatch.h"
#include "Platform/TelephonyService.h"

namespace kestro::fuzz {
namespace {

constexpr std::string_view kTechnologies[] = {
    kTqLogChannelTechnology_IFX, kTqLogChannelTechnology_Ondrel_GSM,
    kTqLogChannelTechnology_Ondrel_CDMA, kTqLogChannelTechnology_Ondrel_LTE,
    kTqLogChannelTechnology_Ondrel_UTRAN2};
/// Moves the clock back an hour; other steps move it forward, by tenths of a second.
constexpr std::uint8_t kBackStep = 0xFF;
constexpr std::uint8_t kFromDriveTest = 0x80;

/// The program's templates, which take a while to read.
const Bundle& bundle() {
  static const auto platform = [] {
    auto made = std::make_unique<QuietPlatform>(propertyListCoding());
    testing::addTemplates(*made);
    return made;
  }();
  return platform->bundle();
}

class Drive {
 public:
  explicit Drive(std::vector<Rule> rules)
      : _watch(std::move(rules), [this](const Event& event) { look(event); }) {}

  void take(Input& input) {
    const std::uint8_t choice = input.byte();
    const std::uint8_t step = input.byte();
    _time += step == kBackStep ? std::chrono::milliseconds(-3'600'000)
                               : std::chrono::milliseconds(100 * step);
    const std::string_view technology = kTechnologies[(choice & 0x7F) % std::size(kTechnologies)];
    const MeasuredMessage message{
        .time = _time,
        .number = ++_number,
        .technology = technology,
        .isFromDriveTest = (choice & kFromDriveTest) != 0,
        .measured = _measurer.measure(technology, input.bytes(input.number16() % 4096))};
    _watch.take(message);
    for (const CellValue& value : _watch.cellValues()) {
      require(value.at < message.measured.values.size(), "a cell's value is one of the message's");
      require(value.cell < _watch.cells().all().size(), "a value's cell is in the list");
    }
  }

  void finish() const {
    for (const Cell& cell : _watch.cells().all()) {
      require(!cell.name.isEmpty() && !textOf(cell.name).empty(), "a cell has a name");
      require(cell.firstSeen <= cell.lastSeen, "a cell is seen first before it is seen last");
      require(cell.served.count() >= 0, "a cell serves no negative time");
      lookAt(cell.level);
      lookAt(cell.quality);
      static_cast<void>(cell.band());
    }
  }

 private:
  static void lookAt(const LevelSummary& summary) {
    if (summary.count() == 0) return;
    require(summary.least() <= summary.median() && summary.median() <= summary.greatest(),
            "a median lies between least and greatest");
    require(summary.least() <= summary.last() && summary.last() <= summary.greatest(),
            "the last level lies between least and greatest");
  }

  void look(const Event& event) {
    require(!nameOfEvent(event.kind).empty(), "an event has a kind");
    const EventKind before = std::exchange(_lastKind, event.kind);
    switch (event.kind) {
      case EventKind::Alarm:
        ++_alarms;
        return;
      case EventKind::AlarmOver:
        require(_alarms-- > 0, "what is over has begun");
        return;
      case EventKind::MessagesMissing:
      case EventKind::MessagesBack:
        require(std::exchange(_areMissing, !_areMissing) == (event.kind == EventKind::MessagesBack),
                "messages are missing and back in turn");
        return;
      case EventKind::Handover:
      case EventKind::Reselection:
        // Of another technology it can be called the same.
        if (before == EventKind::Technology) return;
        [[fallthrough]];
      default:
        require(event.from != event.to, "a change is one");
    }
  }

  Measurer _measurer{{bundle(), propertyListCoding()}};
  DriveWatch _watch;
  Moment _time{std::chrono::seconds(1'700'000'000)};
  std::uint64_t _number = 0;
  std::int64_t _alarms = 0;
  bool _areMissing = false;
  EventKind _lastKind = EventKind::State;
};

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  const ByteView text = input.bytes(input.number16() % 512);
  auto rules = parseRules({reinterpret_cast<const char*>(text.data()), text.size()}, "fuzz");
  if (!rules) {
    require(rules.error().message.starts_with("fuzz:"), "a wrong rule is refused with its place");
    rules = std::vector<Rule>();
  }
  Drive drive(*std::move(rules));
  while (!input.isAtEnd()) drive.take(input);
  drive.finish();
}

}  // namespace kestro::fuzz
