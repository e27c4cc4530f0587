// SPDX-License-Identifier: MIT
#include "Platform/Linux/ProcessSignals.h"

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <utility>

namespace kestro {
namespace {

/// Where the signal handler writes the number of the signal; -1 while nobody reads.
std::atomic<int> pipeForHandler = -1;
/// What ends blocked calls when the process is asked to end; null while nobody reads.
std::atomic<BlockedCalls*> callsForHandler = nullptr;
static_assert(std::atomic<int>::is_always_lock_free &&
                  std::atomic<BlockedCalls*>::is_always_lock_free,
              "a signal handler reads them");

extern "C" void forwardSignal(int number) {
  const int savedErrno = errno;
  const auto byte = static_cast<unsigned char>(number);
  // A full pipe holds unread signals already; losing one more changes nothing.
  [[maybe_unused]] const ssize_t written = ::write(pipeForHandler.load(), &byte, 1);
  BlockedCalls* calls = callsForHandler.load();
  if (number != SIGWINCH && calls != nullptr) calls->begin();
  errno = savedErrno;
}

void callOrTerminate(const std::function<void()>& handler) noexcept { handler(); }

}  // namespace

ProcessSignals::ProcessSignals() {
  std::array<int, 2> ends = {-1, -1};
  if (::pipe2(ends.data(), O_CLOEXEC | O_NONBLOCK) != 0) return;
  _readEnd.reset(ends[0]);
  _writeEnd.reset(ends[1]);
  pipeForHandler = _writeEnd.get();
  callsForHandler = &_blockedCalls;
  _notifier = std::make_unique<QSocketNotifier>(_readEnd.get(), QSocketNotifier::Read);
  QObject::connect(_notifier.get(), &QSocketNotifier::activated, _notifier.get(),
                   [this] { drain(); });
}

ProcessSignals::~ProcessSignals() {
  while (!_earlier.empty()) releaseSignal(_earlier.begin()->first);
  callsForHandler = nullptr;
  pipeForHandler = -1;
}

void ProcessSignals::setTerminationHandler(std::function<void()> handler) {
  setHandler({SIGINT, SIGTERM, SIGHUP}, std::move(handler));
}

void ProcessSignals::setResizeHandler(std::function<void()> handler) {
  setHandler({SIGWINCH}, std::move(handler));
}

void ProcessSignals::setHandler(std::initializer_list<int> numbers, std::function<void()> handler) {
  for (const int number : numbers) {
    _handlers[number] = handler;
    if (handler) {
      catchSignal(number);
    } else {
      releaseSignal(number);
    }
  }
}

void ProcessSignals::catchSignal(int number) {
  if (!_notifier || _earlier.contains(number)) return;
  struct sigaction earlier = {};
  if (::sigaction(number, nullptr, &earlier) != 0) return;
  if (earlier.sa_handler == SIG_IGN) return;
  struct sigaction ours = {};
  ours.sa_handler = forwardSignal;
  ours.sa_flags = SA_RESTART;
  if (::sigaction(number, &ours, nullptr) == 0) _earlier[number] = earlier;
}

void ProcessSignals::releaseSignal(int number) {
  const auto earlier = _earlier.extract(number);
  if (!earlier.empty()) ::sigaction(number, &earlier.mapped(), nullptr);
}

void ProcessSignals::drain() {
  std::array<unsigned char, 64> numbers = {};
  const ssize_t count = ::read(_readEnd.get(), numbers.data(), numbers.size());
  for (ssize_t i = 0; i < count; ++i) {
    // A copy: the handler may put another one in its place.
    const std::function<void()> handler = _handlers[numbers[static_cast<std::size_t>(i)]];
    if (handler) callOrTerminate(handler);
  }
}

}  // namespace kestro
