// SPDX-License-Identifier: MIT
#include "App/Options.h"

#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <QString>
#include <QStringList>

namespace kestro {
namespace {

constexpr int kWrongUsage = 2;
constexpr int kSmallestSide = 240;
constexpr int kLargestSide = 16384;
constexpr double kDefaultDelay = 5;
constexpr double kLongestDelay = 86400;

constexpr const char* kDescription =
    "Shows, live, what the cellular baseband is doing, and saves snapshots of it.";
constexpr const char* kFooter = R"(Keys:
  arrows, Page Up and Down, Home, End   move from row to row
  Enter          opens the row
  Backspace, Escape                     go back
  Ctrl-S         saves a snapshot, where saving is offered
  Ctrl-C         copies the row as "key<TAB>value"

Examples:
  kestro --demo --size=390x780
  kestro --demo=capture:drive.pcap
  kestro --demo --screenshot=kestro.png --after=5)";

/// The size in "390x780"; absent when it is none, or not one of a window.
std::optional<QSize> sizeFrom(const std::string& text) {
  const QStringList sides = QString::fromStdString(text).split(u'x');
  if (sides.size() != 2) return std::nullopt;
  bool isNumber[2] = {false, false};
  const QSize size(sides[0].toInt(&isNumber[0]), sides[1].toInt(&isNumber[1]));
  const auto isSide = [](int side) { return side >= kSmallestSide && side <= kLargestSide; };
  if (!isNumber[0] || !isNumber[1] || !isSide(size.width()) || !isSide(size.height())) {
    return std::nullopt;
  }
  return size;
}

std::string checkSize(const std::string& text) {
  if (sizeFrom(text)) return "";
  return fmt::format("'{}' is no size, such as 390x780 ({} to {} each way)", text, kSmallestSide,
                     kLargestSide);
}

void addWindowOptions(CLI::App& program, Options& options) {
  program
      .add_option_function<std::string>(
          "--size", [&options](const std::string& text) { options.windowSize = sizeFrom(text); },
          "The window's size in pixels; otherwise it covers the screen")
      ->check(CLI::Validator(checkSize, ""))
      ->option_text("WxH");
  program.add_flag("--plain", options.plain, "Do not mark values that have changed");
  auto* screenshot =
      program.add_option("--screenshot", options.screenshot, "Write a picture of the window, end")
          ->option_text("FILE");
  program.add_option("--after", options.after, "How long to wait for the picture")
      ->check(CLI::Range(0.0, kLongestDelay))
      ->needs(screenshot)
      ->option_text(fmt::format("SECONDS (default: {})", kDefaultDelay));
}

}  // namespace

std::optional<int> Options::parse(const Bundle& bundle, int argumentCount, char** arguments,
                                  Options& options) {
  options = {};
  options.after = kDefaultDelay;
  CLI::App program(kDescription, "kestro");
  addVersionOption(program, bundle);
  addLiveOptions(program, options.live);
  addWindowOptions(program, options);
  program.footer(kFooter);
  try {
    program.parse(argumentCount, arguments);
  } catch (const CLI::ParseError& error) {
    return program.exit(error) == 0 ? 0 : kWrongUsage;
  }
  return std::nullopt;
}

}  // namespace kestro
