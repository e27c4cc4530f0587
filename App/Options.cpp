// SPDX-License-Identifier: MIT
#include "App/Options.h"

#include <fmt/format.h>

#include <QByteArray>
#include <QFileInfo>
#include <QImageWriter>
#include <QList>
#include <QString>
#include <QStringList>
#include <utility>
#include <variant>
#include <vector>

#include "Options/ArgumentParser.h"

namespace kestro {
namespace {

constexpr int kSmallestSide = 240;
constexpr int kLargestSide = 16384;
constexpr double kLongestDelay = 86400;
constexpr const char* kLight = "light";
constexpr const char* kDark = "dark";

constexpr const char* kKeys =
    R"(  arrows, Page Up and Down, Home, End   move from row to row
  Enter                                 opens the row, or the first one
  Backspace, Escape                     go back
  Ctrl-S                                saves a snapshot, where saving is offered
  Ctrl-C                                copies the row as "key<TAB>value"
  F11                                   the whole screen, and back
  Ctrl-W, Ctrl-Q                        close the window)";
constexpr const char* kExamples = R"(  kestro --demo --size=390x780
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

std::string sizeProblem(const std::string& text) {
  if (sizeFrom(text)) return "";
  return fmt::format("'{}' is no size, such as 390x780 ({} to {} each way)", text, kSmallestSide,
                     kLargestSide);
}

/// A picture's form is its file's ending.
std::string pictureProblem(const std::string& path) {
  const QByteArray ending = QFileInfo(QString::fromStdString(path)).suffix().toLower().toLatin1();
  const QList<QByteArray> endings = QImageWriter::supportedImageFormats();
  if (endings.contains(ending)) return "";
  return fmt::format("'{}' does not end as a picture's file does ({})", path,
                     endings.join(", ").toStdString());
}

std::vector<OptionRow> windowOptions(Options& options) {
  return {
      {.name = "--size",
       .value = "WxH",
       .help = "The window's size in pixels; otherwise it covers the screen",
       .target = &options.size,
       .problem = sizeProblem},
      {.name = "--plain", .help = "Do not mark values that have changed", .target = &options.plain},
      {.name = "--style",
       .help = "The window's colours; otherwise those of the desktop",
       .target = &options.style,
       .choices = {{kLight, ""}, {kDark, ""}}},
      {.name = "--screenshot",
       .value = "FILE",
       .help = "Write a picture of the window, end",
       .target = &options.screenshot,
       .problem = pictureProblem},
      {.name = "--after",
       .value = "SECONDS",
       .help = "How long to wait for the picture",
       .target = &options.after,
       .range = NumberRange{0, kLongestDelay},
       .needs = "--screenshot"},
  };
}

}  // namespace

std::optional<QSize> Options::windowSize() const { return sizeFrom(size); }

ColourStyle Options::colourStyle() const {
  if (style.empty()) return ColourStyle::System;
  return style == kDark ? ColourStyle::Dark : ColourStyle::Light;
}

CommandRow Options::program(const Bundle& bundle, Options& options) {
  CommandRow program{
      .name = "kestro",
      .help = "Shows, live, what the cellular baseband is doing, and saves snapshots of it.",
      .options = {versionOption("kestro", bundle)},
      .sections = {{.title = "Keys", .text = kKeys}, {.title = "Examples", .text = kExamples}}};
  for (auto& row : liveOptions(options.live)) program.options.push_back(std::move(row));
  for (auto& row : windowOptions(options)) program.options.push_back(std::move(row));
  return program;
}

std::optional<int> Options::parse(const Bundle& bundle, int argumentCount, char** arguments,
                                  Options& options) {
  options = {};
  const CommandRow rows = program(bundle, options);
  const auto parsed = parseArguments(rows, argumentCount, arguments);
  if (const auto* text = std::get_if<OptionsText>(&parsed)) return tell(*text);
  return std::nullopt;
}

}  // namespace kestro
