// SPDX-License-Identifier: MIT
// The generator of the LTE channel.
#pragma once

#include <memory>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

namespace kestro {

/// The template-driven generator with the LTE decoders and the template "LTE".
class LTELogGenerator : public OndrelLogGenerator2 {
 public:
  [[nodiscard]] static std::unique_ptr<LTELogGenerator> generator(
      const GeneratorServices& services);

  explicit LTELogGenerator(const GeneratorServices& services);
  /// Leaves a line with the object's address in the system log.
  ~LTELogGenerator() override;
};

}  // namespace kestro
