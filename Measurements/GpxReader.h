// SPDX-License-Identifier: MIT
// Reads a GPS track in the form that receivers and apps export: GPX, versions 1.0 and 1.1.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "Measurements/Track.h"
#include "Platform/Result.h"

namespace kestro {

/// Takes a GPX file piece by piece. Of it the points of tracks (`trkpt`) count, with their times;
/// routes and waypoints do not.
class GpxReader {
 public:
  GpxReader();
  ~GpxReader();
  GpxReader(const GpxReader&) = delete;
  GpxReader& operator=(const GpxReader&) = delete;

  /// The next bytes of the file. An error, with its line and column, is final.
  [[nodiscard]] Result<void> take(std::string_view bytes);

  /// To be called once, after the last bytes. Without a point that counts there is no track.
  [[nodiscard]] Result<Track> finish();

  /// Points without a time, a readable one, or a place on earth, which are left out.
  [[nodiscard]] std::uint64_t leftOutCount() const noexcept;

 private:
  struct State;
  std::unique_ptr<State> _state;
};

/// Reads `path` whole; `leftOut` receives how many points were left out. An error begins with the
/// path.
[[nodiscard]] Result<Track> readGpxFile(const std::string& path, std::uint64_t& leftOut);

/// "2026-11-21T18:36:34.586Z" or with an offset ("+01:00") as a moment; absent where it is none, or
/// has no zone.
[[nodiscard]] std::optional<Moment> momentOfIsoText(std::string_view text);

}  // namespace kestro
