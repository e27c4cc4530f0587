// SPDX-License-Identifier: MIT
#include "Tests/Soak/LiveSystem.h"

#include <chrono>
#include <string>
#include <utility>
#include <variant>

#include "LogGenerator/LogGenerator.h"
#include "Platform/TelephonyProtocol.h"
#include "Sources/SourceCatalogue.h"
#include "TelephonyServer/ChannelCommand.h"
#include "Tests/Soak/CountingGenerator.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::soak {
namespace {

constexpr std::string_view kServerName = "TelephonyServer";
constexpr std::chrono::seconds kRequestTimeout{1};

void require(bool holds, std::string_view promise) {
  if (!holds) throw BrokenPromise{std::string(promise)};
}

std::size_t countNodes(const KestroModelNode& node) {
  std::size_t count = 1;
  if (const auto* children = node.childNodes()) {
    for (const NodePointer& child : *children) count += countNodes(*child);
  }
  return count;
}

}  // namespace

LiveSystem::LiveSystem(std::string_view technology, double speed, std::size_t premadeCount)
    : _technology(technology), _speed(speed) {
  testing::addTemplates(_platform);
  _platform.systemLog().setThreshold(LogPriority::Error);
  connectService();
  _model = KestroModel::create(
      _platform, [this] { redraw(); },
      [this](const GeneratorServices&, std::string_view name) { return makeGenerator(name); });
  if (premadeCount != 0) {
    _premade = std::make_shared<PremadeMessages>(*openSimulation(), premadeCount);
  }
}

std::unique_ptr<LogGenerator> LiveSystem::makeGenerator(std::string_view technology) {
  auto generator = LogGenerator::generatorFromTechnology(generatorServices(_platform), technology);
  require(generator != nullptr, "the server names a technology");
  const auto command = parseChannelCommand(*_coding, *_coding->xml(generator->getStartCommand()));
  require(command && std::holds_alternative<StartCommand>(*command), "the start command is one");
  _filter = std::get<StartCommand>(*command).filter;
  return std::make_unique<CountingGenerator>(generatorServices(_platform), std::move(generator),
                                             _counts.received);
}

void LiveSystem::connectService() {
  _platform.telephonyService().setChannelHandler(
      [this](std::string_view localPort) { return requestChannel(localPort); });
}

LogChannelReply LiveSystem::requestChannel(std::string_view localPort) {
  const auto server = _platform.messagePorts().createRemotePort(kServerName);
  if (!server) return {.error = static_cast<long>(SendError::InvalidPort), .portName = {}};
  const auto reply = server->request(messageId(TelephonyMessage::CreateLogChannel),
                                     *_coding->xml(Dictionary{{kTelephonyLocalPort, localPort}}),
                                     kRequestTimeout, kRequestTimeout);
  if (reply.error != SendError::None) {
    return {.error = static_cast<long>(reply.error), .portName = {}};
  }
  const Dictionary answer = _coding->parse(*reply.data)->dictionary();
  return {.error = static_cast<long>(answer[kTelephonyError].integerBits()),
          .portName = std::string(answer[kTelephonyPort].text())};
}

void LiveSystem::start() { _model->startMonitor(); }

std::unique_ptr<LogSource> LiveSystem::openSimulation() {
  auto source = openSource({.kind = "simulation", .argument = {}, .technology = _technology},
                           sourceServices(_platform), [](std::string_view) {});
  require(source.has_value(), "the simulation opens");
  return std::move(*source);
}

void LiveSystem::startServer() {
  const SourceReporter ignore = [](std::string_view) {};
  std::unique_ptr<LogSource> source =
      _premade ? std::make_unique<PremadeSource>(_premade) : openSimulation();
  auto server = Server::open(_platform, kServerName, _technology, [] {});
  require(server.has_value(), "a server can take the name of one that is gone");
  _server = std::move(*server);
  _listener = std::make_unique<CountingListener>(*_server, _filter, _counts);
  _playback =
      std::make_unique<Playback>(std::move(source), PlaybackOptions{.speed = _speed, .loop = true},
                                 _platform.mainQueue(), _platform.clock(), *_listener, ignore);
  _playback->start();
}

void LiveSystem::killServer() {
  _playback.reset();
  _listener.reset();
  _server.reset();
}

void LiveSystem::setServerStopped(bool isStopped) {
  for (const std::string& name : _platform.messagePorts().names()) {
    _platform.messagePorts().setStalled(name, isStopped);
  }
}

void LiveSystem::passTick() {
  _platform.mainQueue().advance(kDisplayUpdateInterval);
  static_cast<void>(_platform.systemLog().take());
}

void LiveSystem::redraw() {
  ++_redraws;
  const NodePointer root = _model->topLevelNodes();
  _nodeCount = root ? countNodes(*root) : 0;
}

void LiveSystem::check() {
  require(historySize() <= kMaximumHistoryEntries, "a history keeps at most five entries");
  require(_platform.mainQueue().pending() < 100, "no blocks pile up on the main queue");
  require(_server == nullptr || _server->channelCount() <= 1,
          "a client that reconnects leaves no channel behind");
}

std::size_t LiveSystem::historySize() {
  const Array contents = _model->getSaveContents().array();
  std::size_t entries = 0;
  for (const Value& entry : contents) {
    if (entry.dictionary().contains(Value(kHistoryDate))) ++entries;
  }
  return entries;
}

}  // namespace kestro::soak
