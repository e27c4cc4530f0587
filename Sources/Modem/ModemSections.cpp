// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemSections.h"

#include <fmt/format.h>

#include <string_view>

#include "Sources/Modem/ModemCells.h"
#include "Sources/Modem/ModemNames.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

void set(Dictionary& section, std::string_view name, const std::optional<std::string>& text) {
  if (text && !text->empty()) section.set(name, *text);
}

void setPersonal(Dictionary& section, std::string_view name, const std::optional<std::string>& text,
                 bool isPersonal) {
  if (text && !text->empty()) section.set(name, isPersonal ? *text : maskedText(*text));
}

/// What a number means; the number itself where it means nothing.
template <class Text, class Number>
void setMeaning(Dictionary& section, std::string_view name, const std::optional<Number>& number,
                Text text) {
  if (!number) return;
  const std::string meaning(text(*number));
  section.set(name, meaning.empty() ? fmt::format("unknown ({})", *number) : meaning);
}

void addSignalQuality(const BusFields& modem, Dictionary& mode) {
  constexpr std::uint64_t kWhole = 100;
  const auto pair = modem.elements("SignalQuality", "(ub)");
  if (pair.size() != 2) return;
  const auto* percent = std::get_if<std::uint64_t>(&pair[0].content);
  const auto* isRecent = std::get_if<bool>(&pair[1].content);
  if (percent == nullptr || isRecent == nullptr || *percent > kWhole) return;
  mode.set("Signal Quality", fmt::format("{} %{}", *percent, *isRecent ? "" : ", not recent"));
}

}  // namespace

std::string modelText(const ModemObjects& objects, const std::string& path) {
  const BusFields modem = objects.fields(path, kModemInterface);
  const auto maker = modem.text("Manufacturer").value_or("");
  const auto model = modem.text("Model").value_or("");
  const std::string_view space = maker.empty() || model.empty() ? "" : " ";
  return fmt::format("{}{}{}", maker, space, model);
}

std::vector<std::string> otherModems(const ModemFollower& follower) {
  std::vector<std::string> result;
  for (const std::string& path : follower.objects().modems()) {
    if (path == follower.path()) continue;
    const BusFields modem = follower.objects().fields(path, kModemInterface);
    result.push_back(fmt::format("{}: {}, {}", modemNumber(path),
                                 modelText(follower.objects(), path),
                                 modemStateText(modem.integer("State").value_or(0))));
  }
  return result;
}

void addModem(const ModemFollower& follower, bool isPersonal, Dictionary& mode) {
  const BusFields modem = follower.objects().fields(follower.path(), kModemInterface);
  mode.set("Modem", fmt::format("{}: {}", modemNumber(follower.path()),
                                modelText(follower.objects(), follower.path())));
  set(mode, "Revision", modem.text("Revision"));
  setPersonal(mode, "Equipment Identifier", modem.text("EquipmentIdentifier"), isPersonal);
  const auto access = modem.number("AccessTechnologies");
  if (access) set(mode, "Network Mode", accessText(*access));
  addSignalQuality(modem, mode);
}

void addRegistration(const ModemFollower& follower, Dictionary& registration) {
  const auto& objects = follower.objects();
  const BusFields gpp = objects.fields(follower.path(), kModem3gppInterface);
  setMeaning(registration, "State", gpp.number("RegistrationState"), registrationText);
  set(registration, "Operator", gpp.text("OperatorName"));
  const auto code = gpp.text("OperatorCode");
  set(registration, "Operator Code", code);
  if (code) addNetwork(*code, registration);
  setMeaning(registration, "Packet Service", gpp.number("PacketServiceState"), packetServiceText);
  const BusFields cdma = objects.fields(follower.path(), kModemCdmaInterface);
  setMeaning(registration, "1x State", cdma.number("Cdma1xRegistrationState"),
             cdmaRegistrationText);
  setMeaning(registration, "EV-DO State", cdma.number("EvdoRegistrationState"),
             cdmaRegistrationText);
  // The interface has 99999 for identities that are not known.
  constexpr std::uint64_t kUnknown = 99'999;
  const auto sid = cdma.number("Sid");
  const auto nid = cdma.number("Nid");
  if (sid && *sid != kUnknown) registration.set("SID", fmt::format("{}", *sid));
  if (nid && *nid != kUnknown) registration.set("NID", fmt::format("{}", *nid));
}

void addSim(const ModemFollower& follower, bool isPersonal, Dictionary& sim) {
  const auto& objects = follower.objects();
  const BusFields modem = objects.fields(follower.path(), kModemInterface);
  setMeaning(sim, "Lock", modem.number("UnlockRequired"), lockText);
  const BusFields card = objects.fields(modem.path("Sim").value_or(""), kSimInterface);
  if (const auto isActive = card.flag("Active")) sim.set("Active", *isActive ? "yes" : "no");
  setMeaning(sim, "Type", card.number("SimType"), simTypeText);
  setPersonal(sim, "ICCID", card.text("SimIdentifier"), isPersonal);
  setPersonal(sim, "IMSI", card.text("Imsi"), isPersonal);
  setPersonal(sim, "EID", card.text("Eid"), isPersonal);
  set(sim, "Operator", card.text("OperatorName"));
  set(sim, "Operator Code", card.text("OperatorIdentifier"));
  std::string numbers;
  for (const std::string& number : modem.texts("OwnNumbers", "as")) {
    if (number.empty()) continue;
    if (!numbers.empty()) numbers += ", ";
    numbers += isPersonal ? shownText(number) : maskedText(number);
  }
  set(sim, "Own Numbers", numbers);
}

}  // namespace kestro
