// SPDX-License-Identifier: MIT
// The program's own display templates for generators on the virtual platform.
#pragma once

#include <memory>
#include <string>

#include "LogGenerator/DisplayTemplate.h"
#include "Platform/Bundle.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro::testing {

/// Makes all templates of the program resources of the platform.
inline void addTemplates(VirtualPlatform& platform) {
  static const std::unique_ptr<Bundle> bundle = createBundle();
  for (const std::string& path : bundle->resourcesOfType(kTemplateExtension)) {
    const auto contents = bundle->resource(path.substr(0, path.rfind('.')), kTemplateExtension);
    if (contents) platform.bundle().setResource(path, *contents);
  }
}

}  // namespace kestro::testing
