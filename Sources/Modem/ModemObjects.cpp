// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemObjects.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace kestro {
namespace {

/// The short name of an interface: "Modem.Signal".
std::string_view shortName(std::string_view interface) {
  constexpr std::string_view kPrefix = "org.freedesktop.ModemManager1.";
  return interface.starts_with(kPrefix) ? interface.substr(kPrefix.size()) : interface;
}

const std::string* textIn(const BusValue& value) {
  return std::get_if<std::string>(&value.content);
}

/// Whether a signal has these arguments.
bool hasTypes(const BusSignal& signal, std::initializer_list<std::string_view> types,
              BusFaults& faults) {
  const bool isSo = std::ranges::equal(signal.arguments, types, {}, &BusValue::signature);
  if (!isSo) {
    std::string found;
    for (const BusValue& argument : signal.arguments) found += argument.signature;
    std::string expected;
    for (const auto type : types) expected += type;
    faults.wrongType(fmt::format("signal {}", signal.member), expected, found);
  }
  return isSo;
}

}  // namespace

unsigned modemNumber(std::string_view path) {
  constexpr int kDecimal = 10;
  const auto number = numberIn(path.substr(path.rfind('/') + 1), kDecimal);
  return number ? static_cast<unsigned>(*number) : 0;
}

void ModemObjects::setManaged(const std::vector<BusValue>& answer) {
  clear();
  const auto* objects =
      answer.empty() ? nullptr : std::get_if<BusValue::Entries>(&answer.front().content);
  if (objects == nullptr || answer.front().signature != "a{oa{sa{sv}}}") {
    _faults.wrongType("list of objects", "a{oa{sa{sv}}}",
                      answer.empty() ? "" : answer.front().signature);
    return;
  }
  for (const auto& [path, interfaces] : *objects) {
    if (const auto* text = textIn(path)) addInterfaces(*text, interfaces);
  }
}

ModemObjects::Interfaces* ModemObjects::objectAt(std::string_view path) {
  const auto found = _objects.find(path);
  if (found != _objects.end()) return &found->second;
  if (_objects.size() < kMaximumObjects) return &_objects[std::string(path)];
  _faults.senseless("number of objects", fmt::format("more than {}", kMaximumObjects));
  return nullptr;
}

bool ModemObjects::addInterfaces(std::string_view path, const BusValue& interfaces) {
  const auto* entries = std::get_if<BusValue::Entries>(&interfaces.content);
  auto* object = entries == nullptr ? nullptr : objectAt(path);
  if (object == nullptr) return false;
  for (const auto& [interface, properties] : *entries) {
    const auto* name = textIn(interface);
    if (name == nullptr || !name->starts_with(kManagerInterface)) continue;
    (*object)[*name] = propertiesIn(properties, shortName(*name), _faults);
  }
  return true;
}

bool ModemObjects::apply(const BusSignal& signal) {
  if (signal.member == "InterfacesAdded") {
    return hasTypes(signal, {"o", "a{sa{sv}}"}, _faults) &&
           addInterfaces(*textIn(signal.arguments[0]), signal.arguments[1]);
  }
  if (signal.member == "InterfacesRemoved") return removeInterfaces(signal);
  return signal.member == "PropertiesChanged" && changeProperties(signal);
}

bool ModemObjects::removeInterfaces(const BusSignal& signal) {
  if (!hasTypes(signal, {"o", "as"}, _faults)) return false;
  const auto found = _objects.find(*textIn(signal.arguments[0]));
  if (found == _objects.end()) return false;
  for (const BusValue& name : std::get<BusValue::Elements>(signal.arguments[1].content)) {
    if (const auto* text = textIn(name)) found->second.erase(*text);
  }
  if (found->second.empty()) _objects.erase(found);
  return true;
}

bool ModemObjects::changeProperties(const BusSignal& signal) {
  if (!hasTypes(signal, {"s", "a{sv}", "as"}, _faults)) return false;
  const auto object = _objects.find(signal.path);
  if (object == _objects.end()) return false;
  const std::string& name = *textIn(signal.arguments[0]);
  const auto interface = object->second.find(name);
  if (interface == object->second.end()) return false;
  for (auto& [key, value] : propertiesIn(signal.arguments[1], shortName(name), _faults)) {
    // What no interface description has is not kept: a service may invent names for ever.
    if (interface->second.size() < kMaximumObjects || interface->second.contains(key)) {
      interface->second[key] = value;
    }
  }
  for (const BusValue& gone : std::get<BusValue::Elements>(signal.arguments[2].content)) {
    if (const auto* key = textIn(gone)) interface->second.erase(*key);
  }
  return true;
}

void ModemObjects::setProperties(const std::string& path, std::string_view interface,
                                 const std::vector<BusValue>& answer) {
  auto* object = answer.empty() ? nullptr : objectAt(path);
  if (object == nullptr) return;
  (*object)[std::string(interface)] = propertiesIn(answer.front(), shortName(interface), _faults);
}

void ModemObjects::forget(std::string_view path) {
  if (const auto found = _objects.find(path); found != _objects.end()) _objects.erase(found);
}

std::vector<std::string> ModemObjects::modems() const {
  std::vector<std::string> result;
  for (const auto& [path, interfaces] : _objects) {
    if (interfaces.contains(kModemInterface)) result.push_back(path);
  }
  std::ranges::sort(result, {}, [](const std::string& path) {
    return std::pair(modemNumber(path), std::string_view(path));
  });
  return result;
}

bool ModemObjects::has(std::string_view path, std::string_view interface) const {
  const auto object = _objects.find(path);
  return object != _objects.end() && object->second.contains(interface);
}

BusFields ModemObjects::fields(std::string_view path, std::string_view interface) const {
  const std::string name(shortName(interface));
  const auto object = _objects.find(path);
  if (object == _objects.end()) return {{}, name, _faults};
  const auto found = object->second.find(interface);
  return {found == object->second.end() ? BusProperties() : found->second, name, _faults};
}

}  // namespace kestro
