// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/Command.h"

#include <fmt/format.h>

#include <charconv>
#include <cmath>
#include <string_view>
#include <system_error>
#include <utility>

#include "CommandLine/Output.h"
#include "Options/ProgramOptions.h"

namespace kestro {
namespace {

constexpr double kMaximumSeconds = 366.0 * 24 * 60 * 60;
constexpr LogCode kHighestCode = 0xFFFFFF;
constexpr int kHexadecimal = 16;

/// The whole text as a number; absent when it is none.
template <class Number>
std::optional<Number> numberIn(std::string_view text, int base) {
  Number number{};
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number, base);
  if (error != std::errc() || stop != end) return std::nullopt;
  return number;
}

std::optional<LogCode> codeIn(std::string_view text) {
  if (text.starts_with("0x") || text.starts_with("0X")) text.remove_prefix(2);
  const auto code = numberIn<LogCode>(text, kHexadecimal);
  return code && *code <= kHighestCode ? code : std::nullopt;
}

std::optional<MessageNumbers> messagesIn(std::string_view text) {
  const auto hyphen = text.find('-');
  const auto first = numberIn<std::uint64_t>(text.substr(0, hyphen), 10);
  const auto last = hyphen == std::string_view::npos
                        ? first
                        : numberIn<std::uint64_t>(text.substr(hyphen + 1), 10);
  if (!first || !last || *first < 1 || *last < *first) return std::nullopt;
  return MessageNumbers{.first = *first, .last = *last};
}

}  // namespace

ExitStatus nothingDone(std::string_view why) {
  complain(why);
  return kExitNothingDone;
}

OptionRow secondsOption(std::string name, std::string help, double& seconds) {
  return {.name = std::move(name),
          .value = "SECONDS",
          .help = std::move(help),
          .target = &seconds,
          .range = NumberRange{0, kMaximumSeconds}};
}

OptionRow messageOption(std::optional<MessageNumbers>& numbers) {
  return {.name = "--message",
          .value = "N[-M]",
          .help = "Only the message of this number, or those from N to M",
          .target = [&numbers](const std::string& text) {
            numbers = messagesIn(text);
            if (numbers) return std::string();
            return fmt::format("'{}' is no number of a message, such as 12, nor two, such as 3-7",
                               text);
          }};
}

OptionRow codeOption(std::optional<LogCode>& code) {
  return {.name = "--code",
          .value = "CODE",
          .help = "Only packets of this log code, in hexadecimal with or without 0x",
          .target = [&code](const std::string& text) {
            code = codeIn(text);
            if (code) return std::string();
            return fmt::format("'{}' is no log code, such as 0xB179 (hexadecimal, 0 to {:X})", text,
                               kHighestCode);
          }};
}

OptionRow shownLogOption(std::optional<LogPriority>& shown) {
  return {.name = "--log-priority",
          .value = "N",
          .help =
              "Show the system log's lines up to this priority on standard error (3 errors, "
              "4 warnings, 5 notices, 7 everything), and what decoders say besides",
          .target = &shown,
          .range = kLogPriorities};
}

OptionRow formatOption(std::string& format, std::vector<HelpRow> formats) {
  format = formats.front().name;
  return {.name = "--format",
          .help = "What to write; see below",
          .target = &format,
          .choices = std::move(formats)};
}

std::chrono::microseconds durationOfSeconds(double seconds) {
  return std::chrono::microseconds(std::llround(seconds * 1e6));
}

}  // namespace kestro
