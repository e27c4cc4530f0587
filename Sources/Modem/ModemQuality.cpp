// SPDX-License-Identifier: MIT
// What the Signal interface measures, as the section of it.
#include <fmt/format.h>

#include <array>
#include <span>
#include <string_view>

#include "Sources/Modem/ModemNames.h"
#include "Sources/Modem/ModemSections.h"

namespace kestro {
namespace {

struct Measurement {
  std::string_view key;
  std::string_view name;
  std::string_view unit;
  double least;
  double greatest;
};

constexpr double kLeastSignal = -200;
constexpr double kGreatestSignal = 50;
constexpr double kGreatestSignalRatio = 100;

constexpr Measurement level(std::string_view key, std::string_view name) {
  return {key, name, " dBm", kLeastSignal, kGreatestSignal};
}
constexpr Measurement ratio(std::string_view key, std::string_view name) {
  return {key, name, " dB", -kGreatestSignalRatio, kGreatestSignalRatio};
}
constexpr Measurement kErrorRate{"error-rate", "Error Rate", " %", 0, 100};

constexpr Measurement kNRSignal[] = {level("rsrp", "SS-RSRP"), ratio("rsrq", "SS-RSRQ"),
                                     ratio("snr", "SS-SINR"), kErrorRate};
constexpr Measurement kLTESignal[] = {level("rsrp", "RSRP"), ratio("rsrq", "RSRQ"),
                                      ratio("snr", "SNR"), level("rssi", "RSSI"), kErrorRate};
constexpr Measurement kUMTSSignal[] = {level("rscp", "RSCP"), ratio("ecio", "Ec/Io"),
                                       level("rssi", "RSSI"), kErrorRate};
constexpr Measurement kGSMSignal[] = {level("rssi", "RSSI"), kErrorRate};
constexpr Measurement kEVDOSignal[] = {level("rssi", "RSSI"), ratio("ecio", "Ec/Io"),
                                       ratio("sinr", "SINR"), level("io", "Io"), kErrorRate};
constexpr Measurement kOneXSignal[] = {level("rssi", "RSSI"), ratio("ecio", "Ec/Io"), kErrorRate};

struct MeasuredRadio {
  std::string_view property;
  std::string_view radio;
  std::span<const Measurement> measurements;
};
constexpr std::array kRadios = {
    MeasuredRadio{"Nr5g", "5G", kNRSignal},      MeasuredRadio{"Lte", "LTE", kLTESignal},
    MeasuredRadio{"Umts", "UMTS", kUMTSSignal},  MeasuredRadio{"Gsm", "GSM", kGSMSignal},
    MeasuredRadio{"Evdo", "EV-DO", kEVDOSignal}, MeasuredRadio{"Cdma", "1x", kOneXSignal}};

void addMeasured(const BusFields& values, const MeasuredRadio& radio, Dictionary& quality) {
  for (const auto& [key, name, unit, least, greatest] : radio.measurements) {
    const auto number = values.real(key, least, greatest);
    if (!number) continue;
    const std::string_view shown = name;
    const bool isTaken = quality.contains(shown);
    quality.set(isTaken ? fmt::format("{} {}", radio.radio, shown) : std::string(shown),
                fmt::format("{}{}", *number, unit));
  }
}

}  // namespace

void addQuality(const ModemFollower& follower, Dictionary& quality) {
  const auto& objects = follower.objects();
  if (!isEnabled(objects, follower.path())) return;
  const BusFields modem = objects.fields(follower.path(), kModemInterface);
  const auto access = modem.number("AccessTechnologies");
  const std::string_view radio = access ? radioOfAccess(*access) : std::string_view();
  if (!radio.empty()) quality.set("Technology", radio);
  const BusFields signal = objects.fields(follower.path(), kSignalInterface);
  for (const MeasuredRadio& measured : kRadios) {
    if (signal.contains(measured.property)) {
      addMeasured(signal.dictionary(measured.property), measured, quality);
    }
  }
}

}  // namespace kestro
