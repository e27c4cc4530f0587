// SPDX-License-Identifier: MIT
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/StdioTextSink.h"

namespace kestro {

void prepareStandardStreams() noexcept {
  for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (::fcntl(descriptor, F_GETFD) != -1 || errno != EBADF) continue;
    // The lowest free number is this one, as all below it are open by now.
    static_cast<void>(::open("/dev/null", descriptor == STDIN_FILENO ? O_RDONLY : O_WRONLY));
  }
  std::signal(SIGXFSZ, SIG_IGN);
}

TextSink& standardErrorSink() {
  static StdioTextSink sink(stderr);
  return sink;
}

}  // namespace kestro
