// SPDX-License-Identifier: MIT
#include "LogGenerator/DisplayTemplate.h"

#include "Platform/Bundle.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {

Value loadTemplate(Platform& platform, std::string_view name) {
  const auto contents = platform.bundle().resource(name, kTemplateExtension);
  if (!contents) return {};
  Result<Value> parsed = platform.propertyListCoding().parse(*contents);
  return parsed && parsed->isDictionary() ? *parsed : Value();
}

Value templateOfState(Platform& platform, std::string_view name, Dictionary& state) {
  Value known = state[kStateTemplate];
  if (!known.isNull()) return known;
  Value loaded = loadTemplate(platform, name);
  if (!loaded.isNull()) state.set(kStateTemplate, loaded);
  return loaded;
}

}  // namespace kestro
