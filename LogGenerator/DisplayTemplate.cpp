// SPDX-License-Identifier: MIT
#include "LogGenerator/DisplayTemplate.h"

#include "Platform/Bundle.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

Value loadTemplate(const GeneratorServices& services, std::string_view name) {
  const auto contents = services.bundle.resource(name, kTemplateExtension);
  if (!contents) return {};
  Result<Value> parsed = services.propertyListCoding.parse(*contents);
  return parsed && parsed->isDictionary() ? *parsed : Value();
}

Value templateOfState(const GeneratorServices& services, std::string_view name, Dictionary& state) {
  Value known = state[kStateTemplate];
  if (!known.isNull()) return known;
  Value loaded = loadTemplate(services, name);
  if (!loaded.isNull()) state.set(kStateTemplate, loaded);
  return loaded;
}

}  // namespace kestro
