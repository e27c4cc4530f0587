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

}  // namespace

std::optional<Moment> momentOfDate(std::string_view text) noexcept {
  using namespace std::chrono;
  constexpr std::string_view kForm = "YYYY-MM-DD hh:mm:ss +hhmm";
  if (text.size() != kForm.size()) return std::nullopt;
  for (std::size_t i = 0; i < kForm.size(); ++i) {
    if (const bool isFixed = kForm[i] == '-' || kForm[i] == ':' || kForm[i] == ' ';
        isFixed && text[i] != kForm[i]) {
      return std::nullopt;
    }
  }
  const auto years = digits(text, 0, 4), month = digits(text, 5, 2), day = digits(text, 8, 2);
  const auto hour = digits(text, 11, 2), minute = digits(text, 14, 2), second = digits(text, 17, 2);
  const auto zoneHours = digits(text, 21, 2), zoneMinutes = digits(text, 23, 2);
  const char sign = text[20];
  if (!years || !month || !day || !hour || !minute || !second || !zoneHours || !zoneMinutes ||
      (sign != '+' && sign != '-')) {
    return std::nullopt;
  }
  const year_month_day date(year(*years), std::chrono::month(static_cast<unsigned>(*month)),
                            std::chrono::day(static_cast<unsigned>(*day)));
  if (!date.ok() || *years == 0 || *hour > 23 || *minute > 59 || *second > 60) return std::nullopt;
  const auto offset = hours(*zoneHours) + minutes(*zoneMinutes);
  const Moment local = sys_days(date) + hours(*hour) + minutes(*minute) + seconds(*second);
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
