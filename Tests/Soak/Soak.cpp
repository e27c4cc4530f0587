// SPDX-License-Identifier: MIT
// kestro-soak: many messages, and many deaths of the server, through the whole live path.
#include <fmt/format.h>
#include <malloc.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>

#include "Platform/TelephonyService.h"
#include "TelephonyServer/Sources/SourceCatalogue.h"
#include "Tests/Soak/LiveSystem.h"

namespace kestro::soak {
namespace {

struct Options {
  std::string technology = std::string(kTqLogChannelTechnology_Ondrel_LTE);
  std::uint64_t messages = 10'000'000;
  std::uint64_t faults = 0;
  double speed = 200;
};

/// What a client that stopped may leave behind: its queue alone holds up to 4 MiB.
constexpr std::size_t kAllowedGrowth = std::size_t{8} * 1024 * 1024;
#ifdef __SANITIZE_ADDRESS__
constexpr bool kMeasuresMemory = false;  // freed memory is kept, to catch who still uses it
#else
constexpr bool kMeasuresMemory = true;
#endif
/// A model is connected again this many ticks after the server is back: a tick to see that it was
/// gone, and 5 s until the next attempt.
constexpr int kTicksToReconnect = 4;
/// By then the display, its history and every buffer are as full as they get.
constexpr int kWarmUpTicks = 10;

std::size_t residentBytes() {
  ::malloc_trim(0);
  std::ifstream statistics("/proc/self/statm");
  std::size_t total = 0;
  std::size_t resident = 0;
  statistics >> total >> resident;
  return resident * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
}

void require(bool holds, std::string_view promise) {
  if (!holds) throw BrokenPromise{std::string(promise)};
}

/// Plays until so many messages were sent.
void playUntil(LiveSystem& system, std::uint64_t messages) {
  while (system.messagesSent() < messages) {
    const std::uint64_t before = system.messagesSent();
    system.passTick();
    system.check();
    require(system.messagesSent() > before, "the drive goes on");
  }
}

/// The server dies, or stops for a while, and comes back; afterwards the display lives again.
void fail(LiveSystem& system, std::uint64_t number) {
  const std::size_t history = system.historySize();
  const bool isDeath = number % 2 == 0;
  if (isDeath) {
    system.killServer();
  } else {
    system.setServerStopped(true);
  }
  for (std::uint64_t tick = 0; tick < number % 5; ++tick) system.passTick();
  require(system.nodeCount() > 1, "the display stays while nobody answers");
  require(system.historySize() >= history, "nothing of the history is lost");
  if (isDeath) {
    system.startServer();
  } else {
    system.setServerStopped(false);
  }
  for (int tick = 0; tick < kTicksToReconnect; ++tick) system.passTick();
  require(system.isConnected(), "the model is connected again in time");
  const std::uint64_t redraws = system.redraws();
  system.passTick();
  require(system.redraws() > redraws, "the display moves again");
  system.check();
}

void run(const Options& options) {
  LiveSystem system(technologyNamed(options.technology), options.speed);
  system.start();
  system.startServer();
  const auto start = std::chrono::steady_clock::now();
  for (int tick = 0; tick < kWarmUpTicks; ++tick) system.passTick();
  playUntil(system, options.messages / 2);
  const std::size_t early = residentBytes();
  for (std::uint64_t fault = 0; fault < options.faults; ++fault) fail(system, fault);
  playUntil(system, options.messages);
  const std::size_t late = residentBytes();
  const std::chrono::duration<double> time = std::chrono::steady_clock::now() - start;
  fmt::print(
      "{}: {} messages, {} faults, {} redraws, {:.0f} messages/s, memory {:.1f} MiB then "
      "{:.1f} MiB\n",
      options.technology, system.messagesSent(), options.faults, system.redraws(),
      static_cast<double>(system.messagesSent()) / time.count(),
      static_cast<double>(early) / 1048576, static_cast<double>(late) / 1048576);
  require(!kMeasuresMemory || late <= early + kAllowedGrowth,
          "memory does not grow with the messages");
}

}  // namespace
}  // namespace kestro::soak

int main(int argc, char** argv) {
  using namespace kestro::soak;  // NOLINT(google-build-using-namespace)
  Options options;
  CLI::App app("Plays a simulated drive through server, ports and model, faster than time.");
  app.add_option("--technology", options.technology, "The simulation's technology");
  app.add_option("--messages", options.messages, "How many messages");
  app.add_option("--faults", options.faults, "How often the server dies or stops on the way");
  app.add_option("--speed", options.speed, "Seconds of the drive in one second of the clock");
  CLI11_PARSE(app, argc, argv);
  try {
    run(options);
  } catch (const BrokenPromise& broken) {
    fmt::print(stderr, "{}: broken promise: {}\n", options.technology, broken.promise);
    return EXIT_FAILURE;
  }
  return EXIT_SUCCESS;
}
