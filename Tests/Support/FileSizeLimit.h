// SPDX-License-Identifier: MIT
// A full disk, as far as one process can tell.
#pragma once

#include <sys/resource.h>

#include <csignal>

namespace kestro::testing {

/// While it lives, files of this process end at `size` bytes, as on a full disk.
class FileSizeLimit {
 public:
  explicit FileSizeLimit(rlim_t size) : _earlier(::signal(SIGXFSZ, SIG_IGN)) {
    ::getrlimit(RLIMIT_FSIZE, &_limit);
    const rlimit limit = {.rlim_cur = size, .rlim_max = _limit.rlim_max};
    ::setrlimit(RLIMIT_FSIZE, &limit);
  }
  ~FileSizeLimit() {
    ::setrlimit(RLIMIT_FSIZE, &_limit);
    ::signal(SIGXFSZ, _earlier);
  }
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;

 private:
  rlimit _limit = {};
  void (*_earlier)(int);
};

}  // namespace kestro::testing
