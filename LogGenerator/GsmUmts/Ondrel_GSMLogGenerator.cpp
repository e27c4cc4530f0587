// SPDX-License-Identifier: MIT
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"

#include <string>

#include "LogGenerator/GeneratorServices.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "Platform/SystemLog.h"

namespace kestro {

std::unique_ptr<Ondrel_GSMLogGenerator> Ondrel_GSMLogGenerator::generator(
    const GeneratorServices& services) {
  return std::make_unique<Ondrel_GSMLogGenerator>(services);
}

Ondrel_GSMLogGenerator::Ondrel_GSMLogGenerator(const GeneratorServices& services)
    : OndrelLogGenerator2(services) {
  services.systemLog.write(LogPriority::Error, "Creating Ondrel_GSMLogGenerator object");
  initWithPListNameCIndexObj(std::string(kGsmUmtsTemplate),
                             std::make_unique<Ondrel_GSMClassIndex>(services));
}

Ondrel_GSMLogGenerator::~Ondrel_GSMLogGenerator() {
  services().systemLog.log(LogPriority::Warning, "Ondrel_GSMLogGenerator is destructed {}",
                           addressText(this));
}

}  // namespace kestro
