// SPDX-License-Identifier: MIT
#include "Platform/Linux/GpsdReader.h"

#include <gps.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <memory>
#include <thread>
#include <utility>

namespace kestro {
namespace {

constexpr int kPieceMicroseconds = 250'000;
constexpr std::chrono::milliseconds kPiece{250};
constexpr int kPiecesBeforeRetry = 8;
/// gpsd reports once a second; after this long without a report its last one is old.
constexpr std::chrono::seconds kSilence{10};
constexpr double kKmhPerMs = 3.6;
constexpr double kMaximumLatitude = 90;
constexpr double kMaximumLongitude = 180;

std::optional<double> finite(double number) {
  return std::isfinite(number) ? std::optional(number) : std::nullopt;
}

std::optional<PositionFix> fixIn(const gps_data_t& data) {
  const gps_fix_t& fix = data.fix;
  const bool isPlace = std::isfinite(fix.latitude) && std::isfinite(fix.longitude) &&
                       std::abs(fix.latitude) <= kMaximumLatitude &&
                       std::abs(fix.longitude) <= kMaximumLongitude;
  if (fix.mode < MODE_2D || !isPlace) return std::nullopt;
  PositionFix result{.latitude = fix.latitude, .longitude = fix.longitude};
  if (fix.mode >= MODE_3D) result.altitude = finite(fix.altMSL);
  if (const auto speed = finite(fix.speed)) result.speed = *speed * kKmhPerMs;
  result.course = finite(fix.track);
  return result;
}

/// An open connection to a gpsd, closed at the end.
class GpsdConnection {
 public:
  explicit GpsdConnection(const PositionServer& server)
      : _error(gps_open(server.host.c_str(), server.port.c_str(), _data.get())) {
    if (_error == 0) gps_stream(_data.get(), WATCH_ENABLE | WATCH_JSON, nullptr);
  }
  ~GpsdConnection() {
    if (_error == 0) gps_close(_data.get());
  }
  GpsdConnection(const GpsdConnection&) = delete;
  GpsdConnection& operator=(const GpsdConnection&) = delete;

  [[nodiscard]] std::string failure() const {
    return _error == 0 ? "" : std::string(gps_errstr(_error));
  }
  [[nodiscard]] bool isWaiting() { return gps_waiting(_data.get(), kPieceMicroseconds); }
  /// Whether gpsd is still there.
  [[nodiscard]] bool read() { return gps_read(_data.get(), nullptr, 0) >= 0; }
  [[nodiscard]] const gps_data_t& data() const { return *_data; }

 private:
  std::unique_ptr<gps_data_t> _data = std::make_unique<gps_data_t>();
  int _error;
};

void readConnection(GpsdConnection& gpsd, GpsdMailbox& mailbox) {
  auto heard = std::chrono::steady_clock::now();
  mailbox.put(std::nullopt);
  while (!mailbox.isStopped()) {
    if (gpsd.isWaiting()) {
      if (!gpsd.read()) return mailbox.fail("gpsd has closed the connection");
      if ((gpsd.data().set & MODE_SET) == 0) continue;
      heard = std::chrono::steady_clock::now();
      mailbox.put(fixIn(gpsd.data()));
    } else if (std::chrono::steady_clock::now() - heard > kSilence) {
      heard = std::chrono::steady_clock::now();
      mailbox.put(std::nullopt);
    }
  }
}

}  // namespace

void GpsdMailbox::put(std::optional<PositionFix> fix) {
  const std::scoped_lock lock(_mutex);
  _news = {.isNew = true, .fix = fix, .failure = ""};
}

void GpsdMailbox::fail(std::string reason) {
  const std::scoped_lock lock(_mutex);
  _news = {.isNew = true, .fix = std::nullopt, .failure = std::move(reason)};
}

GpsdMailbox::News GpsdMailbox::take() {
  const std::scoped_lock lock(_mutex);
  News news = _news;
  _news.isNew = false;
  return news;
}

void GpsdMailbox::stop() {
  const std::scoped_lock lock(_mutex);
  _isStopped = true;
}

bool GpsdMailbox::isStopped() const {
  const std::scoped_lock lock(_mutex);
  return _isStopped;
}

void readGpsd(const PositionServer& server, const std::shared_ptr<GpsdMailbox>& mailbox) {
  while (!mailbox->isStopped()) {
    {
      GpsdConnection gpsd(server);
      const std::string failure = gpsd.failure();
      if (failure.empty()) {
        readConnection(gpsd, *mailbox);
      } else {
        mailbox->fail(failure);
      }
    }
    for (int i = 0; i < kPiecesBeforeRetry && !mailbox->isStopped(); ++i) {
      std::this_thread::sleep_for(kPiece);
    }
  }
}

}  // namespace kestro
