// SPDX-License-Identifier: MIT
// The registry of a technology's decoders.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/Ondrel/Base.h"

namespace kestro {

/// Maps section names and log codes to decoders. Each technology derives an index that makes its
/// decoders in a fixed order, which is also the order in which subscribers of one code are called.
class ClassIndex {
 public:
  explicit ClassIndex(const GeneratorServices& services) noexcept : _services(services) {}
  /// Leaves a line on the standard output.
  virtual ~ClassIndex();
  ClassIndex(const ClassIndex&) = delete;
  ClassIndex& operator=(const ClassIndex&) = delete;

  /// The decoder that was registered last under a section name; null when there is none.
  [[nodiscard]] Base* getClass(std::string_view sectionName) const noexcept;
  /// The subscribers of a code in construction order; a null pointer when nobody wants it.
  [[nodiscard]] const std::vector<Base*>* getSubscribers(LogCode code) const noexcept {
    return codeDictionary.find(code);
  }
  /// Every wanted code as decimal text; in the order in which decoders first asked for them.
  [[nodiscard]] std::vector<std::string> getAllLogCodes() const { return codeDictionary.keys(); }
  /// Leaves two diagnostic lines about the registry in the system log.
  void status() const;

 protected:
  [[nodiscard]] const GeneratorServices& services() const noexcept { return _services; }

  /// Makes a decoder and registers it. The index's derived class owns it through the result.
  template <class Decoder>
  [[nodiscard]] std::unique_ptr<Decoder> make() {
    auto decoder = std::make_unique<Decoder>(_services);
    decoder->initWithDictCodeDict(classDict, codeDictionary);
    return decoder;
  }

 private:
  GeneratorServices _services;
  ClassDictionary classDict;
  CodeDictionary codeDictionary;
};

}  // namespace kestro
