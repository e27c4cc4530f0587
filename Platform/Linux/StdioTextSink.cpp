// SPDX-License-Identifier: MIT
#include "Platform/Linux/StdioTextSink.h"

#include <csignal>
#include <ctime>
#include <string>

namespace kestro {
namespace {

/// Holds SIGPIPE back on this thread, and swallows the one that came meanwhile: writing a line to a
/// pipe whose reader has gone must not end the process.
class WithoutPipeSignal {
 public:
  WithoutPipeSignal() noexcept {
    ::sigemptyset(&_pipe);
    ::sigaddset(&_pipe, SIGPIPE);
    sigset_t pending;
    ::sigpending(&pending);
    _wasPending = ::sigismember(&pending, SIGPIPE) == 1;
    ::pthread_sigmask(SIG_BLOCK, &_pipe, &_before);
  }
  ~WithoutPipeSignal() {
    const timespec now{};
    if (!_wasPending) static_cast<void>(::sigtimedwait(&_pipe, nullptr, &now));
    ::pthread_sigmask(SIG_SETMASK, &_before, nullptr);
  }
  WithoutPipeSignal(const WithoutPipeSignal&) = delete;
  WithoutPipeSignal& operator=(const WithoutPipeSignal&) = delete;

 private:
  sigset_t _pipe{};
  sigset_t _before{};
  bool _wasPending = false;
};

}  // namespace

void StdioTextSink::writeLine(std::string_view line) {
  std::string whole;  // one write, so that lines of several processes do not mix
  whole.reserve(line.size() + 1);
  whole.append(line).push_back('\n');
  const WithoutPipeSignal guard;
  std::fwrite(whole.data(), 1, whole.size(), _stream);
  std::fflush(_stream);
  std::clearerr(_stream);
}

}  // namespace kestro
