// SPDX-License-Identifier: MIT
// The generator of the UTRAN channel.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

namespace kestro {

/// The resource that is its template: the first property list of the bundle whose path contains
/// "UTRAN", in whatever case; nothing when there is none.
[[nodiscard]] std::optional<std::string> utranTemplateName(const Bundle& bundle);

/// The template-driven generator with the UTRAN decoders. Its template is the first property-list
/// resource whose path contains "UTRAN", in whatever case. Without one it has no decoders: it asks
/// for no codes, drops every packet and shows nothing.
class UTRANLogGenerator : public OndrelLogGenerator2 {
 public:
  [[nodiscard]] static std::unique_ptr<UTRANLogGenerator> generator(
      const GeneratorServices& services);

  explicit UTRANLogGenerator(const GeneratorServices& services);
};

}  // namespace kestro
