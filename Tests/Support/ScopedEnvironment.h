// SPDX-License-Identifier: MIT
// The environment of a test's own.
#pragma once

#include <cstdlib>
#include <string>

namespace kestro::testing {

/// Sets an environment variable, or removes it for a null value; gives the old one back at the end.
class ScopedEnvironment {
 public:
  ScopedEnvironment(const char* name, const char* value) : _name(name) {
    const char* old = std::getenv(name);
    if (old != nullptr) _old = old;
    _wasSet = old != nullptr;
    assign(value);
  }
  ~ScopedEnvironment() { assign(_wasSet ? _old.c_str() : nullptr); }
  ScopedEnvironment(const ScopedEnvironment&) = delete;
  ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

 private:
  void assign(const char* value) const {
    if (value == nullptr) {
      ::unsetenv(_name);
    } else {
      ::setenv(_name, value, 1);
    }
  }

  const char* _name;
  std::string _old;
  bool _wasSet = false;
};

}  // namespace kestro::testing
