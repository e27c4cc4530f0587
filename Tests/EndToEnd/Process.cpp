// SPDX-License-Identifier: MIT
#include "Tests/EndToEnd/Process.h"

#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>
#include <sstream>
#include <stdexcept>
#include <thread>

namespace kestro::testing {
namespace {

using Clock = std::chrono::steady_clock;

constexpr int kPollMilliseconds = 20;
constexpr int kKilled = -1000;

[[noreturn]] void execute(std::vector<std::string>& arguments, const Process::Options& options) {
  for (const auto& [name, value] : options.environment) {
    ::setenv(name.c_str(), value.c_str(), 1);
  }
  std::vector<char*> pointers;
  pointers.reserve(arguments.size() + 1);
  for (std::string& argument : arguments) pointers.push_back(argument.data());
  pointers.push_back(nullptr);
  ::execv(pointers[0], pointers.data());
  ::_exit(127);
}

/// Appends what a descriptor has; closes it at its end.
void readInto(int& descriptor, std::string& text) {
  std::array<char, 65536> buffer{};
  const ssize_t count = ::read(descriptor, buffer.data(), buffer.size());
  if (count > 0) {
    text.append(buffer.data(), static_cast<std::size_t>(count));
  } else {
    ::close(std::exchange(descriptor, -1));
  }
}

}  // namespace

Process::Process(std::vector<std::string> arguments, const Options& options) {
  if (!arguments[0].starts_with('/')) {
    arguments[0] = std::string(KESTRO_PROGRAM_DIRECTORY "/") + arguments[0];
  }
  if (options.terminal == Terminal::Own) {
    startOnTerminal(arguments, options);
  } else {
    startWithPipes(arguments, options);
  }
  if (_id < 0) throw std::runtime_error("cannot start " + arguments[0]);
}

void Process::startWithPipes(std::vector<std::string>& arguments, const Options& options) {
  std::array<int, 2> output{};
  std::array<int, 2> errors{};
  if (::pipe2(output.data(), O_CLOEXEC) != 0 || ::pipe2(errors.data(), O_CLOEXEC) != 0) return;
  _id = ::fork();
  if (_id == 0) {
    ::dup2(::open("/dev/null", O_RDONLY), STDIN_FILENO);
    ::dup2(output[1], STDOUT_FILENO);
    ::dup2(errors[1], STDERR_FILENO);
    execute(arguments, options);
  }
  ::close(output[1]);
  ::close(errors[1]);
  _outputEnd = output[0];
  _errorEnd = errors[0];
}

void Process::startOnTerminal(std::vector<std::string>& arguments, const Options& options) {
  const winsize size{.ws_row = 40, .ws_col = 100, .ws_xpixel = 0, .ws_ypixel = 0};
  _id = ::forkpty(&_outputEnd, nullptr, nullptr, &size);
  if (_id == 0) execute(arguments, options);
}

Process::~Process() {
  if (!_hasEnded) {
    ::kill(_id, SIGKILL);
    static_cast<void>(reap(true));
  }
  if (_outputEnd >= 0) ::close(_outputEnd);
  if (_errorEnd >= 0) ::close(_errorEnd);
}

void Process::signal(int number) const { ::kill(_id, number); }

void Process::type(std::string_view keys) const {
  static_cast<void>(::write(_outputEnd, keys.data(), keys.size()));
}

void Process::resize(unsigned short columns, unsigned short rows) const {
  const winsize size{.ws_row = rows, .ws_col = columns, .ws_xpixel = 0, .ws_ypixel = 0};
  ::ioctl(_outputEnd, TIOCSWINSZ, &size);
}

void Process::closeOutput() { ::close(std::exchange(_outputEnd, -1)); }

bool Process::waitUntil(const std::function<bool()>& condition) {
  const auto deadline = Clock::now() + kPatience;
  while (!condition()) {
    if (Clock::now() > deadline || !collect()) return condition();
  }
  return true;
}

bool Process::waitForOutput(std::string_view text) {
  return waitUntil([&] { return _output.find(text) != std::string::npos; });
}

bool Process::waitForLines(std::size_t count) {
  return waitUntil([&] { return outputLines().size() >= count; });
}

int Process::wait() {
  const auto deadline = Clock::now() + kPatience;
  while (collect()) {
    if (Clock::now() < deadline) continue;
    ::kill(_id, SIGKILL);
    static_cast<void>(reap(true));
    return kKilled;
  }
  while (!reap(false)) {
    if (Clock::now() > deadline) {
      ::kill(_id, SIGKILL);
      static_cast<void>(reap(true));
      return kKilled;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(kPollMilliseconds));
  }
  return WIFEXITED(_status) ? WEXITSTATUS(_status) : -WTERMSIG(_status);
}

std::vector<std::string> Process::outputLines() const {
  std::vector<std::string> lines;
  std::istringstream stream(_output.substr(0, _output.rfind('\n') + 1));
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

bool Process::collect() {
  std::array<pollfd, 2> ends{pollfd{_outputEnd, POLLIN, 0}, pollfd{_errorEnd, POLLIN, 0}};
  if (_outputEnd < 0 && _errorEnd < 0) return false;
  ::poll(ends.data(), ends.size(), kPollMilliseconds);
  if (ends[0].revents != 0) readInto(_outputEnd, _output);
  if (ends[1].revents != 0) readInto(_errorEnd, _errors);
  return true;
}

bool Process::reap(bool wait) {
  if (!_hasEnded) _hasEnded = ::waitpid(_id, &_status, wait ? 0 : WNOHANG) == _id;
  return _hasEnded;
}

Outcome run(std::vector<std::string> arguments) {
  Process process(std::move(arguments));
  const int status = process.wait();
  return {status, process.output(), process.errors()};
}

bool eventually(const std::function<bool()>& condition) {
  const auto deadline = Clock::now() + kPatience;
  while (!condition()) {
    if (Clock::now() > deadline) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(kPollMilliseconds));
  }
  return true;
}

}  // namespace kestro::testing
