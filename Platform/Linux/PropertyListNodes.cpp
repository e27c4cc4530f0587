// SPDX-License-Identifier: MIT
#include "Platform/Linux/PropertyListNodes.h"

#include <fmt/format.h>

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Linux/PropertyListDates.h"
#include "Platform/Linux/XmlPropertyListEdits.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Utf8.h"

namespace kestro {
namespace {

/// What the library allocated for us.
struct Freer {
  void operator()(void* memory) const noexcept { std::free(memory); }
};
using AllocatedText = std::unique_ptr<char, Freer>;
using Iterator = std::unique_ptr<void, Freer>;

// --- From nodes to values

class Reader {
 public:
  explicit Reader(const PropertyListFacts& facts) : _facts(facts) {}

  [[nodiscard]] Value value(plist_t node) {
    switch (plist_get_node_type(node)) {
      case PLIST_BOOLEAN:
        return boolean(node);
      case PLIST_UINT:
        return integer(node);
      case PLIST_REAL:
        return real(node);
      case PLIST_STRING:
        return text(node);
      case PLIST_DATE:
        return date(node);
      case PLIST_DATA:
        return data(node);
      case PLIST_ARRAY:
        return array(node);
      case PLIST_DICT:
        return dictionary(node);
      default:
        return {};  // the scan lets no other kind pass
    }
  }

 private:
  [[nodiscard]] static Value boolean(plist_t node) {
    std::uint8_t flag = 0;
    plist_get_bool_val(node, &flag);
    return Value::boolean(flag != 0);
  }

  [[nodiscard]] Value integer(plist_t node) const {
    std::uint64_t bits = 0;
    plist_get_uint_val(node, &bits);
    if (_facts.hasLargeIntegers && !isWrittenNegative(node)) return Value::unsignedInteger(bits);
    return Value::integer(static_cast<std::int64_t>(bits));
  }

  /// The library knows which integers are negative, but only its XML shows it.
  [[nodiscard]] static bool isWrittenNegative(plist_t node) {
    char* xml = nullptr;
    std::uint32_t length = 0;
    plist_to_xml(node, &xml, &length);
    const AllocatedText owner(xml);
    return std::string_view(xml, length).find("<integer>-") != std::string_view::npos;
  }

  [[nodiscard]] static Value real(plist_t node) {
    double number = 0;
    plist_get_real_val(node, &number);
    return Value::real(number);
  }

  [[nodiscard]] static Value text(plist_t node) {
    std::uint64_t length = 0;
    const char* characters = plist_get_string_ptr(node, &length);
    return std::string_view(characters, length);
  }

  // The library gives the fraction without its sign, cut to whole microseconds of a double that
  // need not reach the one that was written. Ten microseconds come back as they went.
  [[nodiscard]] Value date(plist_t node) const {
    if (_facts.hasFarDates) {
      const double sinceEpoch = writtenSeconds(node);
      if (!isLibraryDate(sinceEpoch)) {
        return Value::date(kPropertyListEpoch +
                           std::chrono::seconds(static_cast<std::int64_t>(std::floor(sinceEpoch))));
      }
    }
    std::int32_t seconds = 0;
    std::int32_t fraction = 0;
    plist_get_date_val(node, &seconds, &fraction);
    const std::int32_t rounded = (fraction + 5) / 10 * 10;
    const std::chrono::microseconds microseconds(seconds < 0 ? -rounded : rounded);
    return Value::date(kPropertyListEpoch + std::chrono::seconds(seconds) + microseconds);
  }

  /// The library hands 32 bits of a date's seconds over, but its binary form has them all: the
  /// signature, the object's first byte, and the seconds.
  [[nodiscard]] static double writtenSeconds(plist_t node) {
    constexpr std::size_t kSecondsAt = 9;
    char* binary = nullptr;
    std::uint32_t length = 0;
    plist_to_bin(node, &binary, &length);
    const AllocatedText owner(binary);
    const ByteView bytes(reinterpret_cast<const std::uint8_t*>(binary), length);
    return std::bit_cast<double>(loadBigEndian<std::uint64_t>(bytes, kSecondsAt));
  }

  [[nodiscard]] static Value data(plist_t node) {
    std::uint64_t length = 0;
    const char* bytes = plist_get_data_ptr(node, &length);
    return Value::data(Bytes(bytes, bytes + length));
  }

  [[nodiscard]] Value array(plist_t node) {
    Array result;
    result.reserve(plist_array_get_size(node));
    void* state = nullptr;
    plist_array_new_iter(node, &state);
    const Iterator iterator(state);
    while (true) {
      plist_t element = nullptr;
      plist_array_next_item(node, state, &element);
      if (element == nullptr) return result;
      result.append(value(element));
    }
  }

  struct Entry {
    AllocatedText written;
    std::string_view key;
    Value value;
  };

  /// A key as the list had it before it was edited.
  [[nodiscard]] std::string_view keyOf(const AllocatedText& written) const {
    return std::string_view(written.get()).substr(_facts.hasManyKeys ? kKeyBeginning : 0);
  }

  [[nodiscard]] std::vector<Entry> entriesOf(plist_t node) {
    std::vector<Entry> entries;
    entries.reserve(plist_dict_get_size(node));
    void* state = nullptr;
    plist_dict_new_iter(node, &state);
    const Iterator iterator(state);
    while (true) {
      char* key = nullptr;
      plist_t content = nullptr;
      plist_dict_next_item(node, state, &key, &content);
      AllocatedText owner(key);
      if (content == nullptr) return entries;
      const std::string_view text = keyOf(owner);
      entries.push_back({std::move(owner), text, value(content)});
    }
  }

  [[nodiscard]] bool haveEarlierKeys(const std::vector<Entry>& entries) const {
    std::size_t same = 0;
    for (const auto& [key, value] : _earlierKeys) {
      if (same == entries.size() || key.text() != entries[same].key) return false;
      ++same;
    }
    return same == entries.size();
  }

  // The rows of a table have the same keys: they share one list of them.
  [[nodiscard]] Value dictionary(plist_t node) {
    std::vector<Entry> entries = entriesOf(node);
    if (!haveEarlierKeys(entries)) {
      _earlierKeys = Dictionary();
      for (const Entry& entry : entries) _earlierKeys.set(entry.key, Value());
    }
    Dictionary result = _earlierKeys.copy();
    if (result.size() == entries.size()) {
      for (std::size_t i = 0; i < entries.size(); ++i) {
        result.setValueAt(i, std::move(entries[i].value));
      }
    } else {  // of entries with one key the last counts
      for (Entry& entry : entries) result.set(entry.key, std::move(entry.value));
    }
    return result;
  }

  const PropertyListFacts& _facts;
  Dictionary _earlierKeys;  ///< with null values
};

// --- From values to nodes

bool isWritable(std::string_view text) { return validTextPrefix(text) == text.size(); }

PlistNode textNode(std::string_view text) {
  if (!isWritable(text)) return nullptr;
  return PlistNode(plist_new_string(std::string(text).c_str()));
}

/// A node that the library's parser makes and its own functions do not.
PlistNode parsedNode(std::string_view element) {
  const std::string xml = fmt::format("<plist version=\"1.0\">{}</plist>", element);
  plist_t node = nullptr;
  plist_from_xml(xml.data(), static_cast<std::uint32_t>(xml.size()), &node);
  return PlistNode(node);
}

/// The library's own function for integers takes large ones for negative.
PlistNode largeIntegerNode(std::uint64_t number) {
  return parsedNode(fmt::format("<integer>{}</integer>", number));
}

PlistNode integerNode(const Value& value) {
  const auto bits = static_cast<std::uint64_t>(value.integerBits());
  return value.isAboveInt64() ? largeIntegerNode(bits) : PlistNode(plist_new_uint(bits));
}

/// The library's own function for dates takes 32 bits of seconds.
PlistNode farDateNode(Moment moment) {
  const auto days = std::chrono::floor<std::chrono::days>(moment);
  const std::chrono::year_month_day day(days);
  const std::chrono::hh_mm_ss time(std::chrono::floor<std::chrono::seconds>(moment - days));
  return parsedNode(fmt::format("<date>{:04}-{:02}-{:02}T{:02}:{:02}:{:02}Z</date>",
                                static_cast<int>(day.year()), static_cast<unsigned>(day.month()),
                                static_cast<unsigned>(day.day()), time.hours().count(),
                                time.minutes().count(), time.seconds().count()));
}

PlistNode dateNode(Moment moment) {
  const auto sinceEpoch = moment - kPropertyListEpoch;
  const auto seconds = std::chrono::floor<std::chrono::seconds>(sinceEpoch);
  const auto fraction = std::chrono::microseconds(sinceEpoch - seconds);
  const auto count = static_cast<double>(seconds.count());
  if (!isPropertyListDate(count)) return nullptr;
  if (!isLibraryDate(count)) return farDateNode(moment);
  return PlistNode(plist_new_date(static_cast<std::int32_t>(seconds.count()),
                                  static_cast<std::int32_t>(fraction.count())));
}

PlistNode dataNode(ByteView bytes) {
  return PlistNode(plist_new_data(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
}

PlistNode anyNode(const Value& value, std::size_t levels);

PlistNode arrayNode(const Array& array, std::size_t levels) {
  PlistNode result(plist_new_array());
  for (const Value& element : array) {
    PlistNode node = anyNode(element, levels);
    if (!node) return nullptr;
    plist_array_append_item(result.get(), node.release());
  }
  return result;
}

PlistNode dictionaryNode(const Dictionary& dictionary, std::size_t levels) {
  PlistNode result(plist_new_dict());
  for (const auto& [key, value] : dictionary) {
    if (!key.isText() || !isWritable(key.text())) return nullptr;
    PlistNode node = anyNode(value, levels);
    if (!node) return nullptr;
    plist_dict_set_item(result.get(), std::string(key.text()).c_str(), node.release());
  }
  return result;
}

PlistNode containerNode(const Value& value, std::size_t levels) {
  if (levels > PropertyListLimits().levels) return nullptr;
  return value.isArray() ? arrayNode(value.array(), levels)
                         : dictionaryNode(value.dictionary(), levels);
}

/// `levels` counts the containers around the value.
PlistNode anyNode(const Value& value, std::size_t levels) {
  switch (value.type()) {
    case ValueType::Null:
      return nullptr;
    case ValueType::Text:
      return textNode(value.text());
    case ValueType::Integer:
      return integerNode(value);
    case ValueType::Real:
      return PlistNode(plist_new_real(value.realNumber()));
    case ValueType::Boolean:
      return PlistNode(plist_new_bool(value.flag() ? 1 : 0));
    case ValueType::Date:
      return dateNode(value.moment());
    case ValueType::Data:
      return dataNode(value.bytes());
    case ValueType::Dictionary:
    case ValueType::Array:
      return containerNode(value, levels + 1);
  }
  return nullptr;
}

}  // namespace

Value valueOf(plist_t root, const PropertyListFacts& facts) { return Reader(facts).value(root); }

PlistNode nodeOf(const Value& value) { return anyNode(value, 0); }

}  // namespace kestro
