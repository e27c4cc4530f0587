// SPDX-License-Identifier: MIT
#include "Platform/Linux/BlockedCalls.h"

#include <unistd.h>

#include <csignal>

namespace kestro {
namespace {

constexpr long kMillisecond = 1'000'000;
constexpr itimerspec kRhythm{.it_interval = {.tv_sec = 0, .tv_nsec = 50 * kMillisecond},
                             .it_value = {.tv_sec = 0, .tv_nsec = 250 * kMillisecond}};

/// Nothing else here uses the real-time signals.
int interruption() noexcept { return SIGRTMIN; }

extern "C" void interruptOnly(int) {}

}  // namespace

BlockedCalls::BlockedCalls() noexcept {
  struct sigaction action = {};
  action.sa_handler = interruptOnly;  // no SA_RESTART: the call that is interrupted fails
  if (::sigaction(interruption(), &action, nullptr) != 0) return;
  sigevent event{};
  event.sigev_notify = SIGEV_THREAD_ID;
  event.sigev_signo = interruption();
  event._sigev_un._tid = ::gettid();
  _hasTimer = ::timer_create(CLOCK_MONOTONIC, &event, &_timer) == 0;
}

BlockedCalls::~BlockedCalls() {
  if (_hasTimer) ::timer_delete(_timer);
}

void BlockedCalls::begin() noexcept {
  if (_hasTimer) ::timer_settime(_timer, 0, &kRhythm, nullptr);
}

}  // namespace kestro
