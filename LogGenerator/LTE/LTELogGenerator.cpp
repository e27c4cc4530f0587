// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/LTELogGenerator.h"

#include "LogGenerator/LTE/LTEClassIndex.h"
#include "Platform/Platform.h"
#include "Platform/SystemLog.h"

namespace kestro {

std::unique_ptr<LTELogGenerator> LTELogGenerator::generator(Platform& platform) {
  return std::make_unique<LTELogGenerator>(platform);
}

LTELogGenerator::LTELogGenerator(Platform& platform) : OndrelLogGenerator2(platform) {
  platform.systemLog().write(LogPriority::Error, "Creating LTELogGenerator object");
  initWithPListNameCIndexObj("LTE", std::make_unique<LTEClassIndex>(platform));
}

LTELogGenerator::~LTELogGenerator() {
  platform().systemLog().log(LogPriority::Warning, "LTELogGenerator is destructed {}",
                             addressText(this));
}

}  // namespace kestro
