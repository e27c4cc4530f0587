// SPDX-License-Identifier: MIT
// The one object that talks to the telephony server: it keeps a log channel open, hands its
// messages to the technology's generator and keeps the tree of display nodes.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "Model/KestroModelNode.h"
#include "Platform/MainQueue.h"
#include "Platform/MessagePort.h"

namespace kestro {

/// How often the display is refreshed while connected.
inline constexpr std::chrono::seconds kDisplayUpdateInterval{2};
/// How long after a failure the whole connect cycle is run again.
inline constexpr std::chrono::seconds kRetryDelay{5};
/// The most that one command to the log channel waits to be sent, and its reply to arrive.
inline constexpr std::chrono::seconds kCommandTimeout{1};

/// Main thread only. The platform outlives the model. A model that waits for its next attempt to
/// connect is kept alive by that attempt.
class KestroModel : public std::enable_shared_from_this<KestroModel> {
 public:
  /// Makes the generator for a technology; null when there is none.
  using GeneratorFactory =
      std::function<std::unique_ptr<LogGenerator>(Platform& platform, std::string_view technology)>;

  /// A model with an empty state and no ports. `updateViewControllerFromModel` is called on the
  /// main queue when the display must be rebuilt; it may outlive the model in a queued call.
  [[nodiscard]] static std::shared_ptr<KestroModel> create(
      Platform& platform, std::function<void()> updateViewControllerFromModel,
      GeneratorFactory generatorFromTechnology = LogGenerator::generatorFromTechnology);

  ~KestroModel();
  KestroModel(const KestroModel&) = delete;
  KestroModel& operator=(const KestroModel&) = delete;

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

  void createLocalPort(std::string_view name);
  [[nodiscard]] bool createRemotePort(std::string_view localPortName);
  /// Everything of a start but the retry; false when a step failed.
  [[nodiscard]] bool tryStartMonitor();
  void setGeneratorFromReply(ByteView reply);
  void setGenerator(std::string_view technology);
  void receivePortInvalidated(const LocalPort* port);
  void logError(std::string_view line);

  Platform& _platform;
  std::function<void()> _updateViewControllerFromModel;
  GeneratorFactory _generatorFromTechnology;

  std::shared_ptr<LocalPort> _recvPort;
  std::shared_ptr<RemotePort> _sendPort;
  std::unique_ptr<Timer> _displayUpdateTimer;
  Dictionary _state;
  NodePointer _nodes;
  std::unique_ptr<NodesByPath> _nodesByPath;
  std::unique_ptr<LogGenerator> _logGenerator;
  std::string _technology;  ///< the last one that had a generator
  std::vector<std::string_view> _stateKeysOfTechnology;
  bool _updated = false;
};

}  // namespace kestro
