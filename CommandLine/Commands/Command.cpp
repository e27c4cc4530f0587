// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/Command.h"

#include <cmath>
#include <utility>

namespace kestro {
namespace {

constexpr double kMaximumSeconds = 366.0 * 24 * 60 * 60;

}  // namespace

OptionRow secondsOption(std::string name, std::string help, double& seconds) {
  return {.name = std::move(name),
          .value = "SECONDS",
          .help = std::move(help),
          .target = &seconds,
          .range = NumberRange{0, kMaximumSeconds}};
}

OptionRow captureArgument(std::string& path) {
  return {
      .name = "CAPTURE", .help = "The capture, a pcap file", .target = &path, .isRequired = true};
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
