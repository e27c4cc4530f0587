// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/EventSession.h"

#include <utility>

#include "CommandLine/Formats/CellRows.h"
#include "CommandLine/Formats/RowWriter.h"
#include "Platform/Bundle.h"
#include "Platform/Clock.h"
#include "Platform/TelephonyProtocol.h"
#include "Sources/LogSource.h"
#include "Sources/SourceCatalogue.h"

namespace kestro {
namespace {

constexpr std::chrono::seconds kMissingCheckInterval{1};

}  // namespace

EventSession::EventSession(Platform& platform, std::vector<Rule> rules,
                           std::optional<std::uint64_t> limit, std::function<void()> ended)
    : _platform(platform),
      _limit(limit),
      _ended(std::move(ended)),
      _measurer({platform.bundle(), platform.propertyListCoding()}),
      _watch(std::move(rules), [this](const Event& event) { write(event); }),
      _client(platform, *this, ChannelWatch::ByClient) {}

void EventSession::start() {
  _timer = _platform.mainQueue().scheduleRepeating(
      kMissingCheckInterval, [this] { _watch.passTime(_platform.clock().now()); });
  _client.start();
}

void EventSession::sourceTold(const LogSourceState& source) {
  _isFromDriveTest = source.kind == kMadeUpFromDriveTest;
}

void EventSession::technologyAnswered(std::string_view technology) {
  _technology = technologyNamed(technology);
}

/// Without lists of codes everything is streamed.
std::optional<Dictionary> EventSession::startCommand() {
  if (_isOver) return std::nullopt;
  return Dictionary{{kTelephonySetState, kTelephonyStreaming}};
}

void EventSession::messageArrived(ByteView message) {
  if (_isOver) return;
  _watch.take({.time = _platform.clock().now(),
               .number = ++_messages,
               .technology = _technology,
               .isFromDriveTest = _isFromDriveTest,
               .measured = _measurer.measure(_technology, message)});
}

void EventSession::write(const Event& event) {
  if (_isOver) return;
  _output.write(jsonLineOf(eventColumns(), fieldsOfEvent(event, {})));
  _output.flush();
  ++_events;
  if (_output.failureMessage().empty() && _events != _limit) return;
  _isOver = true;
  _ended();
}

}  // namespace kestro
