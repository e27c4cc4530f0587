// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemSource.h"

#include <fmt/format.h>

#include <chrono>
#include <utility>

#include "Platform/TelephonyService.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

constexpr std::chrono::seconds kModemInterval{1};
/// Changes within this time make one message.
constexpr std::chrono::milliseconds kChangePause{100};

}  // namespace

ModemSource::ModemSource(const ModemServices& services, ModemWish wish, SourceReporter report)
    : _services(services), _wish(std::move(wish)), _faults(std::move(report)) {}

std::string_view ModemSource::technology() const { return kTqLogChannelTechnology_IFX; }

Result<SourceStep> ModemSource::next() {
  if (!_next) return SourceWaits{};
  _message = *std::exchange(_next, std::nullopt);
  return SourceEvent{
      .time = std::nullopt, .technology = technology(), .message = _message, .moment = _moment};
}

void ModemSource::setWatched(bool isWatched, std::function<void()> done) {
  _isWatched = isWatched;
  _done = std::move(done);
  if (isWatched) {
    begin();
  } else {
    end();
  }
}

void ModemSource::begin() {
  if (_follower) return;
  _follower = std::make_unique<ModemFollower>(_services.modems, _services.queue, _wish.modem,
                                              _faults, [this] { changed(); });
  _timer = _services.queue.scheduleRepeating(kModemInterval, [this] {
    _follower->secondPassed();
    compose();
  });
  followPosition();
}

void ModemSource::followPosition() {
  if (!_wish.gps) return;
  _feed =
      _services.positions.follow(*_wish.gps, {.moved =
                                                  [this](const std::optional<PositionFix>& fix) {
                                                    _fix = fix;
                                                    _fixFailure.clear();
                                                  },
                                              .failed =
                                                  [this](std::string_view reason) {
                                                    _fix.reset();
                                                    _fixFailure = shownText(reason);
                                                  }});
}

void ModemSource::end() {
  _feed.reset();
  _timer.reset();
  _fix.reset();
  _fixFailure.clear();
  if (!_follower) {
    if (const auto done = std::exchange(_done, nullptr)) done();
    return;
  }
  if (std::exchange(_isEnding, true)) return;
  _follower->finish([this, alive = std::weak_ptr(_alive)] {
    if (alive.expired()) return;
    _isEnding = false;
    _follower.reset();
    if (_isWatched) return begin();
    if (const auto done = std::exchange(_done, nullptr)) done();
  });
}

void ModemSource::changed() {
  if (_isEnding || std::exchange(_isChangePosted, true)) return;
  _services.queue.postAfter(kChangePause, [this, alive = std::weak_ptr(_alive)] {
    if (alive.expired()) return;
    _isChangePosted = false;
    compose();
  });
}

void ModemSource::compose() {
  if (!_follower || _isEnding) return;
  _moment = _services.clock.now();
  _next = modemMessage(*_follower, position(), _wish.isPersonal, *_moment, _faults)
              .bytes(_services.coding);
  if (_next && _ready) _ready();
}

KnownPosition ModemSource::position() const {
  if (!_wish.gps) {
    const auto& fix = _follower->location().fix;
    return {.fix = fix, .origin = fix ? "the modem" : ""};
  }
  const std::string name = fmt::format("gpsd {}:{}", _wish.gps->host, _wish.gps->port);
  if (!_fixFailure.empty()) return {.fix = {}, .origin = fmt::format("{}: {}", name, _fixFailure)};
  return {.fix = _fix, .origin = _fix ? name : fmt::format("{}: no position yet", name)};
}

}  // namespace kestro
