// SPDX-License-Identifier: MIT
// Where the machine is, as gpsd says it.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestro {

/// Where a receiver is. Numbers are finite; degrees lie within ±90 and ±180.
struct PositionFix {
  double latitude = 0;                            ///< degrees, north is positive
  double longitude = 0;                           ///< degrees, east is positive
  std::optional<double> altitude = std::nullopt;  ///< metres above the sea
  std::optional<double> speed = std::nullopt;     ///< km/h over ground
  std::optional<double> course = std::nullopt;    ///< degrees from north, clockwise

  friend bool operator==(const PositionFix&, const PositionFix&) = default;
};

/// Where a gpsd is.
struct PositionServer {
  std::string host = "localhost";
  std::string port = "2947";
};

/// Who is told; both run on the main thread, and never inside `follow`.
struct PositionHandlers {
  /// The receiver's position; nothing when it has none.
  std::function<void(const std::optional<PositionFix>& fix)> moved;
  /// Why no position comes, such as that gpsd cannot be reached; it is tried again.
  std::function<void(std::string_view reason)> failed;
};

/// Positions that are being followed. Destroying it ends that: no handler runs afterwards.
class PositionFeed {
 public:
  PositionFeed() = default;
  virtual ~PositionFeed() = default;
  PositionFeed(const PositionFeed&) = delete;
  PositionFeed& operator=(const PositionFeed&) = delete;
};

/// Main thread only; nothing here waits for gpsd.
class PositionService {
 public:
  PositionService() = default;
  virtual ~PositionService() = default;
  PositionService(const PositionService&) = delete;
  PositionService& operator=(const PositionService&) = delete;

  /// Begins to follow a gpsd's positions. The handlers must be set. The service outlives its feeds.
  [[nodiscard]] virtual std::unique_ptr<PositionFeed> follow(const PositionServer& server,
                                                             PositionHandlers handlers) = 0;
};

}  // namespace kestro
