// SPDX-License-Identifier: MIT
// A kestro-telephonyd process as a demo's telephony server.
#include <fcntl.h>
#include <fmt/format.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "Platform/DemoServer.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/MessagePort.h"

namespace kestro {
namespace {

using namespace std::chrono_literals;

constexpr const char* kServerProgram = "kestro-telephonyd";
constexpr std::string_view kPortDirectoryVariable = "KESTRO_PORT_DIR=";

constexpr auto kPollInterval = 20ms;
constexpr int kPollsUntilGivenUp = 500;
constexpr auto kEndPollInterval = 5ms;
constexpr int kEndPollsUntilKilled = 400;

/// A socket's path has little room; longer temporary directories are passed over.
constexpr std::size_t kMaximumTemporaryPath = 40;

Result<std::string> makeDirectory() {
  std::error_code error;
  std::string parent = std::filesystem::temp_directory_path(error).string();
  if (error || parent.size() > kMaximumTemporaryPath) parent = "/tmp";
  std::string path = parent + "/kestro-demo-XXXXXX";
  if (::mkdtemp(path.data()) == nullptr) {
    return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  }
  return path;
}

/// The program beside this one, or its name to be looked up in PATH.
std::string serverProgram() {
  std::error_code error;
  const auto self = std::filesystem::read_symlink("/proc/self/exe", error);
  const auto beside = self.parent_path() / kServerProgram;
  return !error && ::access(beside.c_str(), X_OK) == 0 ? beside.string() : kServerProgram;
}

std::vector<std::string> environmentWithPortDirectory(const std::string& directory) {
  std::vector<std::string> result{std::string(kPortDirectoryVariable) + directory};
  for (char** entry = environ; *entry != nullptr; ++entry) {
    if (!std::string_view(*entry).starts_with(kPortDirectoryVariable)) result.emplace_back(*entry);
  }
  return result;
}

std::vector<char*> nullTerminated(std::vector<std::string>& texts) {
  std::vector<char*> result;
  result.reserve(texts.size() + 1);
  for (std::string& text : texts) result.push_back(text.data());
  result.push_back(nullptr);
  return result;
}

/// How the server is started: its output in a file, its signals as usual, in a process group of its
/// own, so that Ctrl-C reaches this program alone.
class SpawnSettings {
 public:
  explicit SpawnSettings(const std::string& logPath) {
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, logPath.c_str(),
                                       O_WRONLY | O_CREAT | O_APPEND, 0600);
    ::posix_spawn_file_actions_adddup2(&actions, STDOUT_FILENO, STDERR_FILENO);
    sigset_t none;
    sigset_t usual;
    ::sigemptyset(&none);
    ::sigemptyset(&usual);
    for (const int signal : {SIGPIPE, SIGINT, SIGTERM, SIGHUP}) ::sigaddset(&usual, signal);
    ::posix_spawnattr_init(&attributes);
    ::posix_spawnattr_setsigmask(&attributes, &none);
    ::posix_spawnattr_setsigdefault(&attributes, &usual);
    ::posix_spawnattr_setpgroup(&attributes, 0);
    ::posix_spawnattr_setflags(
        &attributes, POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETPGROUP);
  }
  ~SpawnSettings() {
    ::posix_spawnattr_destroy(&attributes);
    ::posix_spawn_file_actions_destroy(&actions);
  }
  SpawnSettings(const SpawnSettings&) = delete;
  SpawnSettings& operator=(const SpawnSettings&) = delete;

  posix_spawn_file_actions_t actions{};
  posix_spawnattr_t attributes{};
};

class DemoServerProcess final : public DemoServer {
 public:
  /// Takes over the directory; the server is not started yet.
  explicit DemoServerProcess(std::string directory) : _directory(std::move(directory)) {}
  ~DemoServerProcess() override {
    end();
    removeDirectory();
  }
  DemoServerProcess(const DemoServerProcess&) = delete;
  DemoServerProcess& operator=(const DemoServerProcess&) = delete;

  [[nodiscard]] Result<void> start(const DemoOptions& options);

  [[nodiscard]] const std::string& portDirectory() const noexcept override { return _directory; }
  [[nodiscard]] std::unique_ptr<Timer> watch(
      Platform& platform, const std::string& serverName, std::function<void()> ready,
      std::function<void(const std::string& reason)> ended) override;
  void removeDirectory() noexcept override;

 private:
  [[nodiscard]] std::string logPath() const { return _directory + "/telephonyd.log"; }
  [[nodiscard]] std::string lastLogLine() const;
  [[nodiscard]] bool hasEnded() noexcept;
  void end() noexcept;

  std::string _directory;
  pid_t _process = -1;  ///< -1 before it runs and after it has ended
};

Result<void> DemoServerProcess::start(const DemoOptions& options) {
  const std::string program = serverProgram();
  std::vector<std::string> arguments{
      program, "--source=" + options.source, fmt::format("--speed={}", options.speed),
      fmt::format("--exit-with-parent={}", ::getpid()), "--demo-directory=" + _directory};
  if (options.loops) arguments.emplace_back("--loop");
  std::vector<std::string> environment = environmentWithPortDirectory(_directory);
  const SpawnSettings settings(logPath());
  const int error =
      ::posix_spawnp(&_process, program.c_str(), &settings.actions, &settings.attributes,
                     nullTerminated(arguments).data(), nullTerminated(environment).data());
  if (error != 0) {
    _process = -1;
    return failure(fmt::format("{}: {}", program, std::strerror(error)));
  }
  return {};
}

std::unique_ptr<Timer> DemoServerProcess::watch(
    Platform& platform, const std::string& serverName, std::function<void()> ready,
    std::function<void(const std::string& reason)> ended) {
  enum class Stage { Starting, Ready, Over };
  const auto poll = [this, &platform, serverName, ready = std::move(ready),
                     ended = std::move(ended), stage = Stage::Starting, polls = 0]() mutable {
    if (stage == Stage::Over) return;
    if (hasEnded()) {
      stage = Stage::Over;
      ended(lastLogLine());
    } else if (stage == Stage::Starting && ++polls > kPollsUntilGivenUp) {
      stage = Stage::Over;
      ended("it does not open its port");
    } else if (stage == Stage::Starting && platform.messagePorts().createRemotePort(serverName)) {
      stage = Stage::Ready;
      ready();
    }
  };
  return platform.mainQueue().scheduleRepeating(kPollInterval, poll);
}

std::string DemoServerProcess::lastLogLine() const {
  std::ifstream log(logPath());
  std::string last = "it ended without a word";
  for (std::string line; std::getline(log, line);) {
    if (!line.empty()) last = line;
  }
  return last;
}

bool DemoServerProcess::hasEnded() noexcept {
  if (_process > 0 && ::waitpid(_process, nullptr, WNOHANG) != 0) _process = -1;
  return _process < 0;
}

void DemoServerProcess::end() noexcept {
  if (hasEnded()) return;
  ::kill(_process, SIGTERM);
  for (int i = 0; i < kEndPollsUntilKilled; ++i) {
    if (hasEnded()) return;
    std::this_thread::sleep_for(kEndPollInterval);
  }
  ::kill(_process, SIGKILL);
  ::waitpid(_process, nullptr, 0);
  _process = -1;
}

void DemoServerProcess::removeDirectory() noexcept {
  std::error_code error;
  std::filesystem::remove_all(_directory, error);
}

}  // namespace

Result<std::unique_ptr<DemoServer>> startDemoServer(const DemoOptions& options) {
  auto directory = makeDirectory();
  if (!directory) return tl::unexpected(directory.error());
  auto server = std::make_unique<DemoServerProcess>(*std::move(directory));
  if (auto started = server->start(options); !started) return tl::unexpected(started.error());
  return server;
}

}  // namespace kestro
