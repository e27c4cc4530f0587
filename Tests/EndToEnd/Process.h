// SPDX-License-Identifier: MIT
// A program of ours as a child process, its output collected while it runs. Every wait is bounded.
#pragma once

#include <sys/types.h>

#include <chrono>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace kestro::testing {

/// The longest that anything here waits before it gives up.
inline constexpr std::chrono::seconds kPatience{30};

class Process {
 public:
  enum class Terminal { None, Own };

  struct Options {
    std::vector<std::pair<std::string, std::string>> environment;
    Terminal terminal = Terminal::None;  ///< Own: all three streams are one, 100 x 40
  };

  /// Starts `arguments[0]`, one of our programs or an absolute path. Without a terminal, standard
  /// input is /dev/null.
  explicit Process(std::vector<std::string> arguments) : Process(std::move(arguments), Options()) {}
  Process(std::vector<std::string> arguments, const Options& options);
  /// Kills the process if it still runs.
  ~Process();
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;

  [[nodiscard]] pid_t id() const noexcept { return _id; }
  void signal(int number) const;
  /// Types into the terminal.
  void type(std::string_view keys) const;
  /// Gives the terminal another size, which the process is told.
  void resize(unsigned short columns, unsigned short rows) const;
  /// Stops reading standard output, as `head` does.
  void closeOutput();

  /// Collects output until `condition` holds; false when patience or the process ends first.
  bool waitUntil(const std::function<bool()>& condition);
  bool waitForOutput(std::string_view text);
  bool waitForLines(std::size_t count);
  /// Collects output to its end. The exit status, or minus the signal that ended the process; -1000
  /// when it had to be killed.
  int wait();

  [[nodiscard]] const std::string& output() const noexcept { return _output; }
  [[nodiscard]] const std::string& errors() const noexcept { return _errors; }
  [[nodiscard]] std::vector<std::string> outputLines() const;
  void forgetOutput() { _output.clear(); }

 private:
  void startWithPipes(std::vector<std::string>& arguments, const Options& options);
  void startOnTerminal(std::vector<std::string>& arguments, const Options& options);
  /// Reads what is there, waiting a little; false when both streams have ended.
  bool collect();
  [[nodiscard]] bool reap(bool wait);

  pid_t _id = -1;
  int _outputEnd = -1;
  int _errorEnd = -1;
  bool _hasEnded = false;
  int _status = 0;
  std::string _output;
  std::string _errors;
};

/// Runs a program to its end.
struct Outcome {
  int status;
  std::string output;
  std::string errors;
};
[[nodiscard]] Outcome run(std::vector<std::string> arguments);

/// Calls `condition` until it holds; false when patience ends first.
[[nodiscard]] bool eventually(const std::function<bool()>& condition);

}  // namespace kestro::testing
