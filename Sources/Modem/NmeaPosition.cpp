// SPDX-License-Identifier: MIT
#include "Sources/Modem/NmeaPosition.h"

#include <charconv>
#include <cmath>
#include <cstddef>
#include <vector>

#include "Sources/Modem/BusFields.h"

namespace kestro {
namespace {

constexpr double kKmhPerKnot = 1.852;
constexpr double kMinutesOfDegree = 60;
constexpr double kNmeaLatitude = 90;
constexpr double kNmeaLongitude = 180;
constexpr int kNmeaBase = 16;

std::optional<double> realIn(std::string_view text) {
  double number = 0;
  const char* end = text.data() + text.size();
  const auto [parsed, error] = std::from_chars(text.data(), end, number, std::chars_format::fixed);
  if (error != std::errc() || parsed != end || !std::isfinite(number)) return std::nullopt;
  return number;
}

/// "4807.038", "N" as degrees: the last two digits before the point begin the minutes.
std::optional<double> degreesIn(std::string_view text, std::string_view side, double greatest) {
  constexpr double kHundred = 100;
  const auto number = realIn(text);
  if (!number || *number < 0 || side.size() != 1) return std::nullopt;
  const double whole = std::floor(*number / kHundred);
  const double minutes = *number - whole * kHundred;
  const double degrees = whole + minutes / kMinutesOfDegree;
  if (minutes >= kMinutesOfDegree || degrees > greatest) return std::nullopt;
  return side == "S" || side == "W" ? -degrees : degrees;
}

/// The fields of a sentence whose checksum is right; none otherwise.
std::vector<std::string_view> fieldsOf(std::string_view sentence) {
  const auto star = sentence.find('*');
  if (sentence.empty() || sentence.front() != '$' || star == std::string_view::npos) return {};
  const std::string_view body = sentence.substr(1, star - 1);
  unsigned sum = 0;
  for (const char c : body) sum ^= static_cast<unsigned char>(c);
  if (numberIn(sentence.substr(star + 1), kNmeaBase) != sum) return {};
  std::vector<std::string_view> fields;
  for (std::size_t begin = 0; begin <= body.size();) {
    const auto end = std::min(body.find(',', begin), body.size());
    fields.push_back(body.substr(begin, end - begin));
    begin = end + 1;
  }
  return fields;
}

/// Where in a sentence of this type the values stand.
struct NmeaForm {
  std::string_view type;
  std::size_t status;
  std::string_view invalid;
  std::size_t latitude;
  std::size_t size;
};
constexpr NmeaForm kRmc{"RMC", 2, "V", 3, 9};
constexpr NmeaForm kGga{"GGA", 6, "0", 2, 10};
constexpr std::size_t kRmcSpeed = 7;
constexpr std::size_t kRmcCourse = 8;
constexpr std::size_t kGgaAltitude = 9;

std::optional<PositionFix> fixIn(const std::vector<std::string_view>& fields,
                                 const NmeaForm& form) {
  if (fields.size() < form.size || !fields[0].ends_with(form.type)) return std::nullopt;
  if (fields[form.status].empty() || fields[form.status] == form.invalid) return std::nullopt;
  const auto latitude = degreesIn(fields[form.latitude], fields[form.latitude + 1], kNmeaLatitude);
  const auto longitude =
      degreesIn(fields[form.latitude + 2], fields[form.latitude + 3], kNmeaLongitude);
  if (!latitude || !longitude) return std::nullopt;
  return PositionFix{.latitude = *latitude, .longitude = *longitude};
}

}  // namespace

std::optional<PositionFix> nmeaPosition(std::string_view sentences) {
  std::optional<PositionFix> moving;
  std::optional<PositionFix> still;
  for (std::size_t begin = 0; begin < sentences.size();) {
    const auto end = std::min(sentences.find_first_of("\r\n", begin), sentences.size());
    const auto fields = fieldsOf(sentences.substr(begin, end - begin));
    begin = end + 1;
    if (auto fix = fixIn(fields, kRmc)) {
      if (const auto speed = realIn(fields[kRmcSpeed])) fix->speed = *speed * kKmhPerKnot;
      fix->course = realIn(fields[kRmcCourse]);
      moving = fix;
    } else if (fix = fixIn(fields, kGga); fix) {
      fix->altitude = realIn(fields[kGgaAltitude]);
      still = fix;
    }
  }
  if (moving && still) moving->altitude = still->altitude;
  return moving ? moving : still;
}

}  // namespace kestro
