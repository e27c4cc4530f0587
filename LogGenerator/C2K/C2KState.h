// SPDX-License-Identifier: MIT
// The keys of the generator state that belong to the CDMA2000 channel.
#pragma once

#include <string_view>

namespace kestro {

/// The lookup table of the display.
inline constexpr std::string_view kStateLookup = "Lookup";

// Values that last from one packet to the next.
inline constexpr std::string_view kStateTrafficFER = "TrafficFER";
inline constexpr std::string_view kStateFLDataSeqNum = "FLDataSeqNum";
inline constexpr std::string_view kStateFLDataSent = "FLDataSent";
inline constexpr std::string_view kStateRLDataSeqNum = "RLDataSeqNum";
inline constexpr std::string_view kStateRLDataSent = "RLDataSent";

}  // namespace kestro
