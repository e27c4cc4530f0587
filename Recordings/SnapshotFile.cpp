// SPDX-License-Identifier: MIT
#include "Recordings/SnapshotFile.h"

#include <fmt/format.h>

#include <chrono>
#include <utility>

#include "Recordings/StorableValue.h"

namespace kestro {
namespace {

/// The number that the digits from `at` on make; absent when there are others among them.
std::optional<int> digits(std::string_view text, std::size_t at, std::size_t count) noexcept {
  int number = 0;
  for (const char digit : text.substr(at, count)) {
    if (digit < '0' || digit > '9') return std::nullopt;
    number = number * 10 + (digit - '0');
  }
  return number;
}

/// Whether the separators of a form stand where they must.
bool hasFormOf(std::string_view text, std::string_view form) noexcept {
  if (text.size() != form.size()) return false;
  for (std::size_t i = 0; i < form.size(); ++i) {
    const bool isSeparator = form[i] == '-' || form[i] == ':' || form[i] == ' ';
    if (isSeparator && text[i] != form[i]) return false;
  }
  return true;
}

/// The day that a text begins with, "YYYY-MM-DD".
std::optional<std::chrono::sys_days> dateAt(std::string_view text) noexcept {
  const auto year = digits(text, 0, 4), month = digits(text, 5, 2), day = digits(text, 8, 2);
  if (!year || !month || !day || *year == 0) return std::nullopt;
  const std::chrono::year_month_day date(std::chrono::year(*year),
                                         std::chrono::month(static_cast<unsigned>(*month)),
                                         std::chrono::day(static_cast<unsigned>(*day)));
  if (!date.ok()) return std::nullopt;
  return std::chrono::sys_days(date);
}

}  // namespace

std::optional<Moment> momentOfDate(std::string_view text) noexcept {
  using std::chrono::hours, std::chrono::minutes, std::chrono::seconds;
  constexpr std::string_view kForm = "YYYY-MM-DD hh:mm:ss +hhmm";
  if (!hasFormOf(text, kForm)) return std::nullopt;
  const char sign = text[kForm.find('+')];
  const auto date = dateAt(text);
  const auto hour = digits(text, 11, 2), minute = digits(text, 14, 2), second = digits(text, 17, 2);
  const auto zoneHours = digits(text, 21, 2), zoneMinutes = digits(text, 23, 2);
  if (!date || !hour || !minute || !second || !zoneHours || !zoneMinutes ||
      (sign != '+' && sign != '-') || *hour > 23 || *minute > 59 || *second > 60) {
    return std::nullopt;
  }
  const auto offset = hours(*zoneHours) + minutes(*zoneMinutes);
  const Moment local = *date + hours(*hour) + minutes(*minute) + seconds(*second);
  return sign == '+' ? local - offset : local + offset;
}

Result<Bytes> snapshotFile(const PropertyListCoding& coding, const Dictionary& snapshot) {
  auto xml = coding.xml(storableValue(snapshot));
  if (!xml) return failure("the snapshot cannot be serialised");
  return *std::move(xml);
}

Result<Dictionary> parseSnapshot(const PropertyListCoding& coding, ByteView file) {
  const auto root = coding.parse(file, PropertyListLimits::snapshotFile());
  if (!root) return tl::unexpected(root.error());
  if (!root->isDictionary()) {
    return failure(
        fmt::format("no snapshot: the list is no dictionary but of type {}", root->typeName()));
  }
  const Dictionary snapshot = root->dictionary();
  if (!snapshot[kSnapshotTimestamp].isText()) {
    return failure(fmt::format("no snapshot: it has no \"{}\"", kSnapshotTimestamp));
  }
  return snapshot;
}

Value dlfOfSnapshot(const Dictionary& snapshot) {
  for (const Value& entry : snapshot[kSnapshotData].array()) {
    Value dlf = entry.dictionary()[kSnapshotDlf];
    if (dlf.isData()) return dlf;
  }
  return {};
}

}  // namespace kestro
