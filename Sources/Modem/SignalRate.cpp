// SPDX-License-Identifier: MIT
#include "Sources/Modem/SignalRate.h"

#include <utility>

#include "Sources/Modem/BusFields.h"
#include "Sources/Modem/ModemObjects.h"

namespace kestro {
namespace {

constexpr std::uint32_t kRate = 1;  // a second
constexpr std::string_view kRateName = "Rate";

}  // namespace

SignalRate::SignalRate(std::string path, Call call, BusFaults& faults)
    : _path(std::move(path)), _call(std::move(call)), _faults(faults) {}

void SignalRate::hold() {
  _wish = Wish::Hold;
  _done = nullptr;
  next();
}

void SignalRate::release(std::function<void()> done) {
  _done = std::move(done);
  _wish = Wish::Release;
  next();
}

void SignalRate::next() {
  if (_isBusy || _wish == Wish::None) return;
  if (std::exchange(_wish, Wish::None) == Wish::Hold) {
    _isBusy = true;
    read([this](std::optional<std::uint64_t> rate) { raise(rate); });
    return;
  }
  if (_former) {
    _isBusy = true;
    read([this](std::optional<std::uint64_t> rate) { giveBack(rate); });
    return;
  }
  if (const auto done = std::exchange(_done, nullptr)) done();
}

void SignalRate::read(std::function<void(std::optional<std::uint64_t>)> then) {
  const BusCall call{
      .path = _path,
      .interface = std::string(kPropertiesInterface),
      .method = "Get",
      .arguments = {busText(std::string(kSignalInterface)), busText(std::string(kRateName))}};
  _call(call, [this, then = std::move(then)](const BusReply& reply) {
    _isBusy = false;
    _error = reply ? std::nullopt : std::optional(reply.error());
    if (!reply || reply->empty()) return then(std::nullopt);
    const BusFields fields({{std::string(kRateName), reply->front()}}, "Modem.Signal", _faults);
    then(fields.number(kRateName));
  });
}

void SignalRate::setUp(std::uint32_t rate, std::function<void(bool isDone)> then) {
  _isBusy = true;
  const BusCall call{.path = _path,
                     .interface = std::string(kSignalInterface),
                     .method = "Setup",
                     .arguments = {busUnsigned(rate)}};
  _call(call, [this, then = std::move(then)](const BusReply& reply) {
    _isBusy = false;
    _error = reply ? std::nullopt : std::optional(reply.error());
    then(reply.has_value());
  });
}

void SignalRate::raise(std::optional<std::uint64_t> rate) {
  if (!rate || *rate == kRate) return next();
  setUp(kRate, [this, former = static_cast<std::uint32_t>(*rate)](bool isDone) {
    if (isDone) _former = former;
    next();
  });
}

// Somebody else's rate stays; without an answer nothing is changed either.
void SignalRate::giveBack(std::optional<std::uint64_t> rate) {
  const auto former = std::exchange(_former, std::nullopt);
  const auto finish = [this](bool) {
    if (_wish == Wish::None) _wish = Wish::Release;  // which has nothing left to do
    next();
  };
  if (!former || rate != kRate) return finish(false);
  setUp(*former, finish);
}

}  // namespace kestro
