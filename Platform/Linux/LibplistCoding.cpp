// SPDX-License-Identifier: MIT
// Property lists as bytes, by libplist. Its parse functions (2.2.0) return nothing and leave the
// handle alone when they fail, so a handle starts as null; what they are given has been scanned.
#include <fmt/format.h>
#include <plist/plist.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <limits>
#include <string_view>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/PropertyListNodes.h"
#include "Platform/Linux/PropertyListScan.h"
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
    const std::size_t longest =
        std::min<std::size_t>(limits.bytes, std::numeric_limits<std::uint32_t>::max());
    if (bytes.size() > longest) {
      return failure(fmt::format("property list: {} bytes, {} at most", bytes.size(), longest));
    }
    const bool isBinary = isBinaryPropertyList(bytes);
    const ByteView list = isBinary ? bytes : withoutByteOrderMark(bytes);
    const auto facts =
        isBinary ? scanBinaryPropertyList(list, limits) : scanXmlPropertyList(list, limits);
    if (!facts) return tl::unexpected(facts.error());
    const PlistNode root = parseNodes(list, isBinary);
    if (!root) return failure("property list: the parser refuses it");
    return valueOf(root.get(), *facts);
  }

  [[nodiscard]] std::optional<Bytes> xml(const Value& value) const override {
    const PlistNode node = nodeOf(value);
    if (!node) return std::nullopt;
    const Written written(node.get(), plist_to_xml);
    return withoutDoctype(written.text());
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
