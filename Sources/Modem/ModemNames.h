// SPDX-License-Identifier: MIT
// What ModemManager's numbers mean, in words.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace kestro {

/// A modem's states that matter here; its interface counts them so.
inline constexpr std::int64_t kModemFailed = -1;
inline constexpr std::int64_t kModemLocked = 2;
inline constexpr std::int64_t kModemDisabled = 3;
inline constexpr std::int64_t kModemEnabled = 6;  ///< and all above

/// "registered"; empty for a number that means nothing.
[[nodiscard]] std::string_view modemStateText(std::int64_t state);
[[nodiscard]] std::string_view failedReasonText(std::uint64_t reason);
[[nodiscard]] std::string_view lockText(std::uint64_t lock);
[[nodiscard]] std::string_view registrationText(std::uint64_t state);
[[nodiscard]] std::string_view cdmaRegistrationText(std::uint64_t state);
[[nodiscard]] std::string_view packetServiceText(std::uint64_t state);
[[nodiscard]] std::string_view simTypeText(std::uint64_t type);
[[nodiscard]] std::string_view bearerTypeText(std::uint64_t type);

/// The technologies of an access mask, the newest first: "LTE", "5G NR, LTE"; empty when none is
/// known.
[[nodiscard]] std::string accessText(std::uint64_t mask);

/// The radio of the newest technology in the mask, by the name that the display gives it: "5G",
/// "LTE", "UMTS", "GSM", "EV-DO", "1x"; empty when none is known.
[[nodiscard]] std::string_view radioOfAccess(std::uint64_t mask);

}  // namespace kestro
