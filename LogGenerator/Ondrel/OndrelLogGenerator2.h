// SPDX-License-Identifier: MIT
// The template-driven generator: a display template fixes where each section is shown, a class
// index which decoders fill it.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "LogGenerator/Ondrel/ClassIndex.h"
#include "LogGenerator/Ondrel/OndrelLogGenerator.h"

namespace kestro {

class OndrelLogGenerator2 : public OndrelLogGenerator {
 public:
  ~OndrelLogGenerator2() override;

  /// Makes sure that the display exists, dispatches the message and collects it. Without an index
  /// the message is dropped.
  void updateStateWithData(Dictionary& state, ByteView data) override;
  /// Hands the collected packets over and records the history. The first call on a state without a
  /// display builds it and returns null.
  Value generateLogUsingState(Dictionary& state) override;
  [[nodiscard]] Dictionary getStartCommand() const override;
  [[nodiscard]] std::span<const std::string_view> stateKeys() const override;
  void explainMessage(ByteView message, const ExplainVisitor& visit) const override;
  void catalogue(const CatalogueVisitor& visit) const override;
  void outline(const OutlineVisitor& visit) const override;

  /// Frames one message and calls the subscribers of its code. Messages of fewer than 13 bytes are
  /// ignored, those of an unknown type dropped with a line.
  void updateWithData(ByteView message);

  /// The state's display. When there is none it is built from the template, stored, and null is
  /// returned. A display that an earlier generator left is bound to this one's decoders.
  Value getDisplayFromState(Dictionary& state);

  /// A fresh display object from a template; every section found on the way is bound to its
  /// decoder.
  [[nodiscard]] Value processTemplate(const Value& templateObject);

  /// Walks a display and reports what is neither text, dictionary nor array. Nothing is said of a
  /// null, which stands where `processTemplate` has reported an object.
  void printDict(const Value& object) const;

 protected:
  explicit OndrelLogGenerator2(const GeneratorServices& services) noexcept
      : OndrelLogGenerator(services) {}

  /// The construction's second step, after the subclass has made its index and chosen the template.
  void initWithPListNameCIndexObj(std::string pListName, std::unique_ptr<ClassIndex> index);

 private:
  using SectionGroups = std::map<std::string, std::string, std::less<>>;

  [[nodiscard]] Value processDictionary(const Dictionary& dictionary);
  /// The outermost groups of the resource's template by the sections in them, whatever template
  /// the state holds.
  [[nodiscard]] const SectionGroups& sectionGroups() const;
  [[nodiscard]] std::span<Base* const> subscribersOf(LogCode code) const;
  [[nodiscard]] Base* decoderOf(const Value& key) const;
  void buildDisplay(Dictionary& state);
  void bindDisplay(const Value& display);
  void bindSections(const Value& object);

  std::string _pListName;
  std::unique_ptr<ClassIndex> _cIndex;
  WeakValue _boundDisplay;  ///< the display whose sections the decoders write into
  mutable std::optional<SectionGroups> _sectionGroups;  ///< read when first needed
};

}  // namespace kestro
