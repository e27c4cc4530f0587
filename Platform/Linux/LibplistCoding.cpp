// SPDX-License-Identifier: MIT
// Property lists as bytes, by libplist. Its parse functions (2.2.0) return nothing and leave the
// handle alone when they fail, so a handle starts as null; what they are given has been scanned.
#include <fmt/format.h>
#include <plist/plist.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <limits>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/PropertyListNodes.h"
#include "Platform/Linux/PropertyListScan.h"
#include "Platform/Linux/XmlPropertyListEdits.h"
#include "Platform/Linux/XmlPropertyListEncoding.h"
#include "Platform/PropertyListCoding.h"

namespace kestro {
namespace {

using WriteFunction = void (*)(plist_t, char**, std::uint32_t*);

/// What a writing function of the library allocated.
struct Written {
  Written(plist_t node, WriteFunction write) { write(node, &bytes, &length); }
  ~Written() { std::free(bytes); }
  Written(const Written&) = delete;
  Written& operator=(const Written&) = delete;
  [[nodiscard]] std::string_view text() const { return {bytes, length}; }

  char* bytes = nullptr;
  std::uint32_t length = 0;
};

/// The tree of a list that was scanned; null when the library refuses it all the same.
PlistNode parseNodes(ByteView list, bool isBinary) {
  plist_t root = nullptr;
  const auto* bytes = reinterpret_cast<const char*>(list.data());
  const auto size = static_cast<std::uint32_t>(list.size());
  if (isBinary) {
    plist_from_bin(bytes, size, &root);
  } else {
    plist_from_xml(bytes, size, &root);
  }
  return PlistNode(root);
}

ByteView withoutByteOrderMark(ByteView bytes) {
  constexpr std::array<std::uint8_t, 3> kMark = {0xEF, 0xBB, 0xBF};
  const bool isMarked = bytes.size() >= kMark.size() && std::ranges::equal(bytes.first(3), kMark);
  return isMarked ? bytes.subspan(kMark.size()) : bytes;
}

ByteView bytesOfText(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

std::string_view textOfBytes(ByteView bytes) {
  return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

std::optional<Error> lengthError(std::size_t bytes, const PropertyListLimits& limits) {
  const std::size_t longest =
      std::min<std::size_t>(limits.bytes, std::numeric_limits<std::uint32_t>::max());
  if (bytes <= longest) return std::nullopt;
  return Error{fmt::format("property list: {} bytes, {} at most", bytes, longest)};
}

/// The value of a list as the library is to read it.
Result<Value> parseScanned(ByteView list, bool isBinary, const PropertyListFacts& facts) {
  const PlistNode root = parseNodes(list, isBinary);
  if (!root) return failure("property list: the parser refuses it");
  return valueOf(root.get(), facts);
}

Result<Value> parseBinary(ByteView list, const PropertyListLimits& limits) {
  const auto facts = scanBinaryPropertyList(list, limits);
  if (!facts) return tl::unexpected(facts.error());
  return parseScanned(list, true, *facts);
}

Result<Value> parseXml(ByteView list, const PropertyListLimits& limits) {
  const auto facts = scanXmlPropertyList(list, limits);
  if (!facts) return tl::unexpected(facts.error());
  if (!facts->needsEdits) return parseScanned(list, false, *facts);
  const std::string edited = editedXml(textOfBytes(list), *facts);
  return parseScanned(bytesOfText(edited), false, *facts);
}

/// The library leaves the zeros of a year before 1000 out. In a text of the list its '<' would be
/// an entity, so that every <date> is one.
std::string withWholeYears(std::string_view xml) {
  constexpr std::string_view kTag = "<date>";
  constexpr std::size_t kDigits = 4;
  std::string result;
  std::size_t done = 0;
  for (std::size_t at = xml.find(kTag); at != std::string_view::npos; at = xml.find(kTag, at)) {
    at += kTag.size();
    const std::size_t digits = std::min(xml.find('-', at) - at, kDigits);
    result.append(xml.substr(done, at - done)).append(kDigits - digits, '0');
    done = at;
  }
  return result.append(xml.substr(done));
}

/// The first DOCTYPE is the library's own: in a text of the list its '<' is an entity.
Bytes withoutDoctype(std::string_view xml) {
  const std::size_t start = std::min(xml.find("<!DOCTYPE"), xml.size());
  const std::string_view head = xml.substr(0, start);
  const std::string_view doctype = xml.substr(start, xml.substr(start).find('\n'));
  const std::string_view tail = xml.substr(std::min(start + doctype.size() + 1, xml.size()));
  Bytes result;
  result.reserve(head.size() + tail.size());
  result.insert(result.end(), head.begin(), head.end());
  result.insert(result.end(), tail.begin(), tail.end());
  return result;
}

class LibplistCoding final : public PropertyListCoding {
 public:
  [[nodiscard]] Result<Value> parse(ByteView bytes,
                                    const PropertyListLimits& limits) const override {
    if (const auto error = lengthError(bytes.size(), limits)) return tl::unexpected(*error);
    if (isBinaryPropertyList(bytes)) return parseBinary(bytes, limits);
    const auto converted = xmlInUtf8(bytes);
    if (!converted) return tl::unexpected(converted.error());
    if (!*converted) return parseXml(withoutByteOrderMark(bytes), limits);
    if (const auto error = lengthError((*converted)->size(), limits)) {
      return tl::unexpected(*error);
    }
    return parseXml(bytesOfText(**converted), limits);
  }

  [[nodiscard]] std::optional<Bytes> xml(const Value& value) const override {
    const PlistNode node = nodeOf(value);
    if (!node) return std::nullopt;
    const Written written(node.get(), plist_to_xml);
    return withoutDoctype(withWholeYears(written.text()));
  }

  [[nodiscard]] std::optional<Bytes> binary(const Value& value) const override {
    const PlistNode node = nodeOf(value);
    if (!node) return std::nullopt;
    const Written written(node.get(), plist_to_bin);
    return Bytes(written.text().begin(), written.text().end());
  }
};

}  // namespace

std::unique_ptr<PropertyListCoding> createPropertyListCoding() {
  return std::make_unique<LibplistCoding>();
}

}  // namespace kestro
