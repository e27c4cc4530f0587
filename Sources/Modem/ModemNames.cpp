// SPDX-License-Identifier: MIT
#include "Sources/Modem/ModemNames.h"

#include <algorithm>
#include <array>
#include <span>

namespace kestro {
namespace {

constexpr std::string_view kStates[] = {
    "failed",  "unknown",   "initializing", "locked",        "disabled",   "disabling", "enabling",
    "enabled", "searching", "registered",   "disconnecting", "connecting", "connected"};

constexpr std::string_view kFailedReasons[] = {"",
                                               "for an unknown reason",
                                               "the SIM is missing",
                                               "the SIM cannot be used",
                                               "its capabilities are unknown",
                                               "the eSIM has no profile"};

constexpr std::string_view kLocks[] = {
    "unknown",     "none",        "SIM PIN",     "SIM PIN2",      "SIM PUK",      "SIM PUK2",
    "PH-SP PIN",   "PH-SP PUK",   "PH-NET PIN",  "PH-NET PUK",    "PH-SIM PIN",   "PH-CORP PIN",
    "PH-CORP PUK", "PH-FSIM PIN", "PH-FSIM PUK", "PH-NETSUB PIN", "PH-NETSUB PUK"};

constexpr std::string_view kRegistrations[] = {"idle",
                                               "home",
                                               "searching",
                                               "denied",
                                               "unknown",
                                               "roaming",
                                               "home, SMS only",
                                               "roaming, SMS only",
                                               "emergency only",
                                               "home, CS fallback not preferred",
                                               "roaming, CS fallback not preferred",
                                               "attached for restricted local service"};

constexpr std::string_view kCdmaRegistrations[] = {"unknown", "registered", "home", "roaming"};
constexpr std::string_view kPacketServices[] = {"unknown", "detached", "attached"};
constexpr std::string_view kSimTypes[] = {"unknown", "physical", "eSIM"};
constexpr std::string_view kBearerTypes[] = {"unknown", "default", "initial", "dedicated"};

/// One bit of an access mask.
struct Access {
  unsigned bit;
  std::string_view name;
  std::string_view radio;
};
constexpr Access kAccess[] = {{15, "5G NR", "5G"},
                              {17, "LTE NB-IoT", "LTE"},
                              {16, "LTE Cat-M", "LTE"},
                              {14, "LTE", "LTE"},
                              {9, "HSPA+", "UMTS"},
                              {8, "HSPA", "UMTS"},
                              {7, "HSUPA", "UMTS"},
                              {6, "HSDPA", "UMTS"},
                              {5, "UMTS", "UMTS"},
                              {4, "EDGE", "GSM"},
                              {3, "GPRS", "GSM"},
                              {2, "GSM Compact", "GSM"},
                              {1, "GSM", "GSM"},
                              {13, "EV-DO rev. B", "EV-DO"},
                              {12, "EV-DO rev. A", "EV-DO"},
                              {11, "EV-DO rev. 0", "EV-DO"},
                              {10, "1xRTT", "1x"},
                              {0, "POTS", ""}};

constexpr bool has(std::uint64_t mask, const Access& access) {
  return ((mask >> access.bit) & 1U) != 0;
}

std::string_view nameAt(std::span<const std::string_view> names, std::uint64_t index) {
  return index < names.size() ? names[index] : std::string_view();
}

}  // namespace

std::string_view modemStateText(std::int64_t state) {
  return nameAt(kStates, static_cast<std::uint64_t>(state - kModemFailed));
}
std::string_view failedReasonText(std::uint64_t reason) { return nameAt(kFailedReasons, reason); }
std::string_view lockText(std::uint64_t lock) { return nameAt(kLocks, lock); }
std::string_view registrationText(std::uint64_t state) { return nameAt(kRegistrations, state); }
std::string_view cdmaRegistrationText(std::uint64_t state) {
  return nameAt(kCdmaRegistrations, state);
}
std::string_view packetServiceText(std::uint64_t state) { return nameAt(kPacketServices, state); }
std::string_view simTypeText(std::uint64_t type) { return nameAt(kSimTypes, type); }
std::string_view bearerTypeText(std::uint64_t type) { return nameAt(kBearerTypes, type); }

std::string accessText(std::uint64_t mask) {
  std::string result;
  for (const Access& access : kAccess) {
    if (!has(mask, access)) continue;
    if (!result.empty()) result += ", ";
    result += access.name;
  }
  return result;
}

std::string_view radioOfAccess(std::uint64_t mask) {
  const auto* found =
      std::ranges::find_if(kAccess, [mask](const Access& access) { return has(mask, access); });
  return found == std::end(kAccess) ? std::string_view() : found->radio;
}

}  // namespace kestro
