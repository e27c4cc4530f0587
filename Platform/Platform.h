// SPDX-License-Identifier: MIT
// Everything the program asks of the platform it runs on, in one place.
#pragma once

namespace kestro {

class Bundle;
class Clock;
class DeviceRoot;
class InputStreams;
class MainQueue;
class MessagePorts;
class ModemService;
class PositionService;
class Preferences;
class PropertyListCoding;
class SystemLog;
class TelephonyService;
class TextSink;
class Uuids;

/// The platform's services. A Platform outlives every object that was given a reference to it; the
/// references that it returns stay the same for its whole life. Main thread only.
class Platform {
 public:
  Platform() = default;
  virtual ~Platform() = default;
  Platform(const Platform&) = delete;
  Platform& operator=(const Platform&) = delete;

  [[nodiscard]] virtual SystemLog& systemLog() = 0;
  /// The developer's console: standard error, apart from the system log.
  [[nodiscard]] virtual TextSink& consoleLog() = 0;
  /// Takes the lines that decoders write to standard output.
  [[nodiscard]] virtual TextSink& standardOutput() = 0;
  [[nodiscard]] virtual Clock& clock() = 0;
  [[nodiscard]] virtual Bundle& bundle() = 0;
  [[nodiscard]] virtual PropertyListCoding& propertyListCoding() = 0;
  [[nodiscard]] virtual MainQueue& mainQueue() = 0;
  [[nodiscard]] virtual MessagePorts& messagePorts() = 0;
  [[nodiscard]] virtual TelephonyService& telephonyService() = 0;
  [[nodiscard]] virtual InputStreams& inputStreams() = 0;
  [[nodiscard]] virtual Uuids& uuids() = 0;
  [[nodiscard]] virtual Preferences& preferences() = 0;
  [[nodiscard]] virtual DeviceRoot& deviceRoot() = 0;
  [[nodiscard]] virtual ModemService& modemService() = 0;
  [[nodiscard]] virtual PositionService& positionService() = 0;
};

}  // namespace kestro
