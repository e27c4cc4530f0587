// SPDX-License-Identifier: MIT
// Messages a second between two processes: through the ports, and through a raw stream socket pair
// with one send(2) a message. Each message is checked where it arrives, and a transfer of which a
// message is missing, doubled, out of order or changed counts as failed.
#include <benchmark/benchmark.h>
#include <signal.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MessagePort.h"

namespace kestro {
namespace {

constexpr std::size_t kMessageSize = 200;
constexpr std::uint64_t kMessagesPerTransfer = 100'000;
/// So many messages are posted before one is sent, which waits until all of them are taken.
constexpr std::uint64_t kPostsPerSend = 1000;
constexpr std::int32_t kDataMessage = 0;
constexpr std::int32_t kCountRequest = 1;

using Message = std::array<std::uint8_t, kMessageSize>;

/// Message number n: the number, then bytes that count upwards from it.
class MessagePattern {
 public:
  MessagePattern() {
    for (std::size_t i = 0; i < _ramp.size(); ++i) _ramp[i] = static_cast<std::uint8_t>(i);
  }
  void write(Message& message, std::uint64_t number) const {
    std::memcpy(message.data(), &number, sizeof(number));
    std::memcpy(message.data() + sizeof(number), ramp(number), kRampLength);
  }
  [[nodiscard]] bool matches(const std::uint8_t* message, std::uint64_t number) const {
    return std::memcmp(message, &number, sizeof(number)) == 0 &&
           std::memcmp(message + sizeof(number), ramp(number), kRampLength) == 0;
  }

 private:
  static constexpr std::size_t kRampLength = kMessageSize - sizeof(std::uint64_t);
  [[nodiscard]] const std::uint8_t* ramp(std::uint64_t number) const {
    return _ramp.data() + (number & 0xFF);
  }
  std::array<std::uint8_t, 256 + kRampLength> _ramp{};
};

const MessagePattern kPattern;

/// Counts the messages that arrive intact and in order.
class Receiver {
 public:
  void receive(const std::uint8_t* message, std::size_t size) {
    if (size == kMessageSize && kPattern.matches(message, _count)) ++_count;
  }
  /// How many came since the last call.
  [[nodiscard]] std::uint64_t takeCount() { return std::exchange(_count, 0); }

 private:
  std::uint64_t _count = 0;
};

/// A process that runs `work` and ends with this one.
class ChildProcess {
 public:
  explicit ChildProcess(const std::function<void()>& work) : _process(::fork()) {
    if (_process != 0) return;
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    work();
    ::_exit(0);
  }
  ~ChildProcess() {
    ::kill(_process, SIGKILL);
    ::waitpid(_process, nullptr, 0);
  }
  ChildProcess(const ChildProcess&) = delete;
  ChildProcess& operator=(const ChildProcess&) = delete;

 private:
  pid_t _process;
};

// --- The raw pair --------------------------------------------------------------------------------

void receiveRaw(int socket) {
  Receiver receiver;
  std::vector<std::uint8_t> buffer(std::size_t{256} * 1024);
  std::size_t end = 0;
  std::uint64_t left = kMessagesPerTransfer;
  for (;;) {
    const ssize_t got = ::recv(socket, buffer.data() + end, buffer.size() - end, 0);
    if (got <= 0) return;
    end += static_cast<std::size_t>(got);
    std::size_t begin = 0;
    for (; end - begin >= kMessageSize; begin += kMessageSize, --left) {
      receiver.receive(buffer.data() + begin, kMessageSize);
    }
    std::memmove(buffer.data(), buffer.data() + begin, end - begin);
    end -= begin;
    if (left != 0) continue;
    const std::uint64_t count = receiver.takeCount();
    if (::send(socket, &count, sizeof(count), MSG_NOSIGNAL) < 0) return;
    left = kMessagesPerTransfer;
  }
}

bool transferRaw(int socket) {
  Message message;
  for (std::uint64_t i = 0; i < kMessagesPerTransfer; ++i) {
    kPattern.write(message, i);
    if (::send(socket, message.data(), message.size(), MSG_NOSIGNAL) != kMessageSize) return false;
  }
  std::uint64_t count = 0;
  return ::recv(socket, &count, sizeof(count), MSG_WAITALL) == sizeof(count) &&
         count == kMessagesPerTransfer;
}

// --- The ports -----------------------------------------------------------------------------------

LinuxPlatformOptions platformOptions(const std::string& directory) {
  LinuxPlatformOptions options;
  options.logThreshold = std::nullopt;
  options.portDirectory = directory;
  return options;
}

void receiveFromPort(const std::string& directory) {
  const auto platform = createLinuxPlatform(platformOptions(directory));
  Receiver receiver;
  const auto port = platform->messagePorts().createLocalPort(
      "Receiver", [&](std::int32_t id, ByteView message) -> std::optional<Bytes> {
        if (id == kDataMessage) {
          receiver.receive(message.data(), message.size());
          return std::nullopt;
        }
        Bytes reply;
        appendLittleEndian(reply, receiver.takeCount());
        return reply;
      });
  if (port) static_cast<void>(platform->run());
}

bool transferThroughPort(RemotePort& port) {
  Message message;
  for (std::uint64_t i = 0; i < kMessagesPerTransfer; ++i) {
    kPattern.write(message, i);
    const SendError error = i % kPostsPerSend == kPostsPerSend - 1
                                ? port.send(kDataMessage, message, std::chrono::seconds(10))
                                : port.post(kDataMessage, message);
    if (error != SendError::None) return false;
  }
  const auto reply =
      port.request(kCountRequest, {}, std::chrono::seconds(10), std::chrono::seconds(10));
  return reply.data && loadLittleEndian<std::uint64_t>(*reply.data, 0) == kMessagesPerTransfer;
}

std::shared_ptr<RemotePort> connectToReceiver(MessagePorts& ports) {
  for (int attempt = 0; attempt < 500; ++attempt) {
    if (auto port = ports.createRemotePort("Receiver")) return port;
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
  }
  return nullptr;
}

// --- The measurement -----------------------------------------------------------------------------

void measure(benchmark::State& state, const std::function<bool()>& transfer) {
  if (!transfer()) state.SkipWithError("messages were lost or changed");
  for (auto _ : state) {
    if (!transfer()) state.SkipWithError("messages were lost or changed");
  }
  const auto messages = static_cast<std::int64_t>(state.iterations() * kMessagesPerTransfer);
  state.SetItemsProcessed(messages);
  state.SetBytesProcessed(messages * static_cast<std::int64_t>(kMessageSize));
}

int runBenchmarks(int argc, char** argv, const std::string& directory) {
  // The processes part before there is an event loop or a thread.
  int pair[2] = {-1, -1};
  if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, pair) != 0) return 1;
  const ChildProcess rawReceiver([&] {
    ::close(pair[0]);
    receiveRaw(pair[1]);
  });
  ::close(pair[1]);
  const ChildProcess portReceiver([&] { receiveFromPort(directory); });
  const auto platform = createLinuxPlatform(platformOptions(directory));
  const auto port = connectToReceiver(platform->messagePorts());
  if (!port) {
    std::fprintf(stderr, "the receiving process does not answer\n");
    return 1;
  }
  const auto registerTransfer = [](const char* name, std::function<bool()> transfer) {
    benchmark::RegisterBenchmark(name, measure, std::move(transfer))
        ->UseRealTime()
        ->Unit(benchmark::kMillisecond);
  };
  registerTransfer("RawSocketPair", [&] { return transferRaw(pair[0]); });
  registerTransfer("MessagePorts", [&] { return transferThroughPort(*port); });
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}

}  // namespace
}  // namespace kestro

int main(int argc, char** argv) {
  std::string directory = std::filesystem::temp_directory_path() / "kestro-benchmark-XXXXXX";
  if (::mkdtemp(directory.data()) == nullptr) return 1;
  const int status = kestro::runBenchmarks(argc, argv, directory);
  std::error_code ignored;
  std::filesystem::remove_all(directory, ignored);
  return status;
}
