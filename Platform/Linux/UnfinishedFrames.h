// SPDX-License-Identifier: MIT
// Frames that have begun to arrive and have not ended, on all connections of a process.
#pragma once

#include <QTimer>
#include <chrono>
#include <cstddef>
#include <unordered_map>

namespace kestro {

class PortConnection;

/// Keeps within bounds what peers can make this process hold by leaving frames unfinished: how many
/// bytes of them there are in all, and how long one may wait for its next byte.
class UnfinishedFrames {
 public:
  /// What all connections may hold together; the one that holds most is closed beyond that.
  static constexpr std::size_t kMaximumBytes = std::size_t{64} * 1024 * 1024;
  /// A connection is closed when nothing of its frame has come for so long.
  static constexpr std::chrono::seconds kPatience{10};

  explicit UnfinishedFrames(std::chrono::milliseconds patience);
  UnfinishedFrames(const UnfinishedFrames&) = delete;
  UnfinishedFrames& operator=(const UnfinishedFrames&) = delete;
  ~UnfinishedFrames() = default;

  /// So much of an unfinished frame has arrived on a connection by now; 0 when there is none, which
  /// must be said before the connection's end. May close any connection.
  void count(PortConnection& connection, std::size_t bytes);

 private:
  struct Frame {
    std::size_t bytes = 0;
    std::chrono::steady_clock::time_point lastByte;
  };

  void closeLargest();
  void closeStalled();

  std::chrono::milliseconds _patience;
  std::unordered_map<PortConnection*, Frame> _frames;
  std::size_t _bytes = 0;  ///< of all frames
  QTimer _timer;           ///< runs while there are frames
};

}  // namespace kestro
