// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemFollower.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Sources/Modem/ModemNames.h"

namespace kestro {
namespace {

constexpr std::string_view kCellInfoType = "aa{sv}";
constexpr std::size_t kMaximumCells = 128;

/// Whether the text is a version like "1.18.2", of 1.20 or later. Of what is no version, nothing is
/// known; the call itself will tell.
bool isBefore120(std::string_view version) {
  constexpr std::uint64_t kFirst = 20;
  constexpr int kDecimal = 10;
  if (!version.starts_with("1.")) return false;
  const std::string_view rest = version.substr(2);
  const auto minor = numberIn(rest.substr(0, rest.find('.')), kDecimal);
  return minor && *minor < kFirst;
}

}  // namespace

ModemFollower::ModemFollower(ModemService& service, MainQueue& queue, ModemName name,
                             BusFaults& faults, std::function<void()> changed)
    : _queue(queue),
      _faults(faults),
      _changed(std::move(changed)),
      _objects(faults),
      _choice(std::move(name)),
      _connection(service.connect(
          {.stateChanged = [this](ModemServiceState state,
                                  std::string_view reason) { changeState(state, reason); },
           .signalled = [this](const BusSignal& signal) { receive(signal); }})) {}

ModemFollower::~ModemFollower() = default;

void ModemFollower::call(const BusCall& call, std::function<void(const BusReply& reply)> answered) {
  _connection->call(
      call, kDeadline,
      [round = std::weak_ptr(_round), answered = std::move(answered)](const BusReply& reply) {
        if (!round.expired()) answered(reply);
      });
}

void ModemFollower::changeState(ModemServiceState state, std::string_view reason) {
  _state = state;
  _reason = reason;
  _round = std::make_shared<bool>(true);
  _rates.clear();
  _objects.clear();
  _knowsObjects = false;
  _isAskingForObjects = false;
  _objectsError.reset();
  _version.clear();
  forgetModem();
  if (state == ModemServiceState::Present && !_isFinishing) {
    askForVersion();
    askForObjects();
  }
  _changed();
}

void ModemFollower::askForVersion() {
  const BusCall version{.path = std::string(kModemManagerPath),
                        .interface = std::string(kPropertiesInterface),
                        .method = "Get",
                        .arguments = {busText(std::string(kManagerInterface)), busText("Version")}};
  call(version, [this](const BusReply& reply) {
    if (!reply || reply->empty()) return;
    const BusFields fields({{"Version", reply->front()}}, "ModemManager1", _faults);
    _version = fields.text("Version").value_or("");
  });
}

void ModemFollower::askForObjects() {
  _isAskingForObjects = true;
  const BusCall objects{.path = std::string(kModemManagerPath),
                        .interface = std::string(kObjectManagerInterface),
                        .method = "GetManagedObjects"};
  call(objects, [this](const BusReply& reply) {
    _isAskingForObjects = false;
    _objectsError = reply ? std::nullopt : std::optional(reply.error());
    if (reply) {
      _knowsObjects = true;
      _objects.setManaged(*reply);
      look();
    }
    _changed();
  });
}

void ModemFollower::receive(const BusSignal& signal) {
  // What is signalled before the objects are known is in the answer already.
  if (!_knowsObjects || !_objects.apply(signal)) return;
  if (signal.member == "InterfacesRemoved") {
    std::erase_if(_rates,
                  [this](const auto& rate) { return !_objects.has(rate.first, kSignalInterface); });
  }
  look();
  _changed();
}

void ModemFollower::look() {
  if (_isFinishing) return;
  const std::string path = _choice.path(_objects);
  if (path != _path) {
    if (const auto left = _rates.find(_path); left != _rates.end()) left->second->release({});
    forgetModem();
    _path = path;
  }
  if (_path.empty()) return;
  followParts();
  lookAtState();
}

void ModemFollower::forgetModem() {
  for (const std::string& part : _parts) _objects.forget(part);
  _parts.clear();
  _path.clear();
  _isEnabled = false;
  _location = {};
  _cells.reset();
  _locationCall.reset();
  _cellCall.reset();
}

void ModemFollower::lookAtState() {
  const bool isNow = isModemEnabled() && _objects.has(_path, kSignalInterface);
  if (!isModemEnabled()) {
    _location = {};
    _cells.reset();
  }
  if (isNow == std::exchange(_isEnabled, isNow) || !isNow) return;
  _locationCall.reset();
  _cellCall.reset();
  rate().hold();
}

SignalRate& ModemFollower::rate() {
  auto& rate = _rates[_path];
  if (!rate) {
    rate = std::make_unique<SignalRate>(
        _path,
        [this, path = _path](const BusCall& wanted,
                             std::function<void(const BusReply& reply)> answered) {
          call(wanted, [this, path, answered = std::move(answered)](const BusReply& reply) {
            if (_rates.contains(path)) answered(reply);
          });
        },
        _faults);
  }
  return *rate;
}

// The object manager names modems alone: their SIM and bearers are asked for one by one.
void ModemFollower::followParts() {
  const BusFields modem = _objects.fields(_path, kModemInterface);
  std::vector<std::string> parts = modem.texts("Bearers", "ao");
  const auto sim = modem.path("Sim");
  if (sim) parts.push_back(*sim);
  std::erase_if(_parts, [&](const std::string& part) {
    if (std::ranges::find(parts, part) != parts.end()) return false;
    _objects.forget(part);
    return true;
  });
  for (const std::string& part : parts) {
    if (std::ranges::find(_parts, part) != _parts.end()) continue;
    _parts.push_back(part);
    askForProperties(part, sim == part ? kSimInterface : kBearerInterface);
  }
}

void ModemFollower::askForProperties(const std::string& path, std::string_view interface) {
  const BusCall all{.path = path,
                    .interface = std::string(kPropertiesInterface),
                    .method = "GetAll",
                    .arguments = {busText(std::string(interface))}};
  call(all, [this, path, interface](const BusReply& reply) {
    if (std::ranges::find(_parts, path) == _parts.end()) return;
    if (reply) {
      _objects.setProperties(path, interface, *reply);
    } else {
      std::erase(_parts, path);  // to be asked for again
    }
    _changed();
  });
}

void ModemFollower::secondPassed() {
  if (_isFinishing || _state != ModemServiceState::Present) return;
  if (!_knowsObjects) {
    if (!_isAskingForObjects) askForObjects();
    return;
  }
  if (_path.empty()) return;
  followParts();
  if (!isModemEnabled()) return;
  if (_objects.has(_path, kLocationInterface) && _locationCall.isDue()) askForLocation();
  if (canTellCells() && _cellCall.isDue()) askForCells();
}

void ModemFollower::askForLocation() {
  const BusCall location{
      .path = _path, .interface = std::string(kLocationInterface), .method = "GetLocation"};
  call(location, [this, path = _path](const BusReply& reply) {
    if (path != _path) return;
    _locationCall.answered(reply);
    _location = reply && isModemEnabled() ? locationIn(*reply, _faults) : ModemLocation();
  });
}

void ModemFollower::askForCells() {
  const BusCall cells{
      .path = _path, .interface = std::string(kModemInterface), .method = "GetCellInfo"};
  call(cells, [this, path = _path](const BusReply& reply) {
    if (path == _path) takeCells(reply);
  });
}

void ModemFollower::takeCells(const BusReply& reply) {
  constexpr std::string_view kName = "Modem GetCellInfo";
  _cellCall.answered(reply);
  _cells.reset();
  if (!reply || !isModemEnabled()) return;
  const auto* list =
      reply->empty() ? nullptr : std::get_if<BusValue::Elements>(&reply->front().content);
  if (list == nullptr || reply->front().signature != kCellInfoType) {
    const std::string found = reply->empty() ? "" : reply->front().signature;
    return _faults.wrongType(kName, kCellInfoType, found);
  }
  if (list->size() > kMaximumCells) _faults.senseless(kName, fmt::format("{} cells", list->size()));
  _cells.emplace();
  for (const BusValue& cell : *list) {
    if (_cells->size() == kMaximumCells) break;
    _cells->push_back(propertiesIn(cell, kName, _faults));
  }
}

bool ModemFollower::canTellCells() const noexcept { return !isBefore120(_version); }

const BusError* ModemFollower::rateError() const {
  const auto rate = _rates.find(_path);
  if (rate == _rates.end() || !rate->second->error()) return nullptr;
  return &*rate->second->error();
}

void ModemFollower::finish(std::function<void()> done) {
  _isFinishing = true;
  const auto left = std::make_shared<std::size_t>(_rates.size());
  if (*left == 0) return _queue.post(std::move(done));
  for (const auto& [path, rate] : _rates) {
    rate->release([this, left, done] {
      if (--*left == 0) _queue.post(done);
    });
  }
}

}  // namespace kestro
