// SPDX-License-Identifier: MIT
// The generator of the LTE channel.
#pragma once

#include <memory>
#include <string_view>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

namespace kestro {

/// The resource that is its template.
inline constexpr std::string_view kLTETemplate = "LTE";

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
