// SPDX-License-Identifier: MIT
// The summary of an input, for people.
#include <fmt/format.h>

#include <algorithm>
#include <functional>
#include <iterator>

#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Formats/InputSummary.h"
#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/TimeText.h"

namespace kestro {
namespace {

constexpr std::size_t kLabelWidth = 14;

void appendFact(std::string& output, std::string_view label, std::string_view text) {
  fmt::format_to(std::back_inserter(output), "  {:<{}}{}\n", label, kLabelWidth, text);
}

/// "42:08" or "1:02:03".
std::string lengthText(std::chrono::microseconds length) {
  const auto seconds = length.count() / 1'000'000;
  if (seconds < 3600) return fmt::format("{}:{:02}", seconds / 60, seconds % 60);
  return fmt::format("{}:{:02}:{:02}", seconds / 3600, seconds / 60 % 60, seconds % 60);
}

/// What there is in one input that is not to be overlooked.
void appendCount(std::string& output, std::string_view label, std::uint64_t count,
                 std::string_view what) {
  if (count > 0) appendFact(output, label, fmt::format("{} {}", count, what));
}

void appendKinds(std::string& output, const InputSummary& summary, const NameOfKind& nameOf) {
  if (summary.all.messages == 0) return;
  const auto line = [&](std::string_view technology, std::string_view code, std::string_view name,
                        const InputSummary::Sum& sum) {
    fmt::format_to(std::back_inserter(output), "  {:<12}  {:<8}  {:>9}  {:>11}  {}", technology,
                   code, sum.messages, sum.bytes, name);
    output.erase(output.find_last_not_of(' ') + 1);
    output += '\n';
  };
  fmt::format_to(std::back_inserter(output), "  {:<12}  {:<8}  {:>9}  {:>11}  {}\n", "Technology",
                 "Code", "Messages", "Bytes", "Name");
  for (const auto& [technology, sum] : summary.technologies) {
    line(technology, "", "", sum);
    for (const auto& [kind, part] : summary.kinds) {
      if (kind.first != technology || !kind.second) continue;
      line("", logCodeText(*kind.second), nameOf(kind), part);
    }
  }
}

void appendMore(std::string& output, std::uint64_t count, std::size_t kept) {
  if (count > kept) fmt::format_to(std::back_inserter(output), "    and {} more\n", count - kept);
}

void appendGaps(std::string& output, const InputSummary& summary) {
  if (summary.gaps.empty()) return;
  output += "  Gaps of 5 s and more\n";
  for (const auto& gap : summary.gaps) {
    const std::chrono::duration<double> length = gap.to - gap.from;
    fmt::format_to(std::back_inserter(output), "    {}  {:.1f} s, before message {}\n",
                   isoTimeText(gap.from), length.count(), gap.message);
  }
  appendMore(output, summary.gapCount, summary.gaps.size());
}

void appendNotes(std::string& output, const InputSummary& summary) {
  if (summary.notes.empty()) return;
  output += "  Notes\n";
  for (const auto& note : summary.notes) {
    const auto place = note.time
                           ? fmt::format("{}  message {}", isoTimeText(*note.time), note.message)
                           : std::string("at the end");
    fmt::format_to(std::back_inserter(output), "    {}  {}\n", place, displayText(note.text));
  }
  appendMore(output, summary.noteCount, summary.notes.size());
}

}  // namespace

void appendInfoTable(std::string& output, const InputSummary& summary, const NameOfKind& nameOf) {
  fmt::format_to(std::back_inserter(output), "{}\n", displayText(summary.name));
  appendFact(output, "Form", summary.form);
  if (summary.first) {
    appendFact(output, "Span",
               fmt::format("{} to {}, {}", isoTimeText(*summary.first), isoTimeText(*summary.last),
                           lengthText(*summary.last - *summary.first)));
  }
  appendFact(output, "Messages",
             fmt::format("{}, {} bytes", summary.all.messages, summary.all.bytes));
  for (const auto& mark : summary.madeUp) appendFact(output, "Made up", displayText(mark));
  appendCount(output, "Positions", summary.positionCount, "messages");
  appendCount(output, "Cut", summary.cutCount, "messages, by their recorder");
  appendCount(output, "Passed over", summary.passedOverCount, "records that are no messages");
  appendCount(output, "Times go back", summary.timesBackCount, "times");
  for (const auto& damage : summary.damage) appendFact(output, "Damaged", displayText(damage));
  appendKinds(output, summary, nameOf);
  appendGaps(output, summary);
  appendNotes(output, summary);
}

}  // namespace kestro
