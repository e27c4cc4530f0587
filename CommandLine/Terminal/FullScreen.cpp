// SPDX-License-Identifier: MIT
#include "CommandLine/Terminal/FullScreen.h"

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <termios.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <string>
#include <string_view>

namespace kestro {
namespace {

constexpr std::string_view kEnter = "\033[?1049h\033[?25l\033[2J";
constexpr std::string_view kLeave = "\033[0m\033[?25h\033[?1049l";
constexpr std::string_view kToFirstLine = "\033[H";
constexpr std::string_view kClearLine = "\033[2K";
constexpr std::string_view kClearBelow = "\033[J";

/// What the terminal was like, in plain data that a signal handler may read.
struct SavedTerminal {
  bool isTaken = false;
  bool hasAttributes = false;
  termios attributes{};
  int standardError = -1;  ///< a copy of the descriptor, while it is redirected
};

SavedTerminal savedTerminal;

void writeAll(std::string_view text) noexcept {
  while (!text.empty()) {
    const ssize_t written = ::write(STDOUT_FILENO, text.data(), text.size());
    // Also when it was interrupted: the process is asked to end while its terminal takes nothing.
    if (written < 0) return;
    if (written > 0) text.remove_prefix(static_cast<std::size_t>(written));
  }
}

/// Keys are neither shown nor collected for others. The keys that suspend or abort the process
/// would leave the shell on our screen.
void silenceKeys() {
  if (::tcgetattr(STDIN_FILENO, &savedTerminal.attributes) != 0) return;
  savedTerminal.hasAttributes = true;
  termios silent = savedTerminal.attributes;
  silent.c_lflag &= ~static_cast<tcflag_t>(ECHO | ICANON);
  silent.c_cc[VSUSP] = _POSIX_VDISABLE;
  silent.c_cc[VQUIT] = _POSIX_VDISABLE;
  static_cast<void>(::tcsetattr(STDIN_FILENO, TCSANOW, &silent));
}

/// SIGQUIT ends the process as usual, with the terminal as it was.
extern "C" void restoreAndQuit(int number) {
  FullScreen::restore();
  std::signal(number, SIG_DFL);
  std::raise(number);
}

bool isSameFile(int left, int right) {
  struct stat one {};
  struct stat other {};
  return ::fstat(left, &one) == 0 && ::fstat(right, &other) == 0 && one.st_dev == other.st_dev &&
         one.st_ino == other.st_ino;
}

void silenceStandardError() {
  if (!isSameFile(STDOUT_FILENO, STDERR_FILENO)) return;
  const int nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
  if (nowhere < 0) return;
  savedTerminal.standardError = ::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 0);
  if (savedTerminal.standardError >= 0) ::dup2(nowhere, STDERR_FILENO);
  ::close(nowhere);
}

bool hasEnvironment(const char* name) {
  const char* value = std::getenv(name);
  return value != nullptr && *value != '\0';
}

}  // namespace

bool FullScreen::isPossible() {
  const char* terminal = std::getenv("TERM");
  return ::isatty(STDOUT_FILENO) == 1 && terminal != nullptr && *terminal != '\0' &&
         std::string_view(terminal) != "dumb";
}

FullScreen::FullScreen() : _colour(!hasEnvironment("NO_COLOR")) {
  silenceKeys();
  silenceStandardError();
  savedTerminal.isTaken = true;
  std::signal(SIGQUIT, restoreAndQuit);
  writeAll(kEnter);
}

FullScreen::~FullScreen() { restore(); }

TerminalSize FullScreen::size() const {
  winsize window{};
  if (::ioctl(STDOUT_FILENO, TIOCGWINSZ, &window) != 0 || window.ws_col == 0) return {};
  return {.columns = window.ws_col, .rows = window.ws_row};
}

void FullScreen::draw(const std::vector<StyledLine>& lines) {
  std::string frame(kToFirstLine);
  for (std::size_t i = 0; i < lines.size(); ++i) {
    if (i > 0) frame += "\r\n";
    frame += kClearLine;  // before the text: behind a full line it would take the last cell
    frame += lines[i].terminalText(_colour);
  }
  if (lines.size() < size().rows) {
    frame += "\r\n";
    frame += kClearBelow;
  }
  writeAll(frame);
}

void FullScreen::restore() noexcept {
  if (!savedTerminal.isTaken) return;
  savedTerminal.isTaken = false;
  writeAll(kLeave);
  if (savedTerminal.hasAttributes) {
    static_cast<void>(::tcsetattr(STDIN_FILENO, TCSAFLUSH, &savedTerminal.attributes));
  }
  if (savedTerminal.standardError >= 0) {
    ::dup2(savedTerminal.standardError, STDERR_FILENO);
    ::close(savedTerminal.standardError);
  }
  savedTerminal = SavedTerminal();
  std::signal(SIGQUIT, SIG_DFL);
}

}  // namespace kestro
