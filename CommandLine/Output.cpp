// SPDX-License-Identifier: MIT
#include "CommandLine/Output.h"

#include <fmt/format.h>
#include <stdio_ext.h>

#include <cerrno>
#include <cstring>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TextSink.h"

namespace kestro {

void Output::Closer::operator()(std::FILE* file) const noexcept {
  if (file == stdout) {
    static_cast<void>(std::fflush(file));
  } else {
    static_cast<void>(std::fclose(file));
  }
}

Output Output::standardOutput() { return {"standard output", stdout}; }

Result<Output> Output::create(const std::string& path) {
  std::FILE* file = std::fopen(path.c_str(), "wbe");
  if (file == nullptr) return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  return Output(path, file);
}

void Output::write(std::string_view text) {
  if (!_failure.empty()) return;
  checkSystemError(std::fwrite(text.data(), 1, text.size(), _file.get()) == text.size());
}

void Output::flush() {
  if (_failure.empty()) checkSystemError(std::fflush(_file.get()) == 0);
}

void Output::checkSystemError(bool succeeded) {
  if (succeeded) return;
  _failure = fmt::format("{}: {}", _name, std::strerror(errno));
  _readerIsGone = errno == EPIPE;
  ::__fpurge(_file.get());  // what waits would only fail, or block, again
}

void complain(std::string_view message) {
  // Two programs share the commands' sources; tests of these are neither.
  const std::string_view started = program_invocation_short_name;
  const std::string_view name = started.starts_with("kestro-") ? started : "kestro-cli";
  standardErrorSink().writeLine(fmt::format("{}: {}", name, message));
}

}  // namespace kestro
