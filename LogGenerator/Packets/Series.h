// SPDX-License-Identifier: MIT
// What is measured over time: series, and the items of lists that they belong to.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace kestro {

enum class SeriesKind : std::uint8_t {
  Number,  ///< a number with its unit
  State,   ///< one of a table's texts, with the number that it stands for
  Text,
};

/// Where a generator's display shows a value.
struct DisplayPath {
  /// The keys, as the display has them ("01;Serving Cell"), from the root to the container that the
  /// value stands in; for a list's row, to the list. Without any, and without a key, the display
  /// has no place for the value.
  std::vector<std::string> container{};
  /// The value's key in the container, or in its row; empty for a row that is a plain text.
  std::string key{};
  /// Which element of an array under that key; -1: the value is no array.
  int element = -1;
  /// Whether the container is no list but a dictionary of rows, each an entry whose key begins with
  /// the record's number: "3;168".
  bool rowsAreEntries = false;
};

/// What the series of one value have in common, whatever row of a list they belong to.
struct SeriesGroup {
  std::string technology{};  ///< as the log channel names it
  std::string section{};     ///< as the display shows it; with its list: "BLER/Transport Channels"
  std::string key;
  std::string unit{};  ///< "dBm", "%"; empty: none
  SeriesKind kind = SeriesKind::Number;
  DisplayPath path{};

  /// "Serving Cell Measurements/Measured RSRP"
  [[nodiscard]] std::string name() const { return section.empty() ? key : section + "/" + key; }
};

/// One of the values that tell a list's row from the others.
struct ItemPart {
  std::string key;  ///< "Physical Cell ID": the key under which the row shows it, if it does
  std::int64_t number = 0;  ///< 0 for a text
  std::string text{};       ///< "14"
};

/// What a row of a list is, from packet to packet: not where it stands.
struct Item {
  std::string text;  ///< "1300/14": the parts' texts; "#0" for a row without any: its position
  std::vector<ItemPart> parts{};
};

/// One value over time.
struct Series {
  std::uint32_t id = 0;  ///< from 0, in the order in which the recording's series came up
  const SeriesGroup* group = nullptr;  ///< never null
  const Item* item = nullptr;          ///< null: the value does not belong to a list's row

  [[nodiscard]] std::string_view itemText() const noexcept {
    return item == nullptr ? std::string_view() : std::string_view(item->text);
  }
};

/// The series of one recording, each made when it first comes up. What it hands out is valid as
/// long as the table.
class SeriesTable {
 public:
  /// The most series of a recording: packets of arbitrary bytes name cells without end.
  static constexpr std::size_t kMaximumSeries = 100'000;
  static constexpr std::size_t kMaximumGroups = 10'000;
  static constexpr std::size_t kLongestName = 256;  ///< bytes of a section, a key or an item

  SeriesTable() = default;
  SeriesTable(const SeriesTable&) = delete;
  SeriesTable& operator=(const SeriesTable&) = delete;

  /// The one group of this technology, section, key, unit and kind; the path is the first one's. A
  /// null pointer when there are too many, or when its names are too long.
  [[nodiscard]] const SeriesGroup* group(SeriesGroup wanted);
  /// The one item with this text and these keys. A null pointer as above.
  [[nodiscard]] const Item* item(Item wanted);
  /// The one series of this group and item (null: none). A null pointer when there are too many.
  [[nodiscard]] const Series* series(const SeriesGroup& group, const Item* item);

  /// All series by their identifiers.
  [[nodiscard]] const std::deque<Series>& all() const noexcept { return _series; }

 private:
  struct SeriesKey {
    const SeriesGroup* group;
    const Item* item;
    bool operator==(const SeriesKey&) const = default;
  };
  struct SeriesKeyHash {
    std::size_t operator()(const SeriesKey& key) const noexcept {
      const auto group = reinterpret_cast<std::uintptr_t>(key.group);
      const auto item = reinterpret_cast<std::uintptr_t>(key.item);
      return std::hash<std::uintptr_t>()(group * 31 + item);
    }
  };

  std::map<std::string, SeriesGroup> _groups;    ///< by all that they are asked for by
  std::unordered_map<std::string, Item> _items;  ///< by their texts and keys
  std::deque<Series> _series;
  std::unordered_map<SeriesKey, const Series*, SeriesKeyHash> _known;
};

}  // namespace kestro
