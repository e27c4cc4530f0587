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
#include "TelephonyServer/Playback.h"
#include "TelephonyServer/Server.h"

namespace kestro::soak {

/// Counts what a server hands out while it passes it on.
class CountingListener : public PlaybackListener {
 public:
  explicit CountingListener(Server& server, std::uint64_t& count)
      : _server(server), _count(count) {}
  void technologyChanged(std::string_view technology) override {
    _server.technologyChanged(technology);
  }
  void messageDue(ByteView message) override {
    ++_count;
    _server.messageDue(message);
  }

 private:
  Server& _server;
  std::uint64_t& _count;
};

/// A failure of the run, with what was promised.
struct BrokenPromise {
  std::string promise;
};

class LiveSystem {
 public:
  /// `technology` is a constant text; its simulation plays at `speed` times its pace.
  LiveSystem(std::string_view technology, double speed);

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

  [[nodiscard]] std::uint64_t messagesSent() const noexcept { return _sent; }
  [[nodiscard]] std::uint64_t redraws() const noexcept { return _redraws; }
  [[nodiscard]] bool isConnected() const { return _model->isConnected(); }
  [[nodiscard]] std::size_t nodeCount() const noexcept { return _nodeCount; }
  [[nodiscard]] std::size_t historySize();

 private:
  void connectService();
  [[nodiscard]] LogChannelReply requestChannel(std::string_view localPort);
  void redraw();

  std::string_view _technology;
  double _speed;
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  QuietPlatform _platform{*_coding};
  std::unique_ptr<Server> _server;
  std::unique_ptr<CountingListener> _listener;
  std::unique_ptr<Playback> _playback;
  std::uint64_t _sent = 0;
  std::uint64_t _redraws = 0;
  std::size_t _nodeCount = 0;
  std::shared_ptr<KestroModel> _model;
};

}  // namespace kestro::soak
