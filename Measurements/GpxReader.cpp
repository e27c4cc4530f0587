// SPDX-License-Identifier: MIT
#include "Measurements/GpxReader.h"

#include <expat.h>
#include <fmt/format.h>

#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <limits>
#include <vector>

namespace kestro {
namespace {

constexpr std::size_t kLongestTime = 64;

std::optional<double> degrees(const char* text, double limit) {
  const char* end = text + std::strlen(text);
  double number = 0;
  const auto [stop, error] = std::from_chars(text, end, number);
  if (error != std::errc() || stop != end || !(std::abs(number) <= limit)) return std::nullopt;
  return number;
}

/// The name without the prefix of a namespace.
std::string_view localName(const char* name) {
  const std::string_view whole(name);
  return whole.substr(whole.rfind(':') + 1);
}

/// Takes a time apart from left to right.
class IsoScanner {
 public:
  explicit IsoScanner(std::string_view text) : _text(text) {}

  /// So many digits as a number in the range; -1 where there are none.
  int digits(std::size_t count, int least, int greatest) {
    int number = 0;
    if (_text.size() < count) return -1;
    const auto [end, error] = std::from_chars(_text.data(), _text.data() + count, number);
    if (error != std::errc() || end != _text.data() + count || _text[0] == '-') return -1;
    _text.remove_prefix(count);
    return number < least || number > greatest ? -1 : number;
  }
  bool take(char c) {
    if (!_text.starts_with(c)) return false;
    _text.remove_prefix(1);
    return true;
  }
  /// What stands behind the seconds' point, cut to microseconds; absent without a digit.
  std::optional<std::chrono::microseconds> fraction() {
    std::int64_t micros = 0;
    std::size_t count = 0;
    for (; !_text.empty() && _text[0] >= '0' && _text[0] <= '9'; _text.remove_prefix(1), ++count) {
      if (count < 6) micros = micros * 10 + (_text[0] - '0');
    }
    if (count == 0) return std::nullopt;
    for (; count < 6; ++count) micros *= 10;
    return std::chrono::microseconds(micros);
  }
  [[nodiscard]] bool isDone() const { return _text.empty(); }

 private:
  std::string_view _text;
};

std::optional<std::chrono::minutes> zoneOffset(IsoScanner& scanner) {
  if (scanner.take('Z')) return std::chrono::minutes(0);
  const bool isWest = scanner.take('-');
  if (!isWest && !scanner.take('+')) return std::nullopt;
  const int hours = scanner.digits(2, 0, 14);
  static_cast<void>(scanner.take(':'));
  const int minutes = scanner.digits(2, 0, 59);
  if (hours < 0 || minutes < 0) return std::nullopt;
  return std::chrono::minutes((isWest ? -1 : 1) * (60 * hours + minutes));
}

}  // namespace

std::optional<Moment> momentOfIsoText(std::string_view text) {
  using std::chrono::day, std::chrono::hours, std::chrono::microseconds, std::chrono::minutes,
      std::chrono::month, std::chrono::seconds, std::chrono::sys_days, std::chrono::year,
      std::chrono::year_month_day;
  IsoScanner scanner(text);
  const int y = scanner.digits(4, 1970, 9999);
  const int m = scanner.take('-') ? scanner.digits(2, 1, 12) : -1;
  const int d = scanner.take('-') ? scanner.digits(2, 1, 31) : -1;
  const int hour = scanner.take('T') ? scanner.digits(2, 0, 23) : -1;
  const int minute = scanner.take(':') ? scanner.digits(2, 0, 59) : -1;
  const int second = scanner.take(':') ? scanner.digits(2, 0, 60) : -1;
  if (y < 0 || m < 0 || d < 0 || hour < 0 || minute < 0 || second < 0) return std::nullopt;
  const auto fraction = scanner.take('.') ? scanner.fraction() : microseconds(0);
  const auto offset = zoneOffset(scanner);
  const year_month_day date(year(y), month(static_cast<unsigned>(m)),
                            day(static_cast<unsigned>(d)));
  if (!fraction || !offset || !scanner.isDone() || !date.ok()) return std::nullopt;
  return sys_days(date) + hours(hour) + minutes(minute) + seconds(second) + *fraction - *offset;
}

/// What is open in the file, and what has been read of it.
struct GpxReader::State {
  XML_Parser parser = XML_ParserCreate(nullptr);
  std::vector<Fix> fixes{};
  std::uint64_t leftOut = 0;
  bool isGpx = false;
  bool hasRoot = false;
  bool hasTooMany = false;
  bool isInPoint = false;
  bool isInTime = false;
  std::optional<double> latitude{};
  std::optional<double> longitude{};
  std::string time{};

  State() {
    XML_SetUserData(parser, this);
    XML_SetElementHandler(parser, begin, end);
    XML_SetCharacterDataHandler(parser, text);
  }
  ~State() { XML_ParserFree(parser); }
  State(const State&) = delete;
  State& operator=(const State&) = delete;

  static void begin(void* self, const char* name, const char** attributes) {
    static_cast<State*>(self)->beginElement(localName(name), attributes);
  }
  static void end(void* self, const char* name) {
    static_cast<State*>(self)->endElement(localName(name));
  }
  static void text(void* self, const char* characters, int count) {
    auto& state = *static_cast<State*>(self);
    if (!state.isInTime) return;
    if (state.time.size() < kLongestTime) {
      state.time.append(characters, static_cast<std::size_t>(count));
    }
  }

  void beginElement(std::string_view name, const char** attributes) {
    if (!hasRoot) {
      isGpx = name == "gpx";
      hasRoot = true;
      if (!isGpx) XML_StopParser(parser, XML_FALSE);
    } else if (name == "trkpt") {
      beginPoint(attributes);
    } else if (name == "time" && isInPoint) {
      isInTime = true;
    }
  }

  void beginPoint(const char** attributes) {
    isInPoint = true;
    latitude = longitude = std::nullopt;
    time.clear();
    for (; *attributes != nullptr; attributes += 2) {
      const std::string_view name(attributes[0]);
      if (name == "lat") latitude = degrees(attributes[1], 90);
      if (name == "lon") longitude = degrees(attributes[1], 180);
    }
  }

  void endElement(std::string_view name) {
    if (name == "time") isInTime = false;
    if (name == "trkpt") endPoint();
  }

  void endPoint() {
    isInPoint = false;
    const std::size_t first = std::min(time.find_first_not_of(" \t\r\n"), time.size());
    const std::size_t last = time.find_last_not_of(" \t\r\n") + 1;
    const auto moment =
        momentOfIsoText(std::string_view(time).substr(first, std::max(first, last) - first));
    if (!moment || !latitude || !longitude) {
      ++leftOut;
    } else if (fixes.size() == Track::kMaximumFixes) {
      hasTooMany = true;
      XML_StopParser(parser, XML_FALSE);
    } else {
      fixes.push_back({*moment, {.latitude = *latitude, .longitude = *longitude}});
    }
  }

  [[nodiscard]] std::string fault() const {
    if (hasTooMany) return fmt::format("more than {} points", Track::kMaximumFixes);
    if (hasRoot && !isGpx) return "not a GPX file: its outermost element is not <gpx>";
    return fmt::format("line {}, column {}: {}", XML_GetCurrentLineNumber(parser),
                       XML_GetCurrentColumnNumber(parser) + 1,
                       XML_ErrorString(XML_GetErrorCode(parser)));
  }

  Result<void> parse(std::string_view bytes, bool isLast) {
    constexpr std::size_t kPiece = 1U << 20U;
    do {
      const std::string_view piece = bytes.substr(0, kPiece);
      bytes.remove_prefix(piece.size());
      const bool ends = isLast && bytes.empty();
      const auto status =
          XML_Parse(parser, piece.data(), static_cast<int>(piece.size()), ends ? 1 : 0);
      if (status != XML_STATUS_OK) return failure(fault());
    } while (!bytes.empty());
    return {};
  }
};

GpxReader::GpxReader() : _state(std::make_unique<State>()) {}
GpxReader::~GpxReader() = default;

Result<void> GpxReader::take(std::string_view bytes) {
  return bytes.empty() ? Result<void>() : _state->parse(bytes, false);
}

Result<Track> GpxReader::finish() {
  if (auto done = _state->parse({}, true); !done) return tl::unexpected(done.error());
  if (_state->fixes.empty()) return failure("no track point with a place and a time");
  return Track(std::move(_state->fixes));
}

std::uint64_t GpxReader::leftOutCount() const noexcept { return _state->leftOut; }

Result<Track> readGpxFile(const std::string& path, std::uint64_t& leftOut) {
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path.c_str(), "rbe"),
                                                             std::fclose);
  if (!file) return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  GpxReader reader;
  std::array<char, 1U << 16U> buffer{};
  while (const std::size_t count = std::fread(buffer.data(), 1, buffer.size(), file.get())) {
    if (auto taken = reader.take({buffer.data(), count}); !taken) {
      return failure(fmt::format("{}: {}", path, taken.error().message));
    }
  }
  if (std::ferror(file.get()) != 0) {
    return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  }
  auto track = reader.finish();
  leftOut = reader.leftOutCount();
  if (!track) return failure(fmt::format("{}: {}", path, track.error().message));
  return track;
}

}  // namespace kestro
