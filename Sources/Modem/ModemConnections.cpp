// SPDX-License-Identifier: MIT
// The data connections of a modem, as the section of it.
#include <fmt/format.h>

#include <string_view>

#include "Sources/Modem/ModemNames.h"
#include "Sources/Modem/ModemSections.h"
#include "Sources/Modem/ShownText.h"

namespace kestro {
namespace {

struct Statistic {
  std::string_view key;
  std::string_view name;
  std::string_view unit;
  bool isLong;
};
constexpr Statistic kStatistics[] = {
    {"rx-bytes", "Received", " bytes", true},
    {"tx-bytes", "Sent", " bytes", true},
    {"duration", "Duration", " s", false},
    {"downlink-speed", "Downlink Limit", " bit/s", true},
    {"uplink-speed", "Uplink Limit", " bit/s", true},
    {"total-rx-bytes", "Received in Total", " bytes", true},
    {"total-tx-bytes", "Sent in Total", " bytes", true},
    {"total-duration", "Duration in Total", " s", false},
    {"attempts", "Attempts", "", false},
    {"failed-attempts", "Failed Attempts", "", false},
};

struct Address {
  std::string_view key;
  std::string_view name;
};
constexpr Address kAddresses[] = {
    {"address", "Address"}, {"gateway", "Gateway"}, {"dns1", "DNS"}, {"dns2", "Second DNS"}};

void addFlag(const BusFields& bearer, std::string_view key, Dictionary& connection) {
  if (const auto flag = bearer.flag(key)) connection.set(key, *flag ? "yes" : "no");
}

void addAddresses(const BusFields& addresses, std::string_view version, bool isPersonal,
                  Dictionary& connection) {
  for (const auto& [key, name] : kAddresses) {
    const auto text = addresses.text(key);
    if (!text) continue;
    connection.set(fmt::format("{} {}", version, name), isPersonal ? *text : maskedText(*text));
  }
}

void addStatistics(const BusFields& statistics, Dictionary& connection) {
  for (const auto& [key, name, unit, isLong] : kStatistics) {
    const auto number = isLong ? statistics.longNumber(key) : statistics.number(key);
    if (number) connection.set(name, fmt::format("{}{}", *number, unit));
  }
}

Dictionary connectionOf(const BusFields& bearer, bool isPersonal) {
  Dictionary connection;
  addFlag(bearer, "Connected", connection);
  addFlag(bearer, "Suspended", connection);
  if (const auto name = bearer.text("Interface")) connection.set("Interface", *name);
  if (const auto type = bearer.number("BearerType")) {
    const auto text = bearerTypeText(*type);
    if (!text.empty()) connection.set("Type", text);
  }
  if (const auto apn = bearer.dictionary("Properties").text("apn")) connection.set("APN", *apn);
  addAddresses(bearer.dictionary("Ip4Config"), "IPv4", isPersonal, connection);
  addAddresses(bearer.dictionary("Ip6Config"), "IPv6", isPersonal, connection);
  addStatistics(bearer.dictionary("Stats"), connection);
  return connection;
}

}  // namespace

void addConnections(const ModemFollower& follower, bool isPersonal, Array& connections) {
  const auto& objects = follower.objects();
  const BusFields modem = objects.fields(follower.path(), kModemInterface);
  for (const std::string& path : modem.texts("Bearers", "ao")) {
    Dictionary connection{{"Bearer", fmt::format("{}", modemNumber(path))}};
    for (const auto& [key, value] :
         connectionOf(objects.fields(path, kBearerInterface), isPersonal)) {
      connection.set(key, value);
    }
    if (connection.size() > 1) connections.append(connection);
  }
}

}  // namespace kestro
