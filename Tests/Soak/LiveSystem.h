// SPDX-License-Identifier: MIT
// A whole live system in one process: a simulated drive, the server that plays it, the ports and
// the model, on a clock that passes as fast as they can work.
#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

#include "Model/KestroModel.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Virtual/QuietPlatform.h"
#include "TelephonyServer/CodeFilter.h"
#include "TelephonyServer/Playback.h"
#include "TelephonyServer/Server.h"
#include "Tests/Soak/PremadeSource.h"

namespace kestro::soak {

/// How many messages the server played, how many of them the model had asked for, and how many
/// reached its generator.
struct MessageCounts {
  std::uint64_t sent = 0;
  std::uint64_t wanted = 0;
  std::uint64_t received = 0;

  MessageCounts operator-(const MessageCounts& earlier) const {
    return {sent - earlier.sent, wanted - earlier.wanted, received - earlier.received};
  }
};

/// Counts what a server hands out while it passes it on.
class CountingListener : public PlaybackListener {
 public:
  CountingListener(Server& server, const CodeFilter& filter, MessageCounts& counts)
      : _server(server), _filter(filter), _counts(counts) {}
  void technologyChanged(std::string_view technology) override {
    _server.technologyChanged(technology);
  }
  void messageDue(ByteView message, Moment time) override {
    ++_counts.sent;
    if (_filter.accepts(message)) ++_counts.wanted;
    _server.messageDue(message, time);
  }
  void sourceEnded() override { _server.sourceEnded(); }

 private:
  Server& _server;
  const CodeFilter& _filter;
  MessageCounts& _counts;
};

/// A failure of the run, with what was promised.
struct BrokenPromise {
  std::string promise;
};

class LiveSystem {
 public:
  /// `technology` is a constant text; its simulation plays at `speed` times its pace. Unless
  /// `premadeCount` is 0, the drive's first so many messages are made now, and played round and
  /// round.
  LiveSystem(std::string_view technology, double speed, std::size_t premadeCount);

  /// Starts the model; the server is not there yet.
  void start();
  void startServer();
  /// The server is gone at once, as a killed process is: its ports vanish.
  void killServer();
  /// A server that does not answer any more, or does again. Its messages wait.
  void setServerStopped(bool isStopped);

  /// Lets a tick's time pass.
  void passTick();

  /// Looks at the promises that hold at every moment.
  void check();

  [[nodiscard]] const MessageCounts& counts() const noexcept { return _counts; }
  [[nodiscard]] std::uint64_t redraws() const noexcept { return _redraws; }
  [[nodiscard]] bool isConnected() const { return _model->isConnected(); }
  [[nodiscard]] std::size_t nodeCount() const noexcept { return _nodeCount; }
  [[nodiscard]] std::size_t historySize();

 private:
  [[nodiscard]] std::unique_ptr<LogSource> openSimulation();
  void connectService();
  [[nodiscard]] std::unique_ptr<LogGenerator> makeGenerator(std::string_view technology);
  [[nodiscard]] LogChannelReply requestChannel(std::string_view localPort);
  void redraw();

  std::string_view _technology;
  double _speed;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  QuietPlatform _platform{*_coding};
  std::shared_ptr<const PremadeMessages> _premade;  ///< null: the simulation plays
  std::unique_ptr<Server> _server;
  std::unique_ptr<CountingListener> _listener;
  std::unique_ptr<Playback> _playback;
  CodeFilter _filter;  ///< what the model has asked for
  MessageCounts _counts;
  std::uint64_t _redraws = 0;
  std::size_t _nodeCount = 0;
  std::shared_ptr<KestroModel> _model;
};

}  // namespace kestro::soak
