// SPDX-License-Identifier: MIT
// A program that a test starts, reads from, and ends.
#pragma once

#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <initializer_list>
#include <string>
#include <vector>

#include "Platform/Linux/FileDescriptor.h"

namespace kestro {

/// Runs until the object ends, which kills it; at most a minute.
class ChildProcess {
 public:
  /// `arguments`: the program, found in $PATH, and what it is given.
  explicit ChildProcess(std::initializer_list<std::string> arguments) {
    std::vector<std::string> texts(arguments);
    std::vector<char*> pointers;
    for (std::string& text : texts) pointers.push_back(text.data());
    pointers.push_back(nullptr);
    std::array<int, 2> ends = {-1, -1};
    if (::pipe(ends.data()) != 0) return;
    _output.reset(ends[0]);
    _pid = ::fork();
    if (_pid == 0) {
      ::alarm(60);  // whatever becomes of the test, the program does not stay
      ::dup2(ends[1], STDOUT_FILENO);
      ::close(ends[0]);
      ::close(ends[1]);
      ::execvp(pointers[0], pointers.data());
      ::_exit(127);
    }
    ::close(ends[1]);
  }
  ~ChildProcess() {
    if (_pid <= 0) return;
    ::kill(_pid, SIGKILL);
    ::waitpid(_pid, nullptr, 0);
  }
  ChildProcess(const ChildProcess&) = delete;
  ChildProcess& operator=(const ChildProcess&) = delete;

  /// Reads the program's output until it has written `text`; false when it ends before that.
  [[nodiscard]] bool readUntil(const std::string& text) {
    while (_read.find(text) == std::string::npos) {
      if (!readMore()) return false;
    }
    return true;
  }
  /// All that the program writes until it ends.
  [[nodiscard]] std::string readAll() {
    while (readMore()) {
    }
    return _read;
  }
  [[nodiscard]] const std::string& output() const { return _read; }

 private:
  bool readMore() {
    std::array<char, 4096> piece = {};
    const ssize_t count = ::read(_output.get(), piece.data(), piece.size());
    if (count > 0) _read.append(piece.data(), static_cast<std::size_t>(count));
    return count > 0;
  }

  pid_t _pid = -1;
  FileDescriptor _output;
  std::string _read;
};

}  // namespace kestro
