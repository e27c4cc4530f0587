// SPDX-License-Identifier: MIT
// What property-list values refer to: the objects behind Value, KeyList, Dictionary and Array. For
// PropertyList*.cpp alone.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <functional>
#include <memory>
#include <new>
#include <string_view>
#include <unordered_set>
#include <utility>
#include <vector>

#include "Platform/PropertyList.h"

namespace kestro::detail {

/// Lists of keys longer than this are searched through an index.
inline constexpr std::size_t kLinearSearchLimit = 24;

inline bool isKey(const Value& key, const Value& wanted) noexcept { return key == wanted; }
inline bool isKey(const Value& key, std::string_view wanted) noexcept {
  return key.isText() && key.text() == wanted;
}

/// Finds keys by text without a copy of them: the set holds positions in the list.
struct KeyHash {
  using is_transparent = void;
  const std::vector<Value>* keys;
  std::size_t operator()(std::uint32_t index) const noexcept { return (*this)((*keys)[index]); }
  std::size_t operator()(const Value& key) const noexcept { return (*this)(key.text()); }
  std::size_t operator()(std::string_view text) const noexcept {
    return std::hash<std::string_view>()(text);
  }
};

struct KeyEqual {
  using is_transparent = void;
  const std::vector<Value>* keys;
  bool operator()(std::uint32_t left, std::uint32_t right) const noexcept { return left == right; }
  template <class Key>
  bool operator()(const Key& key, std::uint32_t index) const noexcept {
    return isKey((*keys)[index], key);
  }
  template <class Key>
  bool operator()(std::uint32_t index, const Key& key) const noexcept {
    return isKey((*keys)[index], key);
  }
};

using KeyIndex = std::unordered_set<std::uint32_t, KeyHash, KeyEqual>;

struct KeyListObject {
  std::uint32_t references = 1;
  std::vector<Value> keys;
  std::unique_ptr<KeyIndex> index;

  void retain() noexcept { ++references; }
  void release() noexcept {
    if (--references == 0) delete this;
  }

  void append(const Value& key) {
    keys.push_back(key);
    if (index) {
      index->insert(static_cast<std::uint32_t>(keys.size() - 1));
    } else if (keys.size() > kLinearSearchLimit) {
      buildIndex();
    }
  }

  void removeAt(std::size_t position) {
    index.reset();
    keys.erase(keys.begin() + static_cast<std::ptrdiff_t>(position));
    if (keys.size() > kLinearSearchLimit) buildIndex();
  }

  void swap(std::vector<Value>& other) {
    index.reset();
    keys.swap(other);
    if (keys.size() > kLinearSearchLimit) buildIndex();
  }

  void buildIndex() {
    index = std::make_unique<KeyIndex>(2 * keys.size(), KeyHash{&keys}, KeyEqual{&keys});
    for (std::uint32_t i = 0; i < keys.size(); ++i) index->insert(i);
  }

  /// The position of a key (a value, or a text), or the number of keys when it is not there.
  template <class Key>
  [[nodiscard]] std::size_t find(const Key& key) const noexcept {
    if (index) {
      const auto found = index->find(key);
      return found == index->end() ? keys.size() : *found;
    }
    const auto found =
        std::ranges::find_if(keys, [&](const Value& other) { return isKey(other, key); });
    return static_cast<std::size_t>(found - keys.begin());
  }
};

/// The text follows the object in the same piece of memory.
struct TextObject : SharedObject {
  std::size_t size = 0;

  [[nodiscard]] static TextObject* make(std::string_view text) {
    auto* object = new (::operator new(sizeof(TextObject) + text.size())) TextObject;
    object->size = text.size();
    std::memcpy(object + 1, text.data(), text.size());
    return object;
  }
  void destroy() noexcept { ::operator delete(this); }

  [[nodiscard]] std::string_view text() const noexcept {
    return {reinterpret_cast<const char*>(this + 1), size};
  }
};

struct DataObject : SharedObject {
  Bytes bytes;
};

struct DictionaryObject : SharedObject {
  KeyListObject* keys = nullptr;
  std::vector<Value> values;

  DictionaryObject() = default;
  DictionaryObject(const DictionaryObject&) = delete;
  DictionaryObject& operator=(const DictionaryObject&) = delete;
  ~DictionaryObject() { dropKeys(); }

  void dropKeys() noexcept {
    if (keys != nullptr) std::exchange(keys, nullptr)->release();
  }
};

struct ArrayObject : SharedObject {
  std::vector<Value> elements;
};

/// Empties a container whose last strong reference went; frees it unless weak references remain.
template <class Object, class Empty>
void endContainer(Object* object, Empty empty) noexcept {
  ++object->weak;  // the contents may hold the last weak reference to their own container
  empty(*object);
  if (--object->weak == 0) delete object;
}

template <class Object>
Object* retained(Object* object) noexcept {
  if (object != nullptr) ++object->strong;
  return object;
}

inline void emptyDictionary(DictionaryObject& object) noexcept {
  const std::vector<Value> values = std::move(object.values);
  object.values.clear();
  object.dropKeys();
}

inline void emptyArray(ArrayObject& object) noexcept {
  const std::vector<Value> elements = std::move(object.elements);
  object.elements.clear();
}

inline void releaseDictionary(DictionaryObject* object) noexcept {
  if (object != nullptr && --object->strong == 0) endContainer(object, emptyDictionary);
}

inline void releaseArray(ArrayObject* object) noexcept {
  if (object != nullptr && --object->strong == 0) endContainer(object, emptyArray);
}

/// What is returned, by reference, where there is no value.
inline constinit const Value kNullValue;

}  // namespace kestro::detail
