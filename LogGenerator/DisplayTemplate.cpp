// SPDX-License-Identifier: MIT
#include "LogGenerator/DisplayTemplate.h"

#include "Platform/Bundle.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

Value loadTemplate(const Bundle& bundle, const PropertyListCoding& coding, std::string_view name) {
  const auto contents = bundle.resource(name, kTemplateExtension);
  if (!contents) return {};
  Result<Value> parsed = coding.parse(*contents);
  return parsed && parsed->isDictionary() ? *parsed : Value();
}

Value loadTemplate(const GeneratorServices& services, std::string_view name) {
  return loadTemplate(services.bundle, services.propertyListCoding, name);
}

Value templateOfState(const GeneratorServices& services, std::string_view name, Dictionary& state) {
  Value known = state[kStateTemplate];
  if (!known.isNull()) return known;
  Value loaded = loadTemplate(services, name);
  if (!loaded.isNull()) state.set(kStateTemplate, loaded);
  return loaded;
}

}  // namespace kestro
