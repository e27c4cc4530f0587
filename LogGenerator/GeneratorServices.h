// SPDX-License-Identifier: MIT
// What generators and decoders ask of the platform, and no more.
#pragma once

namespace kestro {

class Bundle;
class Clock;
class Platform;
class PropertyListCoding;
class SystemLog;
class TextSink;

/// The services of a generator. All of them must outlive every object that was given this struct,
/// which keeps a copy of it.
struct GeneratorServices {
  SystemLog& systemLog;
  TextSink& consoleLog;      ///< the developer's console, apart from the system log
  TextSink& standardOutput;  ///< where the lines go that decoders have for the standard output
  const Clock& clock;        ///< dates the history's entries
  const Bundle& bundle;      ///< holds the display templates, and the names of a log's first record
  const PropertyListCoding& propertyListCoding;
};

/// The platform's own services.
[[nodiscard]] GeneratorServices generatorServices(Platform& platform);

}  // namespace kestro
