// SPDX-License-Identifier: MIT
// A platform without an operating system: its time passes when told to, its ports are in memory,
// and its services fail when asked to. For tests, fuzzers and benchmarks.
#pragma once

#include "Platform/Platform.h"
#include "Platform/Virtual/InMemoryPorts.h"
#include "Platform/Virtual/VirtualMainQueue.h"
#include "Platform/Virtual/VirtualModemService.h"
#include "Platform/Virtual/VirtualPositionService.h"
#include "Platform/Virtual/VirtualServices.h"

namespace kestro {

class VirtualPlatform : public Platform {
 public:
  /// `coding` serialises and parses; it must outlive this platform.
  explicit VirtualPlatform(const PropertyListCoding& coding) : _coding(coding) {}

  [[nodiscard]] RecordingSystemLog& systemLog() override { return _systemLog; }
  [[nodiscard]] RecordingTextSink& consoleLog() override { return _consoleLog; }
  [[nodiscard]] RecordingTextSink& standardOutput() override { return _standardOutput; }
  [[nodiscard]] VirtualClock& clock() override { return _clock; }
  [[nodiscard]] VirtualBundle& bundle() override { return _bundle; }
  [[nodiscard]] ScriptedPropertyListCoding& propertyListCoding() override { return _coding; }
  [[nodiscard]] VirtualMainQueue& mainQueue() override { return _mainQueue; }
  [[nodiscard]] InMemoryPorts& messagePorts() override { return _messagePorts; }
  [[nodiscard]] VirtualTelephonyService& telephonyService() override { return _telephonyService; }
  [[nodiscard]] VirtualInputStreams& inputStreams() override { return _inputStreams; }
  [[nodiscard]] VirtualUuids& uuids() override { return _uuids; }
  [[nodiscard]] VirtualPreferences& preferences() override { return _preferences; }
  [[nodiscard]] VirtualDeviceRoot& deviceRoot() override { return _deviceRoot; }
  [[nodiscard]] VirtualModemService& modemService() override { return _modemService; }
  [[nodiscard]] VirtualPositionService& positionService() override { return _positionService; }

 private:
  RecordingSystemLog _systemLog;
  RecordingTextSink _consoleLog;
  RecordingTextSink _standardOutput;
  VirtualClock _clock;
  VirtualBundle _bundle;
  ScriptedPropertyListCoding _coding;
  VirtualTelephonyService _telephonyService;
  VirtualInputStreams _inputStreams;
  VirtualUuids _uuids;
  VirtualPreferences _preferences;
  VirtualDeviceRoot _deviceRoot;
  VirtualMainQueue _mainQueue{_clock};
  InMemoryPorts _messagePorts{_mainQueue};
  VirtualModemService _modemService{_mainQueue};
  VirtualPositionService _positionService;
};

}  // namespace kestro
