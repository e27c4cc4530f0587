// SPDX-License-Identifier: MIT
// A message bus of a test's own, in place of the system's.
#pragma once

#include <signal.h>
#include <stdlib.h>
#include <sys/types.h>

#include <cstdio>
#include <string>

#include "Tests/Support/ScopedEnvironment.h"

namespace kestro::testing {

/// Runs from its making to its end; $DBUS_SYSTEM_BUS_ADDRESS names it meanwhile.
class PrivateBus {
 public:
  PrivateBus() { start(); }
  ~PrivateBus() { stop(); }
  PrivateBus(const PrivateBus&) = delete;
  PrivateBus& operator=(const PrivateBus&) = delete;

  [[nodiscard]] const std::string& address() const noexcept { return _address; }
  [[nodiscard]] bool isRunning() const noexcept { return _process > 0; }
  void stop() {
    if (_process > 0) ::kill(_process, SIGKILL);
    _process = 0;
  }

 private:
  void start() {
    FILE* output =
        ::popen("dbus-daemon --session --fork --print-address=1 --print-pid=1 2>&1", "r");
    char line[512] = {};
    if (output != nullptr && ::fgets(line, sizeof(line), output) != nullptr) _address = line;
    if (output != nullptr && ::fgets(line, sizeof(line), output) != nullptr) {
      _process = static_cast<pid_t>(::atol(line));
    }
    if (output != nullptr) ::pclose(output);
    if (!_address.empty()) _address.pop_back();
    ::setenv("DBUS_SYSTEM_BUS_ADDRESS", _address.c_str(), 1);
  }

  ScopedEnvironment _environment{"DBUS_SYSTEM_BUS_ADDRESS", nullptr};
  std::string _address;
  pid_t _process = 0;
};

}  // namespace kestro::testing
