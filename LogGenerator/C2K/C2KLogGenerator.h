// SPDX-License-Identifier: MIT
// The generator of the CDMA2000 channel: 1x and EV-DO.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

#include "LogGenerator/C2K/C2KParser.h"
#include "LogGenerator/C2K/C2KState.h"
#include "LogGenerator/C2K/TemplatePlaces.h"
#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "LogGenerator/Packets/PlacedKey.h"

namespace kestro {

/// The resource that is its template.
inline constexpr std::string_view kC2KTemplate = "C2KTemplate";

/// Shows values where the template "C2KTemplate" wants them: each of its leaves names a value, and
/// a lookup table leads from the name to all leaves that do.
class C2KLogGenerator : public OndrelLogGenerator {
 public:
  [[nodiscard]] static std::unique_ptr<C2KLogGenerator> generator(
      const GeneratorServices& services);

  explicit C2KLogGenerator(const GeneratorServices& services);

  /// Makes sure that the display exists and takes the message's packet.
  void updateStateWithData(Dictionary& state, ByteView data) override;
  /// Hands the collected packets over, records the history and returns the display.
  Value generateLogUsingState(Dictionary& state) override;
  [[nodiscard]] Dictionary getStartCommand() const override;
  [[nodiscard]] std::span<const std::string_view> stateKeys() const override;
  void explainMessage(ByteView message, const ExplainVisitor& visit) const override;
  void catalogue(const CatalogueVisitor& visit) const override;
  void outline(const OutlineVisitor& visit) const override;

  /// The state's display, built from the template and stored with its lookup table when there is
  /// none; null when there is no template either.
  Value getDisplayFromState(Dictionary& state);

  /// Fills an empty display from a template, and the lookup table with the targets of its leaves.
  /// Containers in the template other than dictionaries, and whatever else is no text, are left
  /// out.
  void processTemplateStoreDisplayIntoDictStoreLookupIntoDict(const Dictionary& displayTemplate,
                                                              Dictionary& display,
                                                              Dictionary& lookup) const;

  /// Takes one packet: ignores messages of fewer than 13 bytes and codes that nobody asked for,
  /// reports a wrong log type and goes on all the same, and collects what a parser has seen.
  void updateFromLogUsingLookupUsingState(ByteView message, const Dictionary& lookup,
                                          Dictionary& state);

 private:
  [[nodiscard]] C2KParser* parserOf(LogCode code) const noexcept;
  /// Where the resource's template shows values, whatever template the state holds.
  [[nodiscard]] const TemplatePlaces& places() const;

  std::vector<std::unique_ptr<C2KParser>> _parsers;  ///< in the order of the start command
  PlacedKey _displayKey{kStateDisplay};
  PlacedKey _lookupKey{kStateLookup};
  mutable std::optional<TemplatePlaces> _places;  ///< read from the resource when first needed
};

}  // namespace kestro
