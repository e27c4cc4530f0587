// SPDX-License-Identifier: MIT
// What makes a cell of a technology: which section and keys say its channel, identity, level and
// quality, and whether it serves. Tables, one a technology.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "LogGenerator/Bands.h"
#include "LogGenerator/Packets/PacketKind.h"

namespace kestro {

/// Whose cell it is.
enum class Radio : std::uint8_t { LTE, UMTS, GSM, UTRATDD, OneX, EVDO };
inline constexpr std::size_t kRadioCount = 6;

/// "LTE", "UMTS", "GSM", "UTRA TDD", "1x", "EV-DO".
[[nodiscard]] std::string_view nameOfRadio(Radio radio) noexcept;

/// What a phone has at a time: the radios of CDMA2000 serve beside each other, all others in place
/// of each other. "LTE", "UMTS", "GSM", "UTRA TDD", "CDMA2000".
[[nodiscard]] std::string_view familyOfRadio(Radio radio) noexcept;

/// Who counts the radio's channels.
[[nodiscard]] RadioSystem systemOfRadio(Radio radio) noexcept;

/// What a key says of a cell.
enum class CellField : std::uint8_t {
  Channel,
  Physical,  ///< physical cell identity, scrambling code, BSIC, PN offset
  Identity,  ///< the cell's identity in its network
  Band,
  Area,
  CountryCode,
  NetworkCode,
  Level,
  Quality,
};
inline constexpr std::size_t kCellFieldCount = 9;

/// How a value is read.
enum class CellReading : std::uint8_t {
  Number,
  Hexadecimal,  ///< of the text
  Colours,      ///< "2-5": network and base-station colour
};

struct CellKey {
  CellField field;
  std::string_view key;
  CellReading reading = CellReading::Number;
  double offset = 0;  ///< is added to the number: a level is in dBm then
};

/// What a section's values mean.
enum class CellUse : std::uint8_t {
  Deciding,   ///< names the cell that serves
  Fallback,   ///< names it after 2 s without a deciding packet, else as Serving
  ActiveSet,  ///< a list of which one serves: the one that did, else the strongest
  Serving,    ///< of the cell that serves, unless it names another
  Network,    ///< area and network of whatever serves
  Neighbour,
};

struct CellSection {
  std::string_view technology;  ///< as the log channel names it
  std::string_view section;     ///< as series have it
  LogCode code;                 ///< only from this packet; 0: from any
  Radio radio;
  CellUse use;
  std::span<const CellKey> keys;
  /// In place of `radio` the one that the message names elsewhere (kRadioNames).
  bool isOfNamedRadio = false;
  /// A cell without a channel has that of the serving cell.
  bool isOnServingChannel = false;
};

/// All tables. Within a message the uses count in the order of CellUse.
[[nodiscard]] std::span<const CellSection> cellSections() noexcept;

/// Where a message of IFX names the radio: by one of these texts.
struct RadioNameKey {
  std::string_view technology;
  std::string_view section;
  std::string_view key;
};
[[nodiscard]] std::span<const RadioNameKey> radioNameKeys() noexcept;
[[nodiscard]] std::optional<Radio> radioNamed(std::string_view text) noexcept;

/// A value that says whether the phone is in connected mode.
struct ConnectedMark {
  std::string_view technology;
  std::string_view section;
  std::string_view key;
  LogCode code;  ///< 0: any
  Radio radio;
  /// The numbers that say so; any other says that it is not. Empty: whatever it is says so.
  std::span<const int> numbers{};
};
[[nodiscard]] std::span<const ConnectedMark> connectedMarks() noexcept;

/// A state whose changes are events.
struct NamedState {
  std::string_view technology;
  std::string_view section;
  std::string_view key;
};
[[nodiscard]] std::span<const NamedState> namedStates() noexcept;

}  // namespace kestro
