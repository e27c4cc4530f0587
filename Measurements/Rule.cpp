// SPDX-License-Identifier: MIT
#include "Measurements/Rule.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <optional>

namespace kestro {
namespace {

struct Operator {
  std::string_view text;
  Comparison comparison;
};

// Those of two characters first: the first one that fits is taken.
constexpr Operator kOperators[] = {
    {"<=", Comparison::LessOrEqual}, {">=", Comparison::GreaterOrEqual},
    {"==", Comparison::Equal},       {"!=", Comparison::NotEqual},
    {"<", Comparison::Less},         {">", Comparison::Greater},
};
constexpr std::string_view kOperatorCharacters = "<>=!";
constexpr std::string_view kBlanks = " \t\r";
constexpr double kLongestSeconds = 86'400;

/// Whether a byte of UTF-8 is a character's first.
bool beginsCharacter(char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; }

bool isBlank(char c) { return kBlanks.find(c) != std::string_view::npos; }

std::string_view withoutBlanks(std::string_view text) {
  const std::size_t first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(kBlanks) + 1 - first);
}

/// The line up to its comment; quotes hide a "#".
std::string_view withoutComment(std::string_view line) {
  bool isQuoted = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    if (line[i] == '"') isQuoted = !isQuoted;
    if (line[i] == '#' && !isQuoted) return line.substr(0, i);
  }
  return line;
}

/// Reads one line from left to right. An error says in which column it stands.
class RuleReader {
 public:
  explicit RuleReader(std::string_view line) : _line(line) {}

  Result<Rule> read() {
    Rule rule{.text = std::string(withoutBlanks(_line)), .series = {}};
    auto read = readSeries(rule)
                    .and_then([&] { return readComparison(rule); })
                    .and_then([&] { return readLimit(rule); })
                    .and_then([&] { return readUnitAndDuration(rule); });
    if (!read) return tl::unexpected(read.error());
    return rule;
  }

  /// The column, from 1, at which reading stopped.
  [[nodiscard]] std::size_t column() const {
    const std::string_view before = _line.substr(0, _at);
    return 1 + static_cast<std::size_t>(std::ranges::count_if(before, beginsCharacter));
  }

 private:
  void skipBlanks() { _at = std::min(_line.find_first_not_of(kBlanks, _at), _line.size()); }
  [[nodiscard]] std::string_view rest() const { return _line.substr(_at); }
  [[nodiscard]] std::string found() const {
    return rest().empty() ? "found the end of the line" : fmt::format("found \"{}\"", rest());
  }

  Result<void> readSeries(Rule& rule) {
    skipBlanks();
    if (rest().starts_with('"')) return readQuotedSeries(rule);
    const std::size_t end = _line.find_first_of(kOperatorCharacters, _at);
    rule.series = withoutBlanks(_line.substr(_at, end - _at));
    if (rule.series.empty()) return failure(fmt::format("expected a series, {}", found()));
    _at = std::min(end, _line.size());
    return {};
  }

  Result<void> readQuotedSeries(Rule& rule) {
    const std::size_t end = _line.find('"', _at + 1);
    if (end == std::string_view::npos) return failure("this quote is not closed");
    rule.series = withoutBlanks(_line.substr(_at + 1, end - _at - 1));
    if (rule.series.empty()) return failure("expected a series between the quotes");
    _at = end + 1;
    return {};
  }

  Result<void> readComparison(Rule& rule) {
    skipBlanks();
    for (const Operator& known : kOperators) {
      if (!rest().starts_with(known.text)) continue;
      rule.comparison = known.comparison;
      _at += known.text.size();
      return {};
    }
    return failure(fmt::format("expected one of < <= > >= == !=, {}", found()));
  }

  /// A finite decimal number.
  [[nodiscard]] std::optional<double> readNumber() {
    skipBlanks();
    const std::string_view text = rest();
    double number = 0;
    const std::size_t sign = text.starts_with('+') && !text.starts_with("+-") ? 1 : 0;
    const auto [end, error] =
        std::from_chars(text.data() + sign, text.data() + text.size(), number);
    if (error != std::errc() || !std::isfinite(number)) return std::nullopt;
    _at += static_cast<std::size_t>(end - text.data());
    return number;
  }

  Result<void> readLimit(Rule& rule) {
    const auto limit = readNumber();
    if (!limit) return failure(fmt::format("expected a number, {}", found()));
    rule.limit = *limit;
    return {};
  }

  /// Where the word "for" begins; the end of the line where there is none.
  [[nodiscard]] std::size_t placeOfFor() const {
    constexpr std::string_view kFor = "for";
    for (std::size_t at = _line.find(kFor, _at); at < _line.size(); at = _line.find(kFor, at + 1)) {
      const std::size_t end = at + kFor.size();
      const bool begins = at == _at || isBlank(_line[at - 1]);
      const bool ends = end == _line.size() || isBlank(_line[end]);
      if (begins && ends) return at;
    }
    return _line.size();
  }

  Result<void> readUnitAndDuration(Rule& rule) {
    skipBlanks();
    const std::size_t end = placeOfFor();
    rule.unit = withoutBlanks(_line.substr(_at, end - _at));
    if (const std::size_t at = rule.unit.find_first_of("<>=!\""); at != std::string::npos) {
      _at += at;
      return failure(fmt::format("expected a unit or \"for\", {}", found()));
    }
    _at = end;
    return rest().empty() ? Result<void>() : readDuration(rule);
  }

  Result<void> readDuration(Rule& rule) {
    _at += std::string_view("for").size();
    skipBlanks();
    const std::size_t begin = _at;
    const auto seconds = readNumber();
    if (!seconds) return failure(fmt::format("expected a number of seconds, {}", found()));
    if (*seconds < 0 || *seconds > kLongestSeconds) {
      _at = begin;
      return failure(fmt::format("expected 0 to {} seconds, {}", kLongestSeconds, found()));
    }
    rule.duration = std::chrono::microseconds(std::llround(*seconds * 1e6));
    skipBlanks();
    if (rest().starts_with('s')) ++_at;
    skipBlanks();
    if (!rest().empty()) return failure(fmt::format("expected the end of the rule, {}", found()));
    return {};
  }

  std::string_view _line;
  std::size_t _at = 0;
};

Result<std::optional<Rule>> parseLine(std::string_view line, const std::string& place) {
  if (line.size() > kMaximumRuleLength) {
    return failure(fmt::format("{}1: longer than {} bytes", place, kMaximumRuleLength));
  }
  line = withoutComment(line);
  if (withoutBlanks(line).empty()) return std::nullopt;
  RuleReader reader(line.substr(0, line.find_last_not_of(kBlanks) + 1));
  auto rule = reader.read();
  if (rule) return std::move(*rule);
  return failure(fmt::format("{}{}: {}", place, reader.column(), rule.error().message));
}

}  // namespace

std::string_view comparisonText(Comparison comparison) noexcept {
  return std::ranges::find(kOperators, comparison, &Operator::comparison)->text;
}

bool compares(double value, Comparison comparison, double limit) noexcept {
  switch (comparison) {
    case Comparison::Less:
      return value < limit;
    case Comparison::LessOrEqual:
      return value <= limit;
    case Comparison::Greater:
      return value > limit;
    case Comparison::GreaterOrEqual:
      return value >= limit;
    case Comparison::Equal:
      return value == limit;
    case Comparison::NotEqual:
      return value != limit;
  }
  return false;
}

Result<std::vector<Rule>> parseRules(std::string_view text, std::string_view origin) {
  std::vector<Rule> rules;
  for (std::size_t number = 1; !text.empty(); ++number) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    auto rule = parseLine(text.substr(0, end), fmt::format("{}:{}:", origin, number));
    if (!rule) return tl::unexpected(rule.error());
    if (*rule && rules.size() == kMaximumRules) {
      return failure(fmt::format("{}:{}:1: more than {} rules", origin, number, kMaximumRules));
    }
    if (*rule) rules.push_back(std::move(**rule));
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return rules;
}

}  // namespace kestro
