// SPDX-License-Identifier: MIT
// Simulated drives of the channels that deliver baseband packets.
#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"
#include "Sources/LogSource.h"

namespace kestro {

/// The moment at which every simulated drive begins: 2012-03-04 12:00:00 UTC.
inline constexpr Moment kSimulationBegin{std::chrono::seconds(1'330'862'400)};

/// The time from one step of a simulated drive to the next.
inline constexpr std::chrono::milliseconds kSimulationStep{500};

/// Whether what hardly ever changes is repeated in this step (the first is 0): every two seconds in
/// the first twenty seconds of a drive, so that clients that have just connected soon see it, and
/// every twenty seconds after that.
[[nodiscard]] constexpr bool repeatsRareLists(unsigned step) noexcept {
  constexpr unsigned kEarlySteps = 4;
  constexpr unsigned kSteps = 40;
  return step % (step < kSteps ? kEarlySteps : kSteps) == 0;
}

/// The packets of one step, in order. A packet that could not carry its values is left out.
class PacketList {
 public:
  /// Without a packet, one is left out: it could not hold its values.
  void add(std::optional<Bytes> packet) {
    if (packet) {
      _packets.push_back(std::move(*packet));
    } else {
      ++_leftOutCount;
    }
  }
  [[nodiscard]] std::uint64_t leftOutCount() const noexcept { return _leftOutCount; }
  [[nodiscard]] std::vector<Bytes> take() { return std::exchange(_packets, {}); }

 private:
  std::vector<Bytes> _packets;
  std::uint64_t _leftOutCount = 0;
};

/// What one technology's baseband reports on a simulated drive. The same sequence in every run.
class SimulatedBaseband {
 public:
  SimulatedBaseband() = default;
  virtual ~SimulatedBaseband() = default;
  SimulatedBaseband(const SimulatedBaseband&) = delete;
  SimulatedBaseband& operator=(const SimulatedBaseband&) = delete;

  /// A constant text of Platform/TelephonyService.h.
  [[nodiscard]] virtual std::string_view technology() const = 0;

  /// Lets `elapsed` pass (0 in the first step) and says what the baseband reports at `now`.
  [[nodiscard]] virtual std::vector<Bytes> step(std::chrono::milliseconds elapsed, Moment now) = 0;
};

/// A drive without end: a step every kSimulationStep, its packets one after the other.
class PacketSimulation : public LogSource {
 public:
  /// Makes the baseband at the drive's beginning.
  using MakeBaseband = std::function<std::unique_ptr<SimulatedBaseband>()>;

  explicit PacketSimulation(MakeBaseband makeBaseband)
      : _makeBaseband(std::move(makeBaseband)), _baseband(_makeBaseband()) {}

  [[nodiscard]] std::string_view technology() const override { return _baseband->technology(); }
  [[nodiscard]] Result<SourceStep> next() override;
  [[nodiscard]] std::string_view madeUp() const noexcept override { return kMadeUpBySimulation; }
  [[nodiscard]] Result<void> restart() override;

 private:
  void takeStep();

  MakeBaseband _makeBaseband;
  std::unique_ptr<SimulatedBaseband> _baseband;
  std::optional<std::chrono::milliseconds> _time;  ///< of the last step
  std::deque<Bytes> _packets;
  Bytes _message;
};

}  // namespace kestro
