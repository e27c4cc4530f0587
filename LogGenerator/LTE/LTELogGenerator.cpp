// SPDX-License-Identifier: MIT
#include "LogGenerator/LTE/LTELogGenerator.h"

#include <string>

#include "LogGenerator/GeneratorServices.h"
#include "LogGenerator/LTE/LTEClassIndex.h"
#include "Platform/SystemLog.h"

namespace kestro {

std::unique_ptr<LTELogGenerator> LTELogGenerator::generator(const GeneratorServices& services) {
  return std::make_unique<LTELogGenerator>(services);
}

LTELogGenerator::LTELogGenerator(const GeneratorServices& services)
    : OndrelLogGenerator2(services) {
  services.systemLog.write(LogPriority::Error, "Creating LTELogGenerator object");
  initWithPListNameCIndexObj(std::string(kLTETemplate), std::make_unique<LTEClassIndex>(services));
}

LTELogGenerator::~LTELogGenerator() {
  services().systemLog.log(LogPriority::Warning, "LTELogGenerator is destructed {}",
                           addressText(this));
}

}  // namespace kestro
