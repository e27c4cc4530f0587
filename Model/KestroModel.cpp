// SPDX-License-Identifier: MIT
#include "Model/KestroModel.h"

#include <utility>

#include "Platform/SystemLog.h"

namespace kestro {

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
      _generatorFromTechnology(std::move(generatorFromTechnology)),
      _client(platform, *this, ChannelWatch::ByUser) {}

KestroModel::~KestroModel() {
  _connectionChanged = {};
  _newsChanged = {};
  destroyPorts();
}

void KestroModel::setConnectionHandler(std::function<void(bool isConnected)> connectionChanged) {
  _connectionChanged = std::move(connectionChanged);
}

void KestroModel::setNewsHandler(std::function<void()> changed) {
  _newsChanged = std::move(changed);
}

// --- Connection ----------------------------------------------------------------------------------

bool KestroModel::isConnected() const noexcept { return _client.isConnected(); }

bool KestroModel::createPorts() { return _client.openPorts(); }

void KestroModel::destroyPorts() { _client.close(); }

void KestroModel::configureGenerator() { _client.requestTechnology(); }

void KestroModel::startMonitor() { _client.start(); }

void KestroModel::restartMonitor() { _client.restart(); }

void KestroModel::technologyAnswered(std::string_view technology) {
  setGenerator(technology);
  _platform.systemLog().log(LogPriority::Error, "Got log generated: {}",
                            addressText(_logGenerator.get()));
}

void KestroModel::setGenerator(std::string_view technology) {
  _logGenerator = _generatorFromTechnology(generatorServices(_platform), technology);
  if (!_logGenerator) return;
  if (!_stateOwner.handTo(*_logGenerator, technology, _state)) return;
  _updated = false;  // what no tick has seen yet is gone with the display of another technology
  if (_newsChanged) _newsChanged();
}

std::optional<Dictionary> KestroModel::startCommand() {
  if (_logGenerator) return _logGenerator->getStartCommand();
  logError("No log generator technology works");
  return std::nullopt;
}

void KestroModel::messageArrived(ByteView message) { updateWithData(message); }

void KestroModel::channelStarted() {
  logError("Starting the display update timer");
  _displayUpdateTimer =
      _platform.mainQueue().scheduleRepeating(kDisplayUpdateInterval, [this] { refresh(); });
}

void KestroModel::channelStops() {
  if (const auto timer = std::exchange(_displayUpdateTimer, nullptr)) timer->invalidate();
}

void KestroModel::sourceTold(const LogSourceState& source) {
  if (std::exchange(_source, source) != source && _newsChanged) _newsChanged();
}

void KestroModel::connectionFailed(const ConnectionProblem& problem) { setProblem(problem); }

void KestroModel::setProblem(std::optional<ConnectionProblem> problem) {
  if (std::exchange(_problem, problem) != problem && _newsChanged) _newsChanged();
}

void KestroModel::connectionChanged(bool isConnected) {
  if (isConnected) setProblem(std::nullopt);
  if (_connectionChanged) _connectionChanged(isConnected);
}

void KestroModel::serverNotified() { refresh(); }

std::shared_ptr<const void> KestroModel::keptByRetry() { return shared_from_this(); }

// --- Display -------------------------------------------------------------------------------------

void KestroModel::refresh() {
  _client.check();
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
