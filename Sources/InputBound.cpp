// SPDX-License-Identifier: MIT
#include "Sources/InputBound.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>

namespace kestro {
namespace {

using std::chrono::microseconds;
using std::chrono::minutes;

/// Takes a text apart from its front on.
class Scanner {
 public:
  explicit Scanner(std::string_view text) : _text(text) {}

  [[nodiscard]] bool isAtEnd() const noexcept { return _text.empty(); }

  [[nodiscard]] bool take(char expected) noexcept {
    if (!_text.starts_with(expected)) return false;
    _text.remove_prefix(1);
    return true;
  }

  /// A number of exactly `digits` digits, or, without that, of as many as there are.
  template <class Number>
  [[nodiscard]] std::optional<Number> takeNumber(std::optional<std::size_t> digits = {}) noexcept {
    const auto span = std::min(_text.find_first_not_of("0123456789"), _text.size());
    const auto size = digits.value_or(span);
    if (size == 0 || size > span) return std::nullopt;
    Number number{};
    const auto* end = _text.data() + size;
    if (std::from_chars(_text.data(), end, number).ec != std::errc()) return std::nullopt;
    _text.remove_prefix(size);
    return number;
  }

  /// What follows a decimal point, in microseconds; 0 without one.
  [[nodiscard]] std::optional<microseconds> takeFraction() noexcept {
    constexpr std::size_t kDigits = 6;
    if (!take('.')) return microseconds(0);
    const auto span = std::min(_text.find_first_not_of("0123456789"), _text.size());
    auto fraction = takeNumber<std::int64_t>(span);
    if (!fraction || span > kDigits) return std::nullopt;
    for (std::size_t i = span; i < kDigits; ++i) *fraction *= 10;
    return microseconds(*fraction);
  }

 private:
  std::string_view _text;
};

/// No recording is longer.
constexpr std::int64_t kMostOfAUnit = 1'000'000;

struct Unit {
  char letter;
  std::chrono::seconds length;
};
constexpr std::array kUnits = {Unit{'h', std::chrono::hours(1)}, Unit{'m', minutes(1)},
                               Unit{'s', std::chrono::seconds(1)}};

/// "1h2m3.5s", its units in that order, of which one must be there.
std::optional<microseconds> durationIn(Scanner scanner) {
  microseconds sum(0);
  std::size_t unit = 0;
  do {
    const auto count = scanner.takeNumber<std::int64_t>();
    const auto fraction = scanner.takeFraction();
    if (!count || !fraction || *count > kMostOfAUnit) return std::nullopt;
    while (unit < kUnits.size() && !scanner.take(kUnits[unit].letter)) ++unit;
    if (unit == kUnits.size()) return std::nullopt;
    const auto length = kUnits[unit].length;
    const bool isWhole = fraction->count() == 0;
    if (!isWhole && length != std::chrono::seconds(1)) return std::nullopt;
    sum += length * *count + *fraction;
    ++unit;
  } while (!scanner.isAtEnd());
  return sum;
}

std::optional<std::chrono::sys_days> takeDate(Scanner& scanner) {
  const auto year = scanner.takeNumber<int>(4);
  if (!year || !scanner.take('-')) return std::nullopt;
  const auto month = scanner.takeNumber<unsigned>(2);
  if (!month || !scanner.take('-')) return std::nullopt;
  const auto day = scanner.takeNumber<unsigned>(2);
  if (!day) return std::nullopt;
  const std::chrono::year_month_day date{std::chrono::year(*year), std::chrono::month(*month),
                                         std::chrono::day(*day)};
  if (!date.ok()) return std::nullopt;
  return std::chrono::sys_days(date);
}

/// "hh:mm", of which the hours are fewer than `hoursEnd`.
std::optional<minutes> takeHoursAndMinutes(Scanner& scanner, unsigned hoursEnd) {
  const auto hours = scanner.takeNumber<unsigned>(2);
  if (!hours || *hours >= hoursEnd || !scanner.take(':')) return std::nullopt;
  const auto rest = scanner.takeNumber<unsigned>(2);
  if (!rest || *rest >= 60) return std::nullopt;
  return std::chrono::hours(*hours) + minutes(*rest);
}

std::optional<microseconds> takeTimeOfDay(Scanner& scanner) {
  const auto clock = takeHoursAndMinutes(scanner, 24);
  if (!clock) return std::nullopt;
  if (!scanner.take(':')) return *clock;
  const auto seconds = scanner.takeNumber<unsigned>(2);
  if (!seconds || *seconds >= 60) return std::nullopt;
  const auto fraction = scanner.takeFraction();
  if (!fraction) return std::nullopt;
  return *clock + std::chrono::seconds(*seconds) + *fraction;
}

/// What the zone is ahead of UTC; 0 without one.
std::optional<minutes> takeZone(Scanner& scanner) {
  if (scanner.isAtEnd() || scanner.take('Z')) return minutes(0);
  const bool isEast = scanner.take('+');
  if (!isEast && !scanner.take('-')) return std::nullopt;
  const auto offset = takeHoursAndMinutes(scanner, 24);
  if (!offset) return std::nullopt;
  return isEast ? *offset : -*offset;
}

std::optional<Moment> momentIn(Scanner scanner) {
  const auto date = takeDate(scanner);
  if (!date) return std::nullopt;
  if (scanner.isAtEnd()) return Moment(*date);
  if (!scanner.take('T') && !scanner.take(' ')) return std::nullopt;
  const auto timeOfDay = takeTimeOfDay(scanner);
  if (!timeOfDay) return std::nullopt;
  const auto zone = takeZone(scanner);
  if (!zone || !scanner.isAtEnd()) return std::nullopt;
  return Moment(*date) + *timeOfDay - *zone;
}

std::optional<MessageNumber> numberIn(Scanner scanner) {
  const auto number = scanner.takeNumber<std::uint64_t>();
  if (!number || *number == 0 || !scanner.isAtEnd()) return std::nullopt;
  return MessageNumber{*number};
}

template <class Bound>
std::optional<InputBound> orNothing(const std::optional<Bound>& bound) {
  return bound ? std::optional<InputBound>(*bound) : std::nullopt;
}

std::optional<InputBound> boundIn(std::string_view text) {
  if (text.starts_with('#')) return orNothing(numberIn(Scanner(text.substr(1))));
  if (text.starts_with('+')) return orNothing(durationIn(Scanner(text.substr(1))));
  return orNothing(momentIn(Scanner(text)));
}

}  // namespace

Result<InputBound> parseInputBound(std::string_view text) {
  if (const auto bound = boundIn(text)) return *bound;
  return failure(fmt::format("\"{}\" is no time; the forms are {}", text, kInputBoundForms));
}

}  // namespace kestro
