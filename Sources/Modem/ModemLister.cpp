// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemLister.h"

#include <fmt/format.h>

#include <utility>

#include "Sources/Modem/ModemNames.h"
#include "Sources/Modem/ModemSections.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {

ModemLister::ModemLister(ModemService& service, MainQueue& queue,
                         std::function<void(const Result<const ModemObjects*>& objects)> done)
    : _done(std::move(done)),
      _connection(service.connect(
          {.stateChanged = [this](ModemServiceState state,
                                  std::string_view reason) { changeState(state, reason); },
           .signalled = [](const BusSignal&) {}})) {
  queue.postAfter(kPatience, [this, alive = std::weak_ptr(_alive)] {
    if (alive.expired()) return;
    const bool isPresent = _state == ModemServiceState::Present;
    end(failure(isPresent ? "ModemManager does not answer" : "the system bus does not answer"));
  });
}

void ModemLister::changeState(ModemServiceState state, std::string_view reason) {
  _state = state;
  if (state == ModemServiceState::NoBus)
    return end(failure(fmt::format("no system bus: {}", reason)));
  if (state == ModemServiceState::Absent) return end(failure("ModemManager is not running"));
  const BusCall objects{.path = std::string(kModemManagerPath),
                        .interface = std::string(kObjectManagerInterface),
                        .method = "GetManagedObjects"};
  _connection->call(objects, kPatience, [this](const BusReply& reply) {
    if (!reply) return end(failure(fmt::format("ModemManager refuses: {}", reply.error().message)));
    _objects.setManaged(*reply);
    end(&_objects);
  });
}

void ModemLister::end(const Result<const ModemObjects*>& objects) {
  if (const auto done = std::exchange(_done, nullptr)) done(objects);
}

std::string modemListText(const ModemObjects& objects, bool isPersonal) {
  std::string text;
  for (const std::string& path : objects.modems()) {
    const BusFields modem = objects.fields(path, kModemInterface);
    const auto equipment = modem.text("EquipmentIdentifier").value_or("");
    text += fmt::format("{}  {}  {}  {}  {}\n", modemNumber(path), modelText(objects, path),
                        modemStateText(modem.integer("State").value_or(0)),
                        isPersonal ? equipment : maskedText(equipment), path);
  }
  return text;
}

}  // namespace kestro
