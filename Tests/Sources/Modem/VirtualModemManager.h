// SPDX-License-Identifier: MIT
// A ModemManager with modems as a test says, and the display that a source makes of it.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Sources/Modem/ModemObjects.h"
#include "Sources/Modem/ModemSource.h"

namespace kestro::testing {

class ModemTest : public ::testing::Test {
 protected:
  using Seconds = std::chrono::seconds;

  /// An entry of a dictionary a{sv}.
  static std::pair<BusValue, BusValue> entry(std::string key, BusValue value) {
    return {busText(std::move(key)), std::move(value)};
  }
  static BusValue map(BusValue::Entries entries) { return busEntries("a{sv}", std::move(entries)); }
  static std::string path(int number) {
    return "/org/freedesktop/ModemManager1/Modem/" + std::to_string(number);
  }

  /// A modem of that number, in the state (8: registered), with this identity.
  void addModem(int number, int state, const std::string& equipment = "490154203237518") {
    objects[path(number)][std::string(kModemInterface)] = {
        {"State", busInteger(state)},
        {"Manufacturer", busText("Example")},
        {"Model", busText("Model X")},
        {"EquipmentIdentifier", busText(equipment)},
        {"AccessTechnologies", busUnsigned(1U << 14)}};
    objects[path(number)][std::string(kSignalInterface)] = {{"Rate", busUnsigned(rate)}};
    objects[path(number)][std::string(kLocationInterface)] = {};
    objects[path(number)][std::string(kModem3gppInterface)] = {
        {"RegistrationState", busUnsigned(1)}, {"OperatorCode", busText("00101")}};
  }

  void open(const std::string& argument = "", std::optional<PositionServer> gps = std::nullopt,
            bool isPersonal = false) {
    platform.modemService().setHandler([this](const BusCall& call) { return answer(call); });
    source = std::make_unique<ModemSource>(
        ModemServices{platform.propertyListCoding(), platform.clock(), platform.mainQueue(),
                      platform.modemService(), platform.positionService()},
        ModemWish{*modemNamed(argument), std::move(gps), isPersonal},
        [this](std::string_view line) { lines.emplace_back(line); });
    source->setReadyHandler([this] { take(); });
  }
  /// Opens, watches, and lets two seconds pass, in which everything has been asked.
  void watch(const std::string& argument = "") {
    if (!source) open(argument);
    platform.modemService().setState(ModemServiceState::Present);
    source->setWatched(true, {});
    pass(Seconds(3));
  }
  void pass(std::chrono::nanoseconds time) { platform.mainQueue().advance(time); }

  /// Says that these properties of an interface have changed.
  void change(int number, std::string_view interface, BusValue::Entries changed) {
    for (const auto& [key, value] : changed) {
      objects[path(number)][std::string(interface)][std::get<std::string>(key.content)] = value;
    }
    platform.modemService().signal(
        {path(number),
         std::string(kPropertiesInterface),
         "PropertiesChanged",
         {busText(std::string(interface)), map(std::move(changed)), busList("as", {})}});
  }
  void remove(int number) {
    BusValue::Elements names;
    for (const auto& [name, properties] : objects[path(number)]) names.push_back(busText(name));
    objects.erase(path(number));
    platform.modemService().signal({"/org/freedesktop/ModemManager1",
                                    std::string(kObjectManagerInterface),
                                    "InterfacesRemoved",
                                    {busPath(path(number)), busList("as", std::move(names))}});
  }
  void announce(int number) {
    platform.modemService().signal({"/org/freedesktop/ModemManager1",
                                    std::string(kObjectManagerInterface),
                                    "InterfacesAdded",
                                    {busPath(path(number)), interfacesOf(path(number))}});
  }

  /// A value of the display, by its section and key; empty when there is none.
  [[nodiscard]] std::string shown(std::string_view section, std::string_view key) const {
    return std::string(Value(sectionOf(section)).dictionary()[key].text());
  }
  [[nodiscard]] Array list(std::string_view section) const { return sectionOf(section).array(); }
  [[nodiscard]] std::string shownIn(std::string_view section, std::size_t index,
                                    std::string_view key) const {
    const Array rows = list(section);
    if (index >= rows.size()) return "(no such row)";
    return std::string(Value(rows[index]).dictionary()[key].text());
  }
  [[nodiscard]] int callsOf(std::string_view call) const {
    int count = 0;
    for (const auto& made : platform.modemService().calls()) count += made == call ? 1 : 0;
    return count;
  }

  BusReply answer(const BusCall& call) {
    if (const auto refused = refusals.find(call.method); refused != refusals.end()) {
      return tl::unexpected(BusError{refused->second, "refused"});
    }
    if (call.method == "GetManagedObjects") return std::vector{managedObjects()};
    if (call.method == "GetCellInfo") return std::vector{cells};
    if (call.method == "GetLocation") return std::vector{location};
    if (call.method == "GetAll") return std::vector{propertiesOf(parts[call.path])};
    if (call.method == "Setup") {
      rate = static_cast<std::uint32_t>(std::get<std::uint64_t>(call.arguments[0].content));
      return std::vector<BusValue>();
    }
    const auto& property = std::get<std::string>(call.arguments[1].content);
    return std::vector{property == "Version" ? busText(version) : rateValue()};
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  mutable VirtualPlatform platform{*coding};
  std::map<std::string, ModemObjects::Interfaces> objects;
  std::map<std::string, BusProperties> parts;  ///< SIM and bearers
  std::map<std::string, std::string> refusals;
  BusValue cells = busList("aa{sv}", {});
  BusValue location = busEntries("a{uv}", {});
  std::uint32_t rate = 0;
  std::optional<BusValue> wrongRate;
  std::string version = "1.20.4";
  std::vector<std::string> lines;
  std::vector<Value> messages;
  std::unique_ptr<ModemSource> source;

 private:
  [[nodiscard]] BusValue rateValue() const { return wrongRate.value_or(busUnsigned(rate)); }
  static BusValue propertiesOf(const BusProperties& properties) {
    BusValue::Entries entries;
    for (const auto& [key, value] : properties) entries.push_back(entry(key, value));
    return map(std::move(entries));
  }
  [[nodiscard]] BusValue interfacesOf(const std::string& object) {
    BusValue::Entries interfaces;
    for (const auto& [name, properties] : objects[object]) {
      interfaces.push_back(entry(name, propertiesOf(properties)));
    }
    return busEntries("a{sa{sv}}", std::move(interfaces));
  }
  [[nodiscard]] BusValue managedObjects() {
    BusValue::Entries entries;
    for (const auto& [object, interfaces] : objects) {
      entries.emplace_back(busPath(object), interfacesOf(object));
    }
    return busEntries("a{oa{sa{sv}}}", std::move(entries));
  }
  void take() {
    const auto step = source->next();
    ASSERT_TRUE(step);
    const auto* event = std::get_if<SourceEvent>(&*step);
    ASSERT_NE(event, nullptr);
    const auto parsed = coding->parse(event->message);
    ASSERT_TRUE(parsed);
    messages.push_back(GSMLogGenerator::processObject(*parsed));
  }
  /// The section whose name stands behind its number.
  [[nodiscard]] Value sectionOf(std::string_view name) const {
    if (messages.empty()) return {};
    for (const auto& [key, value] : messages.back().dictionary()) {
      if (key.text().ends_with(name) &&
          key.text().find(';') + 1 + name.size() == key.text().size()) {
        return value;
      }
    }
    return {};
  }
};

}  // namespace kestro::testing
