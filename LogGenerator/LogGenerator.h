// SPDX-License-Identifier: MIT
// The common base of the log generators, one for each technology that a baseband's log channel
// speaks.
#pragma once

#include <memory>
#include <span>
#include <string_view>

#include "LogGenerator/GeneratorServices.h"
#include "LogGenerator/Packets/Catalogue.h"
#include "LogGenerator/Packets/Explain.h"
#include "LogGenerator/Packets/Outline.h"
#include "Platform/Bytes.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// Keys of the generator state that every generator uses.
inline constexpr std::string_view kStateDisplayState = "DisplayState";
inline constexpr std::string_view kStateDisplay = "Display";
inline constexpr std::string_view kStateExtraInfo = "ExtraInfo";
inline constexpr std::string_view kStateHistory = "History";

/// Keys of a history entry, besides the first three of the state.
inline constexpr std::string_view kHistoryDate = "Date";
inline constexpr std::string_view kHistoryDescription = "Description";

/// The most entries that a history keeps.
inline constexpr std::size_t kMaximumHistoryEntries = 5;

/// The most that a history entry keeps of what it was made of, in bytes, so that a fast or hostile
/// server does not grow the memory without end: of its packets, or of all its texts.
inline constexpr std::size_t kMaximumEntryBytes = std::size_t{16} * 1024 * 1024;

/// Turns the messages of one log channel into a display.
///
/// The generator state is one dictionary, owned by the model and handed to every operation; it
/// outlives generators. A generator writes its raw data under "DisplayState", the display object
/// (nested dictionaries, arrays and texts) under "Display", and extra information under
/// "ExtraInfo". Main thread only. What its services refer to must outlive the generator.
class LogGenerator {
 public:
  virtual ~LogGenerator() = default;
  LogGenerator(const LogGenerator&) = delete;
  LogGenerator& operator=(const LogGenerator&) = delete;

  /// Applies one message, borrowed for the call, to the state. A message that ends the application
  /// throws: InternalConsistencyFailure (IFX; the state is as it was), ArrayOutOfBoundsException or
  /// UnknownDataException (packets; sections may be half written, and the packet is not collected).
  /// Packets are collected until the next `generateLogUsingState`: the first 16 MiB of them. Those
  /// beyond are decoded only.
  virtual void updateStateWithData(Dictionary& state, ByteView data) = 0;

  /// Returns the display object, or null when there is none yet, after recording a history entry.
  /// Called each time the display is rebuilt.
  virtual Value generateLogUsingState(Dictionary& state) = 0;

  /// The command that switches the baseband's logging on.
  [[nodiscard]] virtual Dictionary getStartCommand() const = 0;

  /// The state's keys that belong to this generator alone, constants. When the channel changes its
  /// technology they leave the state, so that the next generator starts on a display of its own;
  /// "DisplayState" and "History" are nobody's and stay.
  [[nodiscard]] virtual std::span<const std::string_view> stateKeys() const;

  /// Visits every value that the generator takes from one message, with the bytes it comes from.
  /// Nothing for channels whose messages are no packets.
  virtual void explainMessage(ByteView message, const ExplainVisitor& visit) const;

  /// Visits what the generator's sections take from each log code, code by code in the order of the
  /// start command. Nothing for channels without log codes.
  virtual void catalogue(const CatalogueVisitor& visit) const;

  /// Visits what `explainMessage` finds in packets of each log code, code by code in the order of
  /// the start command, and taker by taker in the order in which a packet is explained. Nothing for
  /// channels without log codes. Names are valid as long as the generator.
  virtual void outline(const OutlineVisitor& visit) const;

  /// What a snapshot stores: an array that the caller owns, beginning with the history's entries.
  [[nodiscard]] virtual Array getSaveContentsFromState(const Dictionary& state) = 0;

  /// The technologies that a generator speaks, in the order in which they are looked up.
  [[nodiscard]] static std::span<const std::string_view> technologies();

  /// A new generator for the technology that the telephony server reports; null when none speaks
  /// it.
  [[nodiscard]] static std::unique_ptr<LogGenerator> generatorFromTechnology(
      const GeneratorServices& services, std::string_view technology);

  /// Appends one entry to the state's history, dropping the oldest so that at most five remain. The
  /// entry holds deep copies: it keeps the display as it is now. It ends before the first of
  /// "DisplayState", "Display" and "ExtraInfo" that the state lacks.
  static void updateHistoryInState(Dictionary& state, const Clock& clock);

 protected:
  explicit LogGenerator(const GeneratorServices& services) noexcept : _services(services) {}

  /// The first step of every generator's construction: leaves a line with the new object's address
  /// in the system log.
  void init();

  [[nodiscard]] const GeneratorServices& services() const noexcept { return _services; }

  /// Appends an entry to the state's history as `updateHistoryInState` does.
  static void appendToHistory(Dictionary& state, const Dictionary& entry);

  /// A new array with the entries of the state's history, the entries themselves shared; empty when
  /// there is no history.
  [[nodiscard]] static Array historyOfState(const Dictionary& state);

 private:
  GeneratorServices _services;
};

}  // namespace kestro
