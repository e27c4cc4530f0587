// SPDX-License-Identifier: MIT
// Reading a recording of 1,000,000 LTE messages: pcapng beside pcap, which libpcap reads. Goals: at
// most 1.1 times the time, in memory that does not grow with the file.
#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <limits>
#include <memory>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"
#include "Recordings/OpenRecording.h"
#include "Recordings/PcapWriter.h"
#include "Recordings/PcapngWriter.h"
#include "Sources/SourceCatalogue.h"

namespace kestro::benchmarks {
namespace {

constexpr std::size_t kMessages = 1'000'000;
constexpr std::size_t kDifferent = 20'000;
constexpr auto kInterval = std::chrono::milliseconds(20);
constexpr Moment kStart{std::chrono::seconds(1'330'862'709)};
/// Buffers for reading, whatever the length of the file.
constexpr long kMostGrowthKibibytes = 8 * 1024;

std::unique_ptr<PropertyListCoding> coding() { return createPropertyListCoding(); }

/// The first messages of the simulated drive.
std::vector<Bytes> driveMessages() {
  const auto lists = coding();
  const auto clock = createSystemClock();
  const SourceRequest request{"simulation", "LTE", ""};
  const SourceReporter ignore = [](std::string_view /*line*/) {};
  const auto source =
      openSource(request, {.propertyListCoding = *lists, .clock = *clock}, ignore).value();
  std::vector<Bytes> messages;
  while (messages.size() < kDifferent) {
    const auto step = source->next().value();
    const auto* event = std::get_if<SourceEvent>(&step);
    if (event != nullptr) messages.emplace_back(event->message.begin(), event->message.end());
  }
  return messages;
}

/// One drive in both forms, in a folder of its own.
class Drive {
 public:
  Drive() {
    std::string folder = std::filesystem::temp_directory_path() / "kestro-benchmark-XXXXXX";
    _folder = ::mkdtemp(folder.data());
    const std::vector<Bytes> messages = driveMessages();
    auto writers = std::pair(PcapWriter::create(pcap(), kTqLogChannelTechnology_Ondrel_LTE).value(),
                             PcapngWriter::create(pcapng()).value());
    for (std::size_t i = 0; i < kMessages; ++i) {
      const Bytes& message = messages[i % messages.size()];
      const Moment time = kStart + i * kInterval;
      const RecordedMessage recorded{.time = time,
                                     .technology = kTqLogChannelTechnology_Ondrel_LTE,
                                     .bytes = message,
                                     .originalLength = message.size()};
      if (!writers.first.write(time, message) || !writers.second.write(recorded)) std::abort();
    }
  }
  Drive(const Drive&) = delete;
  Drive& operator=(const Drive&) = delete;
  ~Drive() { std::filesystem::remove_all(_folder); }

  [[nodiscard]] std::string pcap() const { return _folder / "drive.pcap"; }
  [[nodiscard]] std::string pcapng() const { return _folder / "drive.pcapng"; }

 private:
  std::filesystem::path _folder;
};

std::unique_ptr<RecordingReader> opened(const std::string& path) {
  static const auto lists = coding();
  return openRecording(path, {.coding = *lists}).value();
}

/// What reading the whole file yields, so that nothing of it can be left out.
struct Sum {
  std::size_t messages = 0;
  std::size_t bytes = 0;
  std::int64_t times = 0;
  bool operator==(const Sum&) const = default;
};

Sum readAll(const std::string& path) {
  const auto reader = opened(path);
  Sum sum;
  while (const auto message = *reader->next()) {
    ++sum.messages;
    sum.bytes += message->bytes.size();
    sum.times += message->time.time_since_epoch().count();
  }
  return sum;
}

bool isSame(const Drive& drive) {
  const auto pcap = opened(drive.pcap());
  const auto pcapng = opened(drive.pcapng());
  for (std::size_t i = 0; i < kMessages; ++i) {
    const auto first = pcap->next().value().value();
    const auto second = pcapng->next().value().value();
    if (first.time != second.time || first.technology != second.technology ||
        !std::ranges::equal(first.bytes, second.bytes)) {
      fmt::print(stderr, "message {} is another one\n", i + 1);
      return false;
    }
  }
  return !pcap->next().value() && !pcapng->next().value();
}

long peakKibibytes() {
  rusage usage = {};
  ::getrusage(RUSAGE_SELF, &usage);
  return usage.ru_maxrss;
}

/// Of the processor, so that others on the machine do not count.
double secondsToRead(const std::string& path) {
  const std::clock_t start = std::clock();
  benchmark::DoNotOptimize(readAll(path));
  return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

void readRecording(benchmark::State& state, const std::string& path) {
  for (auto _ : state) benchmark::DoNotOptimize(readAll(path));
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(kMessages));
}

/// Both forms in turn, the fastest of each; counts "of_pcap".
void compareForms(benchmark::State& state, const Drive& drive) {
  constexpr int kRounds = 15;
  double pcap = std::numeric_limits<double>::max();
  double pcapng = pcap;
  for (auto _ : state) {
    for (int i = 0; i < kRounds; ++i) {
      pcap = std::min(pcap, secondsToRead(drive.pcap()));
      pcapng = std::min(pcapng, secondsToRead(drive.pcapng()));
    }
  }
  state.counters["of_pcap"] = pcapng / pcap;
}

}  // namespace
}  // namespace kestro::benchmarks

int main(int argc, char** argv) {
  using namespace kestro::benchmarks;
  const Drive drive;
  const long before = peakKibibytes();
  const Sum sum = readAll(drive.pcapng());
  const long growth = peakKibibytes() - before;
  if (!isSame(drive) || sum != readAll(drive.pcap()) || sum.messages != kMessages) return 1;
  if (growth > kMostGrowthKibibytes) {
    fmt::print(stderr, "reading takes {} KiB\n", growth);
    return 1;
  }
  benchmark::RegisterBenchmark("Read/pcap", readRecording, drive.pcap());
  benchmark::RegisterBenchmark("Read/pcapng", readRecording, drive.pcapng());
  benchmark::RegisterBenchmark("Read/pcapng beside pcap", [&drive](benchmark::State& state) {
    compareForms(state, drive);
  })->Iterations(1);
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
}
