// SPDX-License-Identifier: MIT
// The generator of the GSM/UMTS channel.
#pragma once

#include <memory>
#include <string_view>

#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

namespace kestro {

/// The resource that is its template.
inline constexpr std::string_view kGsmUmtsTemplate = "Ondrel_GSM";

/// The template-driven generator with the GSM/UMTS decoders and the template "Ondrel_GSM".
class Ondrel_GSMLogGenerator : public OndrelLogGenerator2 {
 public:
  [[nodiscard]] static std::unique_ptr<Ondrel_GSMLogGenerator> generator(
      const GeneratorServices& services);

  explicit Ondrel_GSMLogGenerator(const GeneratorServices& services);
  /// Leaves a line with the object's address in the system log.
  ~Ondrel_GSMLogGenerator() override;
};

}  // namespace kestro
