// SPDX-License-Identifier: MIT
// Band and frequency of a channel number, by the standards' public formulas.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace kestro {

/// Who counts the channels.
enum class RadioSystem : std::uint8_t { EUTRA, UTRAFDD, UTRATDD, GSM, CDMA2000, NR };

/// Where a channel number lies.
struct ChannelBand {
  /// The band's name: "3", "VIII", "DCS 1800", "n78", of CDMA2000 the band class. All bands, with
  /// ", " between them, where several fit and nobody said which; in 5G none then. Empty where none
  /// fits.
  std::string band;
  /// The downlink frequency; absent where no band fits, or several that differ. In 5G the raster
  /// alone says it.
  std::optional<std::uint32_t> downlinkKHz;

  friend bool operator==(const ChannelBand&, const ChannelBand&) = default;
};

/// The band of a downlink channel. `ownBand` is the number that the packet gives for its band, if
/// any: band class, E-UTRA's or UTRA's band, in GSM the band indicator (0: DCS 1800, 1: PCS 1900).
/// It decides among several that fit, and is passed over where it does not fit.
[[nodiscard]] ChannelBand bandOfChannel(RadioSystem system, std::uint32_t channel,
                                        std::optional<std::uint32_t> ownBand = std::nullopt);

}  // namespace kestro
