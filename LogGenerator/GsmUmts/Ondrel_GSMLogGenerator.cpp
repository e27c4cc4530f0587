// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"

#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "Platform/Platform.h"
#include "Platform/SystemLog.h"

namespace kestro {

std::unique_ptr<Ondrel_GSMLogGenerator> Ondrel_GSMLogGenerator::generator(Platform& platform) {
  return std::make_unique<Ondrel_GSMLogGenerator>(platform);
}

Ondrel_GSMLogGenerator::Ondrel_GSMLogGenerator(Platform& platform) : OndrelLogGenerator2(platform) {
  platform.systemLog().write(LogPriority::Error, "Creating Ondrel_GSMLogGenerator object");
  initWithPListNameCIndexObj("Ondrel_GSM", std::make_unique<Ondrel_GSMClassIndex>(platform));
}

Ondrel_GSMLogGenerator::~Ondrel_GSMLogGenerator() {
  platform().systemLog().log(LogPriority::Warning, "Ondrel_GSMLogGenerator is destructed {}",
                             addressText(this));
}

}  // namespace kestro
