// SPDX-License-Identifier: MIT
#include "LogGenerator/GeneratorServices.h"

#include "Platform/Platform.h"

namespace kestro {

GeneratorServices generatorServices(Platform& platform) {
  return {.systemLog = platform.systemLog(),
          .consoleLog = platform.consoleLog(),
          .standardOutput = platform.standardOutput(),
          .clock = platform.clock(),
          .bundle = platform.bundle(),
          .propertyListCoding = platform.propertyListCoding()};
}

}  // namespace kestro
