// SPDX-License-Identifier: MIT
#include "Model/KestroModel.h"

#include <fmt/format.h>

#include <utility>

#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"
#include "Platform/TelephonyService.h"
#include "Platform/Uuids.h"

namespace kestro {
namespace {

constexpr std::int32_t kMessageId = messageId(TelephonyMessage::Channel);

}  // namespace

std::shared_ptr<KestroModel> KestroModel::create(
    Platform& platform, std::function<void()> updateViewControllerFromModel,
    GeneratorFactory generatorFromTechnology) {
  return std::shared_ptr<KestroModel>(new KestroModel(
      platform, std::move(updateViewControllerFromModel), std::move(generatorFromTechnology)));
}

KestroModel::KestroModel(Platform& platform, std::function<void()> updateViewControllerFromModel,
                         GeneratorFactory generatorFromTechnology)
    : _platform(platform),
      _updateViewControllerFromModel(std::move(updateViewControllerFromModel)),
      _generatorFromTechnology(std::move(generatorFromTechnology)) {}

KestroModel::~KestroModel() {
  _platform.telephonyService().cancelNotifications();
  destroyPorts();
}

bool KestroModel::isConnected() const noexcept { return _recvPort && _sendPort; }

// --- Ports ---------------------------------------------------------------------------------------

bool KestroModel::createPorts() {
  const auto uuid = _platform.uuids().create();
  if (!uuid) return false;
  const std::string name = fmt::format("KestroApp.{}", *uuid);
  createLocalPort(name);
  if (!createRemotePort(name)) return false;
  _platform.systemLog().log(LogPriority::Error, " ***** Created ports (send={}, recv={})",
                            addressText(_sendPort.get()), addressText(_recvPort.get()));
  return isConnected();
}

void KestroModel::createLocalPort(std::string_view name) {
  _recvPort = _platform.messagePorts().createLocalPort(
      name, [this](std::int32_t messageId, ByteView message) -> std::optional<Bytes> {
        if (messageId == kMessageId) updateWithData(message);
        return std::nullopt;
      });
  // Without a port the request for a channel goes out all the same, and fails or is torn down.
  if (!_recvPort) return;
  _recvPort->setInvalidationHandler(
      [this, port = _recvPort.get()] { receivePortInvalidated(port); });
}

bool KestroModel::createRemotePort(std::string_view localPortName) {
  TelephonyService& telephony = _platform.telephonyService();
  const auto connection = telephony._TqServerConnectionCreate([this] { refresh(); });
  if (!connection) {
    logError("Could not create TqServerConnection");
    return false;
  }
  const LogChannelReply channel =
      telephony._TqServerConnectionNetworkMonitorCreateLogChannel(*connection, localPortName);
  if (channel.error != 0) {
    _platform.systemLog().log(
        LogPriority::Error, "_TqServerConnectionNetworkMonitorCreateLogChannel returns error: {}!",
        channel.error);
    return false;
  }
  if (!channel.portName || channel.portName->empty()) {
    logError("Could not create a log channel (Tq returned null port)!");
    return false;
  }
  _sendPort = _platform.messagePorts().createRemotePort(*channel.portName);
  if (!_sendPort) logError("Could not create the remote port!");
  return _sendPort != nullptr;
}

void KestroModel::receivePortInvalidated(const LocalPort* port) {
  _platform.systemLog().log(LogPriority::Error, " ***** INVALIDATED {} *****", addressText(port));
  restartMonitor();
}

void KestroModel::destroyPorts() {
  if (const auto timer = std::exchange(_displayUpdateTimer, nullptr)) timer->invalidate();
  if (const auto port = std::exchange(_recvPort, nullptr)) {
    port->setInvalidationHandler({});  // closing the port is no reason to restart
    port->invalidate();
  }
  if (const auto port = std::exchange(_sendPort, nullptr)) port->invalidate();
}

// --- Connect cycle -------------------------------------------------------------------------------

void KestroModel::configureGenerator() {
  const Dictionary command{{kTelephonyGetTechnology, kTelephonyGetTechnology}};
  const auto request = _platform.propertyListCoding().xml(command);
  if (!request) {
    logError(" Could not generate GetTechnology command; cannot configure");
    return;
  }
  const RemotePort::Reply reply =
      _sendPort->request(kMessageId, *request, kCommandTimeout, kCommandTimeout);
  if (reply.error != SendError::None) {
    _platform.systemLog().log(LogPriority::Error,
                              " ***** Could not send the GetTechnology command (got error={})",
                              static_cast<int>(reply.error));
    return;
  }
  if (!reply.data) {
    logError(" ***** No response to GetTechnology; cannot configure");
    return;
  }
  setGeneratorFromReply(*reply.data);
}

void KestroModel::setGeneratorFromReply(ByteView reply) {
  const Result<Value> parsed = _platform.propertyListCoding().parse(reply);
  if (!parsed) {
    logError(" ***** Could not parse reply to GetTechnology; cannot configure");
    return;
  }
  const Value technology = parsed->dictionary()[kTelephonyGetTechnology];
  if (technology.isNull()) {
    logError(" ***** Reply to GetTechnology had no answer; cannot configure");
    return;
  }
  setGenerator(technology.text());
  _platform.systemLog().log(LogPriority::Error, "Got log generated: {}",
                            addressText(_logGenerator.get()));
}

void KestroModel::setGenerator(std::string_view technology) {
  _logGenerator = _generatorFromTechnology(_platform, technology);
  if (!_logGenerator) return;
  if (technology != _technology) {
    // A display of another technology would be neither shown right nor ever updated again.
    for (const std::string_view key : _stateKeysOfTechnology) _state.remove(key);
  }
  _technology = technology;
  const auto keys = _logGenerator->stateKeys();
  _stateKeysOfTechnology.assign(keys.begin(), keys.end());
}

void KestroModel::startMonitor() {
  if (_displayUpdateTimer || tryStartMonitor()) return;
  destroyPorts();
  _platform.mainQueue().postAfter(kRetryDelay,
                                  [model = shared_from_this()] { model->startMonitor(); });
}

bool KestroModel::tryStartMonitor() {
  if (!createPorts()) {
    logError("Could not create the ports necessary");
    return false;
  }
  configureGenerator();
  if (!_logGenerator) {
    logError("No log generator technology works");
    return false;
  }
  const auto command = _platform.propertyListCoding().xml(_logGenerator->getStartCommand());
  if (!command) {
    logError(" Could not generate PLIST");
    return false;
  }
  const SendError error = _sendPort->send(kMessageId, *command, kCommandTimeout);
  if (error != SendError::None) {
    _platform.systemLog().log(LogPriority::Error,
                              " ***** Could not send the START command (got error={})",
                              static_cast<int>(error));
    return false;
  }
  logError("Starting the display update timer");
  _displayUpdateTimer =
      _platform.mainQueue().scheduleRepeating(kDisplayUpdateInterval, [this] { refresh(); });
  return true;
}

void KestroModel::restartMonitor() {
  destroyPorts();
  startMonitor();
}

// --- Display -------------------------------------------------------------------------------------

void KestroModel::refresh() {
  if (isConnected() && !_sendPort->isValid()) {
    // Its handler restarts the monitor, which lets go of the port that is being invalidated.
    const std::shared_ptr<LocalPort> port = _recvPort;
    port->invalidate();
  }
  if (!_updated) return;
  _updated = false;
  _nodes.reset();
  _nodesByPath.reset();
  _platform.mainQueue().post(_updateViewControllerFromModel);
}

NodePointer KestroModel::topLevelNodes() {
  if (_nodes || !_logGenerator) return _nodes;
  const Value display = _logGenerator->generateLogUsingState(_state);
  _nodesByPath = std::make_unique<NodesByPath>();
  _nodes = KestroModelNode::makeTreeFromObjectWithPathDictionary(display, *_nodesByPath);
  return _nodes;
}

NodePointer KestroModel::nodeAtPath(std::string_view path) {
  if (!_nodesByPath) static_cast<void>(topLevelNodes());
  if (!_nodesByPath) return nullptr;
  const auto found = _nodesByPath->find(path);
  return found == _nodesByPath->end() ? nullptr : found->second;
}

void KestroModel::updateWithData(ByteView data) {
  if (_logGenerator) _logGenerator->updateStateWithData(_state, data);
  _updated = true;
}

Value KestroModel::getSaveContents() {
  if (!_logGenerator) return {};
  return _logGenerator->getSaveContentsFromState(_state);
}

void KestroModel::logError(std::string_view line) {
  _platform.systemLog().write(LogPriority::Error, line);
}

}  // namespace kestro
