// SPDX-License-Identifier: MIT
// The contract of all decoders that own one section of the display, and the registry's two
// dictionaries into which they enter themselves.
#pragma once

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/GeneratorServices.h"
#include "LogGenerator/Packets/Catalogue.h"
#include "LogGenerator/Packets/Explain.h"
#include "LogGenerator/Packets/Outline.h"
#include "LogGenerator/Packets/Packet.h"
#include "LogGenerator/Packets/Section.h"
#include "Platform/PropertyList.h"

namespace kestro {

class Base;

/// Section name to decoder: the last one registered under each name.
using ClassDictionary = std::map<std::string, Base*, std::less<>>;

/// Log code, as its plain decimal text ("16762" for 0x417A), to its subscribers in the order in
/// which they were added. Codes are also found by number, as every packet asks for one.
class CodeDictionary {
 public:
  /// The code's key: plain decimal text.
  [[nodiscard]] static std::string keyOf(LogCode code);

  /// Appends a subscriber, making the code's list when there is none.
  void append(LogCode code, Base& subscriber);
  /// The code's subscribers; a null pointer when nobody wants it.
  [[nodiscard]] const std::vector<Base*>* find(LogCode code) const noexcept;
  /// The keys, in the order in which their codes were first asked for.
  [[nodiscard]] std::vector<std::string> keys() const;

 private:
  std::unordered_map<LogCode, std::vector<Base*>> _subscribers;
  std::vector<LogCode> _codes;
};

/// A decoder. It turns packets into the contents of its section, a container inside the current
/// display that it does not own. Main thread only.
class Base {
 public:
  virtual ~Base() = default;
  Base(const Base&) = delete;
  Base& operator=(const Base&) = delete;

  /// Enters the decoder under its section name and its log codes.
  void initWithDictCodeDict(ClassDictionary& sections, CodeDictionary& codes);

  [[nodiscard]] virtual std::string_view getSectionName() const = 0;
  /// The codes it subscribes to, in order; extra codes carry their offset.
  [[nodiscard]] virtual std::span<const LogCode> getLogCodeArray() const = 0;
  /// Which kind of container its section is.
  [[nodiscard]] virtual SectionKind sectionKind() const = 0;
  /// Decodes one packet, header included, and rewrites the section. Throws
  /// ArrayOutOfBoundsException for a record index past its count.
  virtual void updateWithDataLogCode(const Packet& packet, LogCode code) = 0;

  /// Visits every value that the decoder takes from the packet; nothing for a code without values.
  virtual void explainPacket(const Packet& packet, LogCode code,
                             const ExplainVisitor& visit) const = 0;
  /// What the decoder takes from a code that it subscribes to.
  [[nodiscard]] virtual CatalogueEntry catalogueCode(LogCode code) const = 0;
  /// What `explainPacket` visits in packets of a code that it subscribes to.
  [[nodiscard]] virtual Outline outlineCode(LogCode code) const = 0;

  /// Makes `section` the container that the decoder writes into.
  void updateSectionRef(const Value& section);
  /// Appends the decoder to the list of each of its codes.
  void updateLogCodeDict(CodeDictionary& codes);

  /// Whole dB of a linear Ec/N0, by the table in EcnoTable.h.
  [[nodiscard]] static std::int16_t lookUpECNO(std::uint32_t linear) noexcept;

  /// Removes all elements, under the array lock.
  static void clearElementsInArray(Array& array) { takeElementsOfArray(array); }
  /// Like `clearElementsInArray`, returning what was there.
  static std::vector<Value> takeElementsOfArray(Array& array);
  /// Replaces all elements, under the array lock.
  static void replaceArrayWith(Array& array, std::vector<Value> elements);

 protected:
  explicit Base(const GeneratorServices& services);

  [[nodiscard]] const GeneratorServices& services() const noexcept { return _services; }
  [[nodiscard]] SystemLog& systemLog() const noexcept { return _services.systemLog; }
  /// The section as a list or as a dictionary; a null handle before the template was processed, and
  /// when the template has a container of the other kind there.
  [[nodiscard]] Array sectionList() const { return _sectionRef.lock().array(); }
  [[nodiscard]] Dictionary sectionDictionary() const { return _sectionRef.lock().dictionary(); }

  void reportUnknownCode(LogCode code) const;

 private:
  GeneratorServices _services;
  WeakValue _sectionRef;
};

}  // namespace kestro
