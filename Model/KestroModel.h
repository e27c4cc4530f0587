// SPDX-License-Identifier: MIT
// The display of a log channel: hands the channel's messages to the technology's generator and
// keeps the tree of display nodes.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>

#include "LogGenerator/LogGenerator.h"
#include "Model/KestroModelNode.h"
#include "Model/LogChannelClient.h"
#include "Model/StateOwner.h"
#include "Platform/MainQueue.h"
#include "Platform/Platform.h"

namespace kestro {

/// How often the display is refreshed while connected.
inline constexpr std::chrono::seconds kDisplayUpdateInterval{2};

/// Main thread only. The platform outlives the model. A model that waits for its next attempt to
/// connect is kept alive by that attempt.
class KestroModel : public std::enable_shared_from_this<KestroModel>, private LogChannelUser {
 public:
  /// Makes the generator for a technology; null when there is none.
  using GeneratorFactory = std::function<std::unique_ptr<LogGenerator>(
      const GeneratorServices& services, std::string_view technology)>;

  /// A model with an empty state and no ports. `updateViewControllerFromModel` is called on the
  /// main queue when the display must be rebuilt; it may outlive the model in a queued call.
  [[nodiscard]] static std::shared_ptr<KestroModel> create(
      Platform& platform, std::function<void()> updateViewControllerFromModel,
      GeneratorFactory generatorFromTechnology = LogGenerator::generatorFromTechnology);

  ~KestroModel() override;
  KestroModel(const KestroModel&) = delete;
  KestroModel& operator=(const KestroModel&) = delete;

  /// `connectionChanged` is called, while the model lives, when the connection has come or gone;
  /// one that is replaced at once has not gone. It runs within the model's operations and must not
  /// destroy the model.
  void setConnectionHandler(std::function<void(bool isConnected)> connectionChanged);

  /// `changed` is called, while the model lives, when `technology`, `source` or `problem` says
  /// something else. It runs within the model's operations and must not destroy the model.
  void setNewsHandler(std::function<void()> changed);

  /// The technology of the display, as the server names it; empty before the first one.
  [[nodiscard]] const std::string& technology() const noexcept { return _stateOwner.technology(); }
  /// What the server last said of its source.
  [[nodiscard]] const LogSourceState& source() const noexcept { return _source; }
  /// Why the last attempt to connect failed; absent while connected and before the first one.
  [[nodiscard]] const std::optional<ConnectionProblem>& problem() const noexcept {
    return _problem;
  }

  /// Whether both ports exist; it does not look whether they still work.
  [[nodiscard]] bool isConnected() const noexcept;

  /// Opens the local port, the log channel and the remote port to it; false when one is missing.
  bool createPorts();
  /// Stops the timer and closes both ports; generator, state and cached tree stay.
  void destroyPorts();
  /// Asks for the technology and makes its generator; the ports must exist. A request that fails,
  /// or a reply without a technology, leaves the generator as it was; a technology that nobody
  /// speaks leaves the model without one. Display and state stay in any case.
  void configureGenerator();
  /// Connects, configures, sends the start command and starts the refresh timer; after a failure it
  /// closes the ports and tries again in 5 s. Does nothing while the timer runs.
  void startMonitor();
  /// `destroyPorts`, then `startMonitor`.
  void restartMonitor();
  /// A tick of the timer, or a notification of the telephony server: restarts the monitor when the
  /// log channel is gone, and, when new data arrived, drops the tree and asks for a redraw.
  void refresh();

  /// The display tree, built when it is not cached; without a generator the cached one, or
  /// null.
  [[nodiscard]] NodePointer topLevelNodes();
  /// The node at a path ("/" is the root); null when there is none.
  [[nodiscard]] NodePointer nodeAtPath(std::string_view path);

  /// Hands one message to the generator. What the generator throws passes through.
  void updateWithData(ByteView data);

  /// What a snapshot stores, an array of the caller's own; null without a generator.
  [[nodiscard]] Value getSaveContents();

 private:
  KestroModel(Platform& platform, std::function<void()> updateViewControllerFromModel,
              GeneratorFactory generatorFromTechnology);

  void technologyAnswered(std::string_view technology) override;
  [[nodiscard]] std::optional<Dictionary> startCommand() override;
  void messageArrived(ByteView message) override;
  void channelStarted() override;
  void channelStops() override;
  void connectionChanged(bool isConnected) override;
  void sourceTold(const LogSourceState& source) override;
  void connectionFailed(const ConnectionProblem& problem) override;
  void serverNotified() override;
  [[nodiscard]] std::shared_ptr<const void> keptByRetry() override;

  void setGenerator(std::string_view technology);
  void setProblem(std::optional<ConnectionProblem> problem);
  void logError(std::string_view line);

  Platform& _platform;
  std::function<void()> _updateViewControllerFromModel;
  GeneratorFactory _generatorFromTechnology;
  std::function<void(bool isConnected)> _connectionChanged;
  std::function<void()> _newsChanged;

  LogChannelClient _client;
  std::unique_ptr<Timer> _displayUpdateTimer;
  Dictionary _state;
  NodePointer _nodes;
  std::unique_ptr<NodesByPath> _nodesByPath;
  std::unique_ptr<LogGenerator> _logGenerator;
  StateOwner _stateOwner;
  bool _updated = false;
  LogSourceState _source;
  std::optional<ConnectionProblem> _problem;
};

}  // namespace kestro
