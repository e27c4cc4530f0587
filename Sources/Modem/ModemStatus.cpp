// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemStatus.h"

#include <fmt/format.h>

#include <string_view>

#include "Sources/Modem/ModemNames.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

ModemStatus statusOfService(const ModemFollower& follower) {
  switch (follower.serviceState()) {
    case ModemServiceState::Connecting:
      return {"connecting to the system bus", ""};
    case ModemServiceState::NoBus:
      return {fmt::format("no system bus: {}", shownText(follower.reason())),
              "the D-Bus system bus must run"};
    case ModemServiceState::Absent:
      return {"ModemManager is not running", "systemctl start ModemManager"};
    case ModemServiceState::Present:
      break;
  }
  const auto& error = follower.objectsError();
  if (!error) return {"waiting for ModemManager's answer", ""};
  if (isPermissionError(*error)) {
    return {"no permission to ask ModemManager", "the bus's policy must allow this user"};
  }
  if (error->name == kBusErrorNoReply) {
    return {"ModemManager does not answer", "systemctl restart ModemManager"};
  }
  return {fmt::format("ModemManager refuses: {}", shownText(error->message)), ""};
}

ModemStatus statusWithoutModem(const ModemFollower& follower) {
  if (follower.hasChosen()) return {"the modem has gone", "it is followed when it comes back"};
  if (follower.objects().modems().empty()) return {"no modem", "mmcli -L lists modems"};
  return {"no such modem", "kestro-telephonyd --list-modems"};
}

}  // namespace

ModemStatus statusOf(const ModemFollower& follower) {
  if (!follower.knowsObjects()) return statusOfService(follower);
  if (follower.path().empty()) return statusWithoutModem(follower);
  const BusFields modem = follower.objects().fields(follower.path(), kModemInterface);
  const auto state = modem.integer("State");
  if (!state) return {"the modem does not tell its state", ""};
  const unsigned number = modemNumber(follower.path());
  if (*state == kModemFailed) {
    return {
        fmt::format("failed: {}", failedReasonText(modem.number("StateFailedReason").value_or(0))),
        fmt::format("mmcli -m {} tells more", number)};
  }
  if (*state == kModemLocked) {
    const auto sim = modem.path("Sim");
    return {fmt::format("locked: {}", lockText(modem.number("UnlockRequired").value_or(0))),
            sim ? fmt::format("mmcli -i {} --pin=PIN", modemNumber(*sim)) : ""};
  }
  if (*state == kModemDisabled) return {"disabled", fmt::format("mmcli -m {} --enable", number)};
  const auto text = modemStateText(*state);
  return {text.empty() ? fmt::format("unknown ({})", *state) : std::string(text), ""};
}

namespace {

std::string whyOf(const BusError& error) {
  if (isPermissionError(error)) return "no permission";
  if (isUnsupportedError(error)) return "the modem does not report it";
  if (error.name == kBusErrorNoReply) return "no answer";
  return shownText(error.message);
}

class Missing {
 public:
  void add(std::string_view what, std::string_view why) {
    if (!_text.empty()) _text += "; ";
    _text += fmt::format("{}: {}", what, why);
  }
  [[nodiscard]] std::string take() { return std::move(_text); }

 private:
  std::string _text;
};

}  // namespace

std::string notReported(const ModemFollower& follower) {
  Missing missing;
  const auto& objects = follower.objects();
  if (follower.path().empty() || !isEnabled(objects, follower.path())) return missing.take();
  if (!objects.has(follower.path(), kSignalInterface)) {
    missing.add("signal", "the modem does not report it");
  } else if (const auto* error = follower.rateError()) {
    missing.add("signal", whyOf(*error));
  }
  if (!follower.canTellCells()) {
    missing.add("cells",
                fmt::format("ModemManager {} does not report them, 1.20 does", follower.version()));
  } else if (const auto& error = follower.cellCall().error()) {
    missing.add("cells", whyOf(*error));
  }
  if (!objects.has(follower.path(), kLocationInterface)) {
    missing.add("location", "the modem does not report it");
  } else if (const auto& error = follower.locationCall().error()) {
    missing.add("location", whyOf(*error));
  }
  return missing.take();
}

}  // namespace kestro
