// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>

#include "Platform/Bytes.h"
#include "Platform/Linux/PropertyListDates.h"
#include "Platform/Linux/PropertyListScan.h"
#include "Platform/Utf8.h"

namespace kestro {
namespace {

constexpr std::string_view kSignature = "bplist00";

/// The last bytes of a list; multi-byte numbers are big-endian throughout.
struct Trailer {
  static constexpr std::size_t kSize = 32;
  static constexpr std::size_t kOffsetWidthAt = 6;
  static constexpr std::size_t kReferenceWidthAt = 7;
  static constexpr std::size_t kObjectCountAt = 8;
  static constexpr std::size_t kRootAt = 16;
  static constexpr std::size_t kOffsetTableAt = 24;

  std::size_t offsetWidth = 0;
  std::size_t referenceWidth = 0;
  std::uint64_t objectCount = 0;
  std::uint64_t root = 0;
  std::uint64_t offsetTable = 0;
};

/// The upper half of an object's first byte.
enum class Kind : std::uint8_t {
  Single = 0x0,
  Integer = 0x1,
  Real = 0x2,
  Date = 0x3,
  Data = 0x4,
  Ascii = 0x5,
  Utf16 = 0x6,
  Array = 0xA,
  Dictionary = 0xD,
};

/// The objects of kind Single that are values.
constexpr std::uint64_t kFalse = 0x8;
constexpr std::uint64_t kTrue = 0x9;

/// In the lower half of the first byte: the count follows as an integer object.
constexpr std::uint8_t kCountFollows = 0xF;

struct Object {
  Kind kind = Kind::Single;
  std::uint64_t count = 0;  ///< the first byte's lower half, or the count that follows it
  std::size_t at = 0;       ///< where it begins
  std::size_t content = 0;  ///< where its content begins
};

bool hasCount(Kind kind) {
  return kind == Kind::Data || kind == Kind::Ascii || kind == Kind::Utf16 || kind == Kind::Array ||
         kind == Kind::Dictionary;
}

bool isText(Kind kind) { return kind == Kind::Ascii || kind == Kind::Utf16; }

class BinaryScan {
 public:
  BinaryScan(ByteView bytes, const PropertyListLimits& limits) : _bytes(bytes), _limits(limits) {}

  Result<PropertyListFacts> scan() {
    if (readTrailer() && visit(_trailer.root, 0)) return _facts;
    return failure(fmt::format("binary property list: {} (byte {})", _problem, _problemAt));
  }

 private:
  bool fail(std::string_view problem, std::size_t at) {
    _problem = problem;
    _problemAt = at;
    return false;
  }

  /// An integer of 1 to 8 bytes.
  [[nodiscard]] std::uint64_t number(std::size_t at, std::size_t width) const {
    return loadBigEndian<std::uint64_t>(_bytes, at) >> (8 * (8 - width));
  }

  bool readTrailer() {
    if (_bytes.size() < kSignature.size() + Trailer::kSize) return fail("too short", _bytes.size());
    const std::size_t at = _bytes.size() - Trailer::kSize;
    _trailer = {.offsetWidth = _bytes[at + Trailer::kOffsetWidthAt],
                .referenceWidth = _bytes[at + Trailer::kReferenceWidthAt],
                .objectCount = number(at + Trailer::kObjectCountAt, 8),
                .root = number(at + Trailer::kRootAt, 8),
                .offsetTable = number(at + Trailer::kOffsetTableAt, 8)};
    const auto isWidth = [](std::size_t width) { return width >= 1 && width <= 8; };
    if (!isWidth(_trailer.offsetWidth) || !isWidth(_trailer.referenceWidth)) {
      return fail("bad widths in the trailer", at);
    }
    if (_trailer.offsetTable < kSignature.size() || _trailer.offsetTable > at) {
      return fail("the offset table lies outside the list", at);
    }
    if (_trailer.objectCount > (at - _trailer.offsetTable) / _trailer.offsetWidth) {
      return fail("more objects than the offset table has room for", at);
    }
    return true;
  }

  /// Objects end where the offset table begins.
  [[nodiscard]] std::size_t end() const { return _trailer.offsetTable; }

  bool locate(std::uint64_t index, Object& object) {
    if (index >= _trailer.objectCount) return fail("a reference to no object", end());
    const std::size_t entry = end() + static_cast<std::size_t>(index) * _trailer.offsetWidth;
    const std::uint64_t at = number(entry, _trailer.offsetWidth);
    if (at < kSignature.size() || at >= end()) return fail("an object outside the list", entry);
    const std::uint8_t marker = _bytes[at];
    object = {.kind = Kind(marker >> 4), .count = marker & 0x0FU, .at = at, .content = at + 1};
    return !hasCount(object.kind) || object.count != kCountFollows || readCount(object);
  }

  bool readCount(Object& object) {
    constexpr std::uint8_t kWidthLogarithms = 0x03;
    if (!holds(object, 1)) return false;
    const std::uint8_t marker = _bytes[object.content];
    if ((marker & ~kWidthLogarithms) != 0x10) return fail("a count that is none", object.content);
    const std::size_t width = std::size_t{1} << (marker & kWidthLogarithms);
    ++object.content;
    if (!holds(object, width)) return false;
    object.count = number(object.content, width);
    object.content += width;
    return true;
  }

  /// Whether `count` units of `width` bytes of content lie inside the list.
  bool holds(const Object& object, std::uint64_t count, std::size_t width = 1) {
    if (count <= (end() - object.content) / width) return true;
    return fail("an object that is cut off", object.at);
  }

  bool visit(std::uint64_t index, std::size_t levels) {
    Object object;
    if (!locate(index, object)) return false;
    if (++_nodes > _limits.nodes) return fail("too many nodes", object.at);
    switch (object.kind) {
      case Kind::Array:
        return visitArray(object, levels + 1);
      case Kind::Dictionary:
        return visitDictionary(object, levels + 1);
      default:
        return checkLeaf(object);
    }
  }

  // A list that holds itself ends here too.
  bool enter(const Object& object, std::size_t levels, std::size_t referencesPerEntry) {
    if (levels > _limits.levels) return fail("nested too deeply", object.at);
    return holds(object, object.count, referencesPerEntry * _trailer.referenceWidth);
  }

  [[nodiscard]] std::uint64_t reference(const Object& container, std::uint64_t position) const {
    const std::size_t width = _trailer.referenceWidth;
    return number(container.content + static_cast<std::size_t>(position) * width, width);
  }

  bool visitArray(const Object& array, std::size_t levels) {
    if (!enter(array, levels, 1)) return false;
    for (std::uint64_t i = 0; i < array.count; ++i) {
      if (!visit(reference(array, i), levels)) return false;
    }
    return true;
  }

  bool visitDictionary(const Object& dictionary, std::size_t levels) {
    if (!enter(dictionary, levels, 2)) return false;
    for (std::uint64_t i = 0; i < dictionary.count; ++i) {
      const std::uint64_t key = reference(dictionary, i);
      if (!isTextObject(key) || !visit(key, levels)) return false;
      if (!visit(reference(dictionary, dictionary.count + i), levels)) return false;
    }
    return true;
  }

  bool isTextObject(std::uint64_t index) {
    Object object;
    if (!locate(index, object)) return false;
    return isText(object.kind) || fail("a dictionary key that is no text", object.at);
  }

  bool checkLeaf(const Object& object) {
    switch (object.kind) {
      case Kind::Single:
        return object.count == kFalse || object.count == kTrue || failKind(object);
      case Kind::Integer:
        return checkInteger(object);
      case Kind::Real:
        return checkReal(object);
      case Kind::Date:
        return checkDate(object);
      case Kind::Data:
        return unfold(object, 1);
      case Kind::Ascii:
        return unfold(object, 1) && checkAscii(object);
      case Kind::Utf16:
        return unfold(object, 2) && checkUtf16(object);
      default:
        return failKind(object);
    }
  }

  bool failKind(const Object& object) {
    return fail("an object of a kind that property lists do not have", object.at);
  }

  /// Counts a content of `count` units: the library copies it each time that it is reached.
  bool unfold(const Object& object, std::size_t width) {
    if (!holds(object, object.count, width)) return false;
    _unfolded += static_cast<std::size_t>(object.count) * width;
    return _unfolded <= _limits.bytes || fail("shared contents that unfold to too much", object.at);
  }

  bool checkInteger(const Object& object) {
    constexpr std::uint64_t kWidest = 4;  // as powers of two: 16 bytes
    if (object.count > kWidest) return failKind(object);
    if (!holds(object, std::uint64_t{1} << object.count)) return false;
    if (object.count < kWidest) return true;
    if (number(object.content, 8) != 0) return fail("an integer beyond 64 bits", object.at);
    constexpr std::uint64_t kLargestSigned = std::numeric_limits<std::int64_t>::max();
    _facts.hasLargeIntegers |= number(object.content + 8, 8) > kLargestSigned;
    return true;
  }

  bool checkReal(const Object& object) {
    if (object.count != 2 && object.count != 3) return failKind(object);
    return holds(object, std::uint64_t{1} << object.count);
  }

  bool checkDate(const Object& object) {
    if (object.count != 3) return failKind(object);
    if (!holds(object, sizeof(double))) return false;
    const double seconds = std::bit_cast<double>(number(object.content, sizeof(double)));
    _facts.hasFarDates |= !isLibraryDate(seconds);
    return isPropertyListDate(seconds) || fail("a date outside the years 1 to 9999", object.at);
  }

  bool checkAscii(const Object& object) {
    const ByteView text = _bytes.subspan(object.content, static_cast<std::size_t>(object.count));
    return isPlainAscii({reinterpret_cast<const char*>(text.data()), text.size()}) ||
           fail("a text with a byte that is no ASCII character", object.at);
  }

  bool checkUtf16(const Object& object) {
    bool afterHigh = false;  // a high surrogate came, its low one must follow
    for (std::uint64_t i = 0; i < object.count; ++i) {
      const std::uint64_t unit = number(object.content + static_cast<std::size_t>(2 * i), 2);
      const bool isLow = (unit & 0xFC00) == 0xDC00;
      if (unit == 0 || isLow != afterHigh) return fail("a text that is no UTF-16", object.at);
      afterHigh = (unit & 0xFC00) == 0xD800;
    }
    return !afterHigh || fail("a text that is no UTF-16", object.at);
  }

  ByteView _bytes;
  const PropertyListLimits& _limits;
  Trailer _trailer;
  PropertyListFacts _facts;
  std::size_t _nodes = 0;
  std::size_t _unfolded = 0;
  std::string_view _problem;
  std::size_t _problemAt = 0;
};

}  // namespace

bool isBinaryPropertyList(ByteView bytes) noexcept {
  return bytes.size() >= kSignature.size() &&
         std::equal(kSignature.begin(), kSignature.end(), bytes.begin());
}

Result<PropertyListFacts> scanBinaryPropertyList(ByteView bytes, const PropertyListLimits& limits) {
  return BinaryScan(bytes, limits).scan();
}

}  // namespace kestro
