// SPDX-License-Identifier: MIT
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

#include <algorithm>
#include <optional>
#include <string>

#include "LogGenerator/DisplayTemplate.h"
#include "LogGenerator/GeneratorServices.h"
#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "Platform/Bundle.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

constexpr std::string_view kTechnologyName = "UTRAN";

char upperCase(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; }

bool namesTechnology(std::string_view path) {
  const auto isSame = [](char found, char wanted) { return upperCase(found) == wanted; };
  return std::search(path.begin(), path.end(), kTechnologyName.begin(), kTechnologyName.end(),
                     isSame) != path.end();
}

/// The name of the resource at `path`: its last component without the extension.
std::string resourceName(std::string_view path) {
  std::string_view name = path.substr(path.rfind('/') + 1);  // npos + 1 is 0
  return std::string(name.substr(0, name.rfind('.')));
}

}  // namespace

std::optional<std::string> utranTemplateName(const Bundle& bundle) {
  const std::vector<std::string> paths = bundle.resourcesOfType(kTemplateExtension);
  const auto path = std::ranges::find_if(paths, namesTechnology);
  if (path == paths.end()) return std::nullopt;
  return resourceName(*path);
}

std::unique_ptr<UTRANLogGenerator> UTRANLogGenerator::generator(const GeneratorServices& services) {
  return std::make_unique<UTRANLogGenerator>(services);
}

UTRANLogGenerator::UTRANLogGenerator(const GeneratorServices& services)
    : OndrelLogGenerator2(services) {
  auto name = utranTemplateName(services.bundle);
  if (!name) return;
  initWithPListNameCIndexObj(std::move(*name), std::make_unique<UTRANClassIndex>(services));
  services.systemLog.write(LogPriority::Error, "Created UTRANLogGenerator object");
}

}  // namespace kestro
