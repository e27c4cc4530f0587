// SPDX-License-Identifier: MIT
#include "CommandLine/ReplaceFile.h"

#include <fmt/format.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <memory>
#include <system_error>

#include "CommandLine/Output.h"

namespace kestro {
namespace {

namespace fs = std::filesystem;

struct StreamCloser {
  void operator()(std::FILE* file) const noexcept { static_cast<void>(std::fclose(file)); }
};
using File = std::unique_ptr<std::FILE, StreamCloser>;

Result<void> failed(const std::string& path) {
  return failure(fmt::format("{}: {}", path, std::strerror(errno)));
}

Result<void> writeAsItIs(const std::string& path, std::string_view contents) {
  auto output = Output::create(path);
  if (!output) return tl::unexpected(output.error());
  output->write(contents);
  output->flush();
  if (!output->failureMessage().empty()) return failure(output->failureMessage());
  return {};
}

/// Holds back, until the new file is in its place or gone, the signals that end the process: none
/// of them leaves half a file behind.
class SignalsHeldBack {
 public:
  SignalsHeldBack() noexcept {
    sigset_t ending;
    ::sigemptyset(&ending);
    for (const int number : {SIGINT, SIGTERM, SIGHUP, SIGQUIT}) ::sigaddset(&ending, number);
    ::pthread_sigmask(SIG_BLOCK, &ending, &_before);
  }
  ~SignalsHeldBack() { ::pthread_sigmask(SIG_SETMASK, &_before, nullptr); }
  SignalsHeldBack(const SignalsHeldBack&) = delete;
  SignalsHeldBack& operator=(const SignalsHeldBack&) = delete;

 private:
  sigset_t _before{};
};

/// Writes a file that does not exist yet, with the mode of the earlier one if there is one; false,
/// with errno, when the system does not take it all.
bool writeNew(const std::string& path, std::string_view contents, const fs::file_status& earlier) {
  File file(std::fopen(path.c_str(), "wbxe"));
  if (!file) return false;
  std::error_code error;
  if (fs::exists(earlier)) fs::permissions(path, earlier.permissions(), error);
  const bool isWritten =
      std::fwrite(contents.data(), 1, contents.size(), file.get()) == contents.size();
  // Some file systems tell only at the end that the disk is full.
  return isWritten && std::fflush(file.get()) == 0 && std::fclose(file.release()) == 0;
}

}  // namespace

Result<void> replaceFile(const std::string& path, std::string_view contents) {
  std::error_code error;
  const fs::file_status earlier = fs::status(path, error);
  if (fs::exists(earlier) && !fs::is_regular_file(earlier)) return writeAsItIs(path, contents);
  // A link goes on leading to the file.
  const std::string target = fs::exists(earlier) ? fs::canonical(path, error).string() : path;
  const SignalsHeldBack held;
  const std::string part = fmt::format("{}.{}.part", target, ::getpid());
  if (writeNew(part, contents, earlier) && std::rename(part.c_str(), target.c_str()) == 0)
    return {};
  auto reason = failed(path);
  fs::remove(part, error);
  return reason;
}

}  // namespace kestro
