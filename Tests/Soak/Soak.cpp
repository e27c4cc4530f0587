// SPDX-License-Identifier: MIT
// kestro-soak: many messages, and many deaths of the server, through the whole live path.
#include <fmt/format.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <variant>
#include <vector>

#include "Options/ArgumentParser.h"
#include "Options/ProgramOptions.h"
#include "Platform/TelephonyService.h"
#include "Sources/SourceCatalogue.h"
#include "Tests/Soak/LiveSystem.h"
#include "Tests/Soak/ProcessUse.h"

namespace kestro::soak {
namespace {

struct Options {
  std::string technology = std::string(kTqLogChannelTechnology_Ondrel_LTE);
  std::uint64_t messages = 10'000'000;
  std::uint64_t faults = 0;
  double speed = 200;
  std::size_t premade = 0;
};

constexpr std::size_t kMebibyte = std::size_t{1024} * 1024;
/// How much more memory the second half of a run may take than the first: displays differ in size.
constexpr std::size_t kAllowedGrowth = 2 * kMebibyte;
/// What a client that stopped may leave behind besides: its queue alone holds up to 4 MiB.
constexpr std::size_t kAllowedGrowthByFaults = 8 * kMebibyte;
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
/// How often memory is looked at in each half of a run.
constexpr std::uint64_t kLooks = 10;

void require(bool holds, std::string_view promise) {
  if (!holds) throw BrokenPromise{std::string(promise)};
}

/// Plays until so many messages were sent.
void playUntil(LiveSystem& system, std::uint64_t messages) {
  while (system.counts().sent < messages) {
    const std::uint64_t before = system.counts().sent;
    system.passTick();
    system.check();
    require(system.counts().sent > before, "the drive goes on");
  }
}

/// Plays so many messages; the most memory that was in use on the way.
std::size_t mostMemory(LiveSystem& system, std::uint64_t messages) {
  const std::uint64_t from = system.counts().sent;
  std::size_t most = 0;
  for (std::uint64_t look = 1; look <= kLooks; ++look) {
    playUntil(system, from + messages * look / kLooks);
    most = std::max(most, residentBytes());
  }
  return most;
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

/// What a run used of the machine, before it and in its halves.
struct Use {
  std::size_t descriptors = openDescriptors();
  std::size_t early = 0;
  std::size_t late = 0;
};

double mebibytes(std::size_t bytes) {
  return static_cast<double>(bytes) / static_cast<double>(kMebibyte);
}

void report(const Options& options, const LiveSystem& system, const MessageCounts& counts,
            const Use& use, double seconds) {
  fmt::print(
      "{}: {} messages, {} asked for, {} received; {} faults, {} redraws, {:.0f} messages/s; at "
      "most {:.1f} MiB in the first half, {:.1f} MiB in the second; {} descriptors, then {}\n",
      options.technology, counts.sent, counts.wanted, counts.received, options.faults,
      system.redraws(), static_cast<double>(counts.sent) / seconds, mebibytes(use.early),
      mebibytes(use.late), use.descriptors, openDescriptors());
}

void checkUse(const Options& options, const Use& use) {
  const std::size_t allowed = options.faults == 0 ? kAllowedGrowth : kAllowedGrowthByFaults;
  require(!kMeasuresMemory || use.late <= use.early + allowed,
          "memory does not grow with the messages");
  require(openDescriptors() == use.descriptors, "no descriptor stays open");
}

void run(const Options& options) {
  LiveSystem system(technologyNamed(options.technology), options.speed, options.premade);
  system.start();
  system.startServer();
  const auto start = std::chrono::steady_clock::now();
  for (int tick = 0; tick < kWarmUpTicks; ++tick) system.passTick();
  // What was played before the model's start command arrived went to nobody.
  const MessageCounts before = system.counts();
  Use use;
  use.early = mostMemory(system, options.messages / 2);
  for (std::uint64_t fault = 0; fault < options.faults; ++fault) fail(system, fault);
  use.late = mostMemory(system, options.messages / 2);
  const std::chrono::duration<double> time = std::chrono::steady_clock::now() - start;
  const MessageCounts counts = system.counts() - before;
  report(options, system, counts, use, time.count());
  checkUse(options, use);
  require(counts.received > 0, "messages arrive");
  require(options.faults > 0 || counts.received == counts.wanted,
          "every message that was asked for arrives");
}

CommandRow program(Options& options) {
  return {.name = "kestro-soak",
          .help = "Plays a simulated drive through server, ports and model, faster than time.",
          .options = {
              {.name = "--technology",
               .value = "NAME",
               .help = "The simulation's technology",
               .target = &options.technology,
               .choices = choicesOf(technologyNames())},
              {.name = "--messages",
               .value = "N",
               .help = "How many messages, after a short while to begin with",
               .target = &options.messages,
               .range = NumberRange{}},
              {.name = "--faults",
               .value = "N",
               .help = "How often the server dies or stops on the way",
               .target = &options.faults,
               .range = NumberRange{}},
              {.name = "--speed",
               .value = "X",
               .help = "Seconds of the drive in one second of the clock",
               .target = &options.speed,
               .range = NumberRange{0}},
              {.name = "--premade",
               .value = "N",
               .help = "Make so many messages before the run, and play these round and round: the "
                       "simulation's own time is not counted then",
               .target = &options.premade,
               .range = NumberRange{}},
          }};
}

}  // namespace
}  // namespace kestro::soak

int main(int argc, char** argv) {
  using namespace kestro::soak;  // NOLINT(google-build-using-namespace)
  Options options;
  const kestro::CommandRow rows = program(options);
  const auto parsed = kestro::parseArguments(rows, argc, argv);
  if (const auto* text = std::get_if<kestro::OptionsText>(&parsed)) return kestro::tell(*text);
  try {
    run(options);
  } catch (const BrokenPromise& broken) {
    fmt::print(stderr, "{}: broken promise: {}\n", options.technology, broken.promise);
    return EXIT_FAILURE;
  }
  return EXIT_SUCCESS;
}
