// SPDX-License-Identifier: MIT
// The generator of the UTRAN channel.
#pragma once

#include <memory>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

namespace kestro {

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
