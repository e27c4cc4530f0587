// SPDX-License-Identifier: MIT
// Packets of one technology: its generator shows what a plain reader of the same layouts shows, and
// what is measured stands there, value for value.
#include <algorithm>
#include <optional>
#include <set>
#include <utility>
#include <vector>

#include "Fuzz/GeneratorChannel.h"
#include "Fuzz/PlainReader/PlainReader.h"
#include "Fuzz/Technology.h"
#include "LogGenerator/Measurer.h"
#include "Platform/PropertyListDescription.h"
#include "Tests/Support/DisplayPlaces.h"
#include "Tests/Support/SubscribedCodes.h"

namespace kestro::fuzz {
namespace {

/// What the first byte of a step asks for; every other value is a packet of one of the codes.
constexpr unsigned kRefresh = 0xFF;
constexpr unsigned kWholeMessage = 0xFE;
constexpr std::size_t kMaximumPayload = 2048;

/// A generator and a plain reader that get the same messages.
class Comparison {
 public:
  Comparison() {
    const Bytes contents = propertyListCoding().xml(_reader->displayTemplate()).value();
    for (const char* name : {"LTE", "Ondrel_GSM", "UTRAN", "C2KTemplate"}) {
      _channel.platform().bundle().setResource(fmt::format("{}.plist", name), contents);
    }
    _channel.start();
    _measurer.emplace(MeasurerServices{_channel.platform().bundle(), propertyListCoding()});
    const std::set<LogCode> known(_reader->codes().begin(), _reader->codes().end());
    require(testing::subscribedCodes(_channel.generator()) == known,
            "the plain reader knows the codes that the generator asks for, and no others");
  }

  void takeStep(Input& input) {
    const unsigned choice = input.byte();
    if (choice == kRefresh) return refresh();
    if (choice != kWholeMessage) return receive(packet(choice, input));
    const ByteView message = input.bytes(input.number16() % kMaximumPayload);
    receive({message.begin(), message.end()});
  }

  /// Both make a history entry of what they show, unless nothing came since the last one.
  void refresh() {
    if (!std::exchange(_isChanged, false)) return;
    _channel.refresh();
    _history.push_back({Value(_reader->display()).deepCopy(), _reader->takeCollected()});
    if (_history.size() > kMaximumHistoryEntries) _history.erase(_history.begin());
    const Array history = _channel.state()[kStateHistory].array();
    require(history.size() == _history.size(), "every refresh makes a history entry");
    for (std::size_t i = 0; i < _history.size(); ++i) {
      const Dictionary entry = history[i].dictionary();
      // Before the first message there is nothing but the packets, none.
      if (entry.contains(kStateDisplay)) requireSame(entry[kStateDisplay], _history[i].display);
      require(std::ranges::equal(entry[kStateDisplayState].bytes(), _history[i].collected),
              "a history entry holds the messages that led to it");
    }
  }

 private:
  struct Entry {
    Value display;
    Bytes collected;
  };

  /// A packet of one of the technology's codes with a payload of the input.
  [[nodiscard]] Bytes packet(unsigned choice, Input& input) const {
    const std::uint32_t code = _reader->codes()[choice % _reader->codes().size()];
    const ByteView payload = input.bytes(input.number16() % kMaximumPayload);
    Bytes message(13);
    message[0] = code > 0xFFFF ? 0xFF : 1;
    message[3] = static_cast<std::uint8_t>(code);
    message[4] = static_cast<std::uint8_t>(code >> 8);
    message.insert(message.end(), payload.begin(), payload.end());
    return message;
  }

  void receive(const Bytes& message) {
    _isChanged = true;
    const bool isSurvived = _reader->receive(message);
    require(_channel.receive(message) == isSurvived, "the same messages end the application");
    requireSame(_channel.state()[kStateDisplay], _reader->display());
    const Measured measured = _measurer->measure(kTechnology, message);
    if (isSurvived) requireMeasured(measured);
  }

  void requireMeasured(const Measured& measured) const {
    const testing::Places shown = testing::placesOf(_reader->display());
    for (const MeasuredValue& value : measured.values) {
      const auto place = shown.find(testing::placeOf(value));
      TextBuffer text;
      writeShown(value, text);
      if (place != shown.end() && place->second == text.text()) continue;
      fmt::print(stderr, "{}: measured {}\n", testing::placeOf(value), text.text());
      require(false, "what is measured is what the plain reader shows");
    }
  }

  static void requireSame(const Value& shown, const Value& plain) {
    if (shown == plain) return;
    for (const auto& [name, expected] : plain.dictionary()) {
      const Value& found = shown.dictionary()[name.text()];
      if (found == expected) continue;
      fmt::print(stderr, "{}\n  shown: {}\n  plain: {}\n", describe(name), describe(found),
                 describe(expected));
    }
    require(false, "the generator shows what the plain reader shows");
  }

  GeneratorChannel _channel{kTechnology};
  std::unique_ptr<plain::PlainReader> _reader =
      plain::makePlainReader(kTechnology, propertyListCoding());
  std::optional<Measurer> _measurer;
  std::vector<Entry> _history;
  bool _isChanged = true;
};

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  Comparison comparison;
  while (!input.isAtEnd()) comparison.takeStep(input);
  comparison.refresh();
}

}  // namespace kestro::fuzz
