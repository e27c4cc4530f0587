// SPDX-License-Identifier: MIT
// Display templates: property lists among the bundle's resources.
#pragma once

#include <string_view>

#include "LogGenerator/GeneratorServices.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// The state's key of the display template, once it was loaded.
inline constexpr std::string_view kStateTemplate = "Template";

/// The extension of the resources that are templates.
inline constexpr std::string_view kTemplateExtension = "plist";

/// The dictionary in the resource `name`, which has the extension above; null when there is no such
/// resource, or it does not parse, or it holds something else.
[[nodiscard]] Value loadTemplate(const Bundle& bundle, const PropertyListCoding& coding,
                                 std::string_view name);
[[nodiscard]] Value loadTemplate(const GeneratorServices& services, std::string_view name);

/// The state's template, whatever it is. When it has none, the one that `loadTemplate` finds, which
/// the state then keeps; null when there is none either.
[[nodiscard]] Value templateOfState(const GeneratorServices& services, std::string_view name,
                                    Dictionary& state);

}  // namespace kestro
