// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemChoice.h"

#include <algorithm>

#include "Sources/Modem/ModemNames.h"

namespace kestro {
namespace {

constexpr std::size_t kLongestNumber = 6;
constexpr std::size_t kShortestEquipment = 8;  // an ESN; an IMEI has 15 digits
constexpr std::size_t kLongestEquipment = 18;

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isHexadecimal(char c) {
  return isDigit(c) || (c >= 'A' && c <= 'F') || (c >= 'a' && c <= 'f');
}

std::optional<std::string> equipmentOf(const ModemObjects& objects, const std::string& path) {
  return objects.fields(path, kModemInterface).text("EquipmentIdentifier");
}

}  // namespace

std::optional<ModemName> modemNamed(std::string_view argument) {
  using enum ModemName::Kind;
  if (argument.empty()) return ModemName{};
  if (argument.front() == '/') return ModemName{Path, std::string(argument)};
  if (argument.size() <= kLongestNumber && std::ranges::all_of(argument, isDigit)) {
    return ModemName{Number, std::string(argument)};
  }
  const bool isEquipment = argument.size() >= kShortestEquipment &&
                           argument.size() <= kLongestEquipment &&
                           std::ranges::all_of(argument, isHexadecimal);
  if (!isEquipment) return std::nullopt;
  return ModemName{Equipment, std::string(argument)};
}

bool isEnabled(const ModemObjects& objects, std::string_view path) {
  return objects.fields(path, kModemInterface).integer("State").value_or(0) >= kModemEnabled;
}

std::string ModemChoice::path(const ModemObjects& objects) {
  std::string found = find(objects);
  if (found.empty()) return found;
  if (found != _path) _equipment.clear();
  _path = found;
  if (auto equipment = equipmentOf(objects, found)) _equipment = *std::move(equipment);
  return found;
}

std::string ModemChoice::find(const ModemObjects& objects) const {
  const auto modems = objects.modems();
  const auto isIt = [&](const std::string& path) {
    if (_equipment.empty()) return _path.empty() ? isNamed(objects, path) : path == _path;
    return equipmentOf(objects, path) == _equipment;
  };
  const auto found = std::ranges::find_if(modems, isIt);
  const bool isThere = found != modems.end();
  if (_name.kind != ModemName::Kind::Any) return isThere ? *found : std::string();
  if (isThere && hasChosen() && isEnabled(objects, *found)) return *found;
  const std::string first = firstOf(objects);
  if (isThere && hasChosen() && !isEnabled(objects, first)) return *found;
  return !hasChosen() || isEnabled(objects, first) ? first : std::string();
}

std::string ModemChoice::firstOf(const ModemObjects& objects) const {
  const auto modems = objects.modems();
  const auto enabled = std::ranges::find_if(
      modems, [&](const std::string& path) { return isEnabled(objects, path); });
  if (enabled != modems.end()) return *enabled;
  return modems.empty() ? std::string() : modems.front();
}

bool ModemChoice::isNamed(const ModemObjects& objects, const std::string& path) const {
  switch (_name.kind) {
    case ModemName::Kind::Any:
      return false;
    case ModemName::Kind::Number:
      return std::to_string(modemNumber(path)) == _name.text;
    case ModemName::Kind::Path:
      return path == _name.text ||
             objects.fields(path, kModemInterface).text("Device") == _name.text;
    case ModemName::Kind::Equipment:
      return equipmentOf(objects, path) == _name.text;
  }
  return false;
}

}  // namespace kestro
