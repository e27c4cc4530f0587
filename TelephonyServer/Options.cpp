// SPDX-License-Identifier: MIT
#include "TelephonyServer/Options.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <CLI/CLI.hpp>
#include <charconv>
#include <sstream>
#include <string_view>
#include <system_error>
#include <utility>
#include <vector>

#include "Options/ProgramOptions.h"

namespace kestro {
namespace {

constexpr int kWrongUsage = 2;
constexpr double kSlowestPlayback = 0.001;
constexpr double kFastestPlayback = 1e6;

std::string indented(std::string_view text, std::string_view indent) {
  std::string result(indent);
  for (const char c : text) {
    result += c;
    if (c == '\n') result += indent;
  }
  return result;
}

std::string footer() {
  std::string text = "Sources:\n";
  for (const auto& kind : sourceKinds()) {
    text += fmt::format("  {}\n{}\n", kind.form, indented(kind.description, "      "));
  }
  text +=
      "\nThe source's time passes whether or not a client is connected. When it has ended, the\n"
      "server stays: clients keep their channels, and no more messages come.\n"
      "\nExamples:\n"
      "  kestro-telephonyd\n"
      "  kestro-telephonyd --source=capture:drive.pcap --speed=10 --loop\n"
      "  kestro-telephonyd --source=drive-test:log.csv --technology=IFX\n"
      "  bridge | kestro-telephonyd --source=stream:- --technology=LTE\n"
      "\nPorts live in $KESTRO_PORT_DIR, else $XDG_RUNTIME_DIR/kestro, else /tmp/kestro-<uid>.\n"
      "Exit status: 0 ended as asked, 1 nothing could be done, 2 wrong usage.";
  return text;
}

/// What is wrong with a speed; nothing when it is none. (A range check alone accepts "nan".)
std::string speedProblem(const std::string& text) {
  double speed = 0;
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, speed);
  const bool isNumber = error == std::errc() && stop == end;
  if (isNumber && speed >= kSlowestPlayback && speed <= kFastestPlayback) return {};
  return fmt::format("{} is not a number from {} to {:.0f}", text, kSlowestPlayback,
                     kFastestPlayback);
}

/// The command line's texts, before they are understood.
struct Texts {
  std::string source = std::string(sourceKinds().front().name);
  std::string technology;
  int parent = 0;
};

void declare(CLI::App& app, ServerOptions& options, Texts& texts) {
  const std::vector<std::string> technologies(technologyChoices().begin(),
                                              technologyChoices().end());
  app.add_option("--source", texts.source, "Where the messages come from (below)")
      ->option_text(fmt::format("KIND[:ARGUMENT] (default: {})", texts.source));
  app.add_option("--technology", texts.technology,
                 fmt::format("What the messages are, whatever the source says:\n{}",
                             fmt::join(technologies, ", ")))
      ->check(CLI::IsMember(technologies))
      ->option_text("NAME");
  app.add_option("--speed", options.playback.speed, "Seconds of the source in one second")
      ->check(CLI::Validator(speedProblem, ""))
      ->option_text(fmt::format("X (default: {})", options.playback.speed));
  app.add_flag("--loop", options.playback.loop, "Begin again when the source has ended");
  app.add_option("--name", options.portName, "The server's port")
      ->check(CLI::Validator(portNameProblem, ""))
      ->option_text(fmt::format("NAME (default: {})", options.portName));
  addLogPriorityOption(app, options.logThreshold);
  app.add_option("--exit-with-parent", texts.parent)->expected(0, 1)->group("");
}

Result<void> understand(const CLI::App& app, const Texts& texts, ServerOptions& options) {
  auto source = parseSource(texts.source, technologyChosen(texts.technology));
  if (!source) return tl::unexpected(source.error());
  options.source = std::move(*source);
  options.exitsWithParent = app.count("--exit-with-parent") > 0;
  if (texts.parent > 0) options.parent = texts.parent;
  return {};
}

}  // namespace

std::variant<ServerOptions, OptionsText> parseServerOptions(const Bundle& bundle, int argumentCount,
                                                            const char* const* arguments) {
  CLI::App app("Streams the log messages of a phone's baseband to Kestro's displays.",
               "kestro-telephonyd");
  addVersionOption(app, bundle);
  app.footer(footer());
  ServerOptions options;
  Texts texts;
  declare(app, options, texts);
  try {
    app.parse(argumentCount, arguments);
  } catch (const CLI::ParseError& error) {
    std::ostringstream out;
    std::ostringstream err;
    const int status = app.exit(error, out, err);
    return OptionsText{out.str() + err.str(), status == 0 ? 0 : kWrongUsage};
  }
  if (const auto understood = understand(app, texts, options); !understood) {
    return OptionsText{understood.error().message + "\n", kWrongUsage};
  }
  return options;
}

}  // namespace kestro
