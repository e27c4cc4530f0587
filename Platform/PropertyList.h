// SPDX-License-Identifier: MIT
// The values of property lists, which all layers exchange.
#pragma once

#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/Clock.h"

namespace kestro {

class Array;
class Dictionary;
class KeyList;

namespace detail {
struct ArrayObject;
struct DictionaryObject;
struct KeyListObject;

/// The counts that every shared object begins with. They are not atomic: values belong to the main
/// thread. The object's contents die with the last strong reference, its memory with the last weak.
struct SharedObject {
  std::uint32_t strong = 1;
  std::uint32_t weak = 0;
};
}  // namespace detail

enum class ValueType : std::uint8_t {
  Null,
  Text,
  Integer,
  Real,
  Boolean,
  Date,
  Data,
  Dictionary,
  Array,
};

/// One property-list value of 16 bytes. Texts of up to 15 bytes live in the value; longer texts and
/// data are immutable and shared; dictionaries and arrays are mutable and shared: copying a Value
/// that holds one makes a second reference to the same container (see `deepCopy`).
class Value {
 public:
  /// The longest text, in bytes, that copies without touching a shared object.
  static constexpr std::size_t kInlineCapacity = 15;

  constexpr Value() noexcept = default;
  // Implicit, so that code that builds values reads like the data that it builds.
  // NOLINTBEGIN(google-explicit-constructor)
  Value(std::string_view text);
  Value(const char* text) : Value(std::string_view(text)) {}
  Value(const std::string& text) : Value(std::string_view(text)) {}
  Value(const Dictionary& dictionary) noexcept;
  Value(const Array& array) noexcept;
  // NOLINTEND(google-explicit-constructor)
  Value(std::nullptr_t) = delete;

  [[nodiscard]] static Value integer(std::int64_t number) noexcept;
  /// Like `integer`, for the numbers above 2^63 - 1 as well.
  [[nodiscard]] static Value unsignedInteger(std::uint64_t number) noexcept;
  [[nodiscard]] static Value real(double number) noexcept;
  [[nodiscard]] static Value boolean(bool flag) noexcept;
  [[nodiscard]] static Value date(Moment moment) noexcept;
  [[nodiscard]] static Value data(Bytes bytes);

  Value(const Value& other) noexcept {
    copyBits(other);
    if (isShared()) retain();
  }
  Value(Value&& other) noexcept {
    copyBits(other);
    other.becomeNull();
  }
  Value& operator=(const Value& other) noexcept {
    if (isShared() || other.isShared()) {
      Value copy(other);
      swap(copy);
    } else {
      copyBits(other);
    }
    return *this;
  }
  Value& operator=(Value&& other) noexcept {
    if (isShared()) {  // what is released here may hold `other`
      Value moved(std::move(other));
      swap(moved);
    } else if (this != &other) {
      copyBits(other);
      other.becomeNull();
    }
    return *this;
  }
  ~Value() {
    if (isShared()) release();
  }
  void swap(Value& other) noexcept {
    const Bits mine = bits();
    copyBits(other);
    other.setBits(mine);
  }

  [[nodiscard]] ValueType type() const noexcept;
  /// "null", "string", "number", "boolean", "date", "data", "dictionary" or "array".
  [[nodiscard]] std::string_view typeName() const noexcept;
  [[nodiscard]] bool isNull() const noexcept { return _tag == kNull; }
  [[nodiscard]] bool isText() const noexcept {
    return _tag <= kInlineCapacity || _tag == kSharedText;
  }
  [[nodiscard]] bool isInteger() const noexcept { return _tag == kInteger || _tag == kUnsigned; }
  [[nodiscard]] bool isReal() const noexcept { return _tag == kReal; }
  [[nodiscard]] bool isData() const noexcept { return _tag == kData; }
  [[nodiscard]] bool isDictionary() const noexcept { return _tag == kDictionary; }
  [[nodiscard]] bool isArray() const noexcept { return _tag == kArray; }

  /// The text, or "" when this is none. The view dies with this value: a short text lives in it.
  [[nodiscard]] std::string_view text() const& noexcept;
  std::string_view text() const&& = delete;

  /// The integer's low 64 bits as a signed number; 0 when this is no integer.
  [[nodiscard]] std::int64_t integerBits() const noexcept;
  /// Whether this is an integer above 2^63 - 1, which `integerBits` shows negative.
  [[nodiscard]] bool isAboveInt64() const noexcept { return _tag == kUnsigned; }
  /// The real number; 0 when this is none (integers are not converted).
  [[nodiscard]] double realNumber() const noexcept;
  /// The boolean; false when this is none.
  [[nodiscard]] bool flag() const noexcept;
  /// The date; 1970-01-01 00:00:00 UTC when this is none.
  [[nodiscard]] Moment moment() const noexcept;
  /// The bytes of a data value, else empty. Valid as long as any copy of this value lives.
  [[nodiscard]] ByteView bytes() const noexcept;
  /// The container itself, shared; a null handle when this is none.
  [[nodiscard]] Dictionary dictionary() const noexcept;
  [[nodiscard]] Array array() const noexcept;

  /// Whether this value alone refers to its container; false for values that hold none.
  [[nodiscard]] bool isOnlyReference() const noexcept {
    if (_tag != kDictionary && _tag != kArray) return false;
    const auto* object = payload<detail::SharedObject*>();
    return object->strong == 1 && object->weak == 0;
  }

  /// For writing over: the values of a dictionary, in the order of its keys. Empty unless this
  /// value alone refers to the dictionary and the dictionary's list of keys is `keys` itself, not a
  /// copy of it. Valid until a key is added or removed.
  [[nodiscard]] std::span<Value> soleRow(const KeyList& keys) const noexcept;

  /// A copy that shares no container with this value. Containers may be nested to any depth that
  /// the call stack bears; parsed ones are at most 128 levels deep.
  [[nodiscard]] Value deepCopy() const;

  /// Whether type and contents are the same. Dictionaries are equal when they have the same entries
  /// in the same order; containers are compared by what they hold. A container equals itself
  /// without being walked.
  friend bool operator==(const Value& left, const Value& right) noexcept {
    if (left.sameBits(right)) return true;
    return left._tag == right._tag && left._tag > kNull && left.equalContents(right);
  }

 private:
  friend class WeakValue;
  enum Tag : std::uint8_t {
    // 0 to 15: an inline text of that length
    kNull = kInlineCapacity + 1,
    kInteger,
    kUnsigned,
    kReal,
    kBoolean,
    kDate,
    kFirstShared,
    kSharedText = kFirstShared,
    kData,
    kDictionary,
    kArray,
  };

  [[nodiscard]] bool isShared() const noexcept { return _tag >= kFirstShared; }
  [[nodiscard]] bool sameBits(const Value& other) const noexcept {
    return std::memcmp(this, &other, sizeof(Value)) == 0;
  }
  // Reads and writes the 16 bytes as a whole: a processor has to wait when it reads as a whole what
  // was just written in pieces.
  struct Bits {
    std::uint64_t words[2];
  };
  [[nodiscard]] Bits bits() const noexcept {
    Bits result;
    std::memcpy(&result, this, sizeof(result));
    return result;
  }
  void setBits(Bits bits) noexcept { std::memcpy(static_cast<void*>(this), &bits, sizeof(bits)); }
  void copyBits(const Value& other) noexcept { setBits(other.bits()); }
  void becomeNull() noexcept { setBits({{0, std::uint64_t{kNull} << 56}}); }  // little-endian
  template <class T>
  [[nodiscard]] T payload() const noexcept {
    T result;
    std::memcpy(&result, _bytes, sizeof(T));
    return result;
  }
  template <class T>
  [[nodiscard]] static Value tagged(Tag tag, T content) noexcept {
    static_assert(sizeof(T) <= sizeof(_bytes));
    Value result;
    std::memcpy(result._bytes, &content, sizeof(T));
    result._tag = tag;
    return result;
  }
  void retain() const noexcept { ++payload<detail::SharedObject*>()->strong; }
  void release() noexcept {
    if (--payload<detail::SharedObject*>()->strong == 0) destroyShared(*this);
  }
  static void destroyShared(const Value& last) noexcept;
  [[nodiscard]] bool equalContents(const Value& other) const noexcept;

  alignas(8) unsigned char _bytes[kInlineCapacity] = {};
  std::uint8_t _tag = kNull;
};
static_assert(sizeof(Value) == 16);

/// A reference to a container that does not keep it alive.
class WeakValue {
 public:
  WeakValue() noexcept = default;
  /// Refers to the container in `value`; to nothing when it holds none.
  explicit WeakValue(const Value& value) noexcept;
  WeakValue(const WeakValue& other) noexcept;
  WeakValue(WeakValue&& other) noexcept : _value(other._value) { other._value = {}; }
  WeakValue& operator=(WeakValue other) noexcept {
    std::swap(_value, other._value);
    return *this;
  }
  ~WeakValue();

  /// The container, or null when it is gone or there never was one.
  [[nodiscard]] Value lock() const noexcept;
  /// Whether `value` holds this very container.
  [[nodiscard]] bool refersTo(const Value& value) const noexcept;

 private:
  struct Reference {
    detail::SharedObject* object = nullptr;
    std::uint8_t tag = 0;
  };
  Reference _value;
};

/// A list of distinct dictionary keys in order, shared by the rows of one table. Immutable to its
/// users: a dictionary that gains or loses a key first takes a list of its own.
class KeyList {
 public:
  /// The keys must be distinct.
  explicit KeyList(std::span<const Value> keys);
  KeyList(std::initializer_list<Value> keys)
      : KeyList(std::span<const Value>(keys.begin(), keys.size())) {}
  KeyList(const KeyList& other) noexcept;
  KeyList(KeyList&& other) noexcept : _object(std::exchange(other._object, nullptr)) {}
  KeyList& operator=(KeyList other) noexcept {
    std::swap(_object, other._object);
    return *this;
  }
  ~KeyList();

  [[nodiscard]] std::size_t size() const noexcept;
  /// `index` must be below `size()`.
  [[nodiscard]] const Value& operator[](std::size_t index) const noexcept;

 private:
  friend class Dictionary;
  friend class Value;
  detail::KeyListObject* _object;
};

/// A shared, mutable dictionary. Entries keep the order in which their keys were added; that is the
/// enumeration order. A key is a value too, so that code can build a dictionary with a key that is
/// no text; parsers never do. A handle may be null (`isNull`): it reads as empty and ignores
/// writes.
class Dictionary {
 public:
  struct Entry {
    const Value& key;
    const Value& value;
  };
  class Iterator {
   public:
    Iterator(const Dictionary& dictionary, std::size_t index)
        : _dictionary(&dictionary), _index(index) {}
    Entry operator*() const { return {_dictionary->keyAt(_index), _dictionary->valueAt(_index)}; }
    Iterator& operator++() {
      ++_index;
      return *this;
    }
    bool operator==(const Iterator& other) const { return _index == other._index; }

   private:
    const Dictionary* _dictionary;
    std::size_t _index;
  };

  /// A new, empty dictionary.
  Dictionary();
  Dictionary(std::initializer_list<std::pair<Value, Value>> entries);
  /// A new dictionary with these keys, all values null; the keys are shared, not copied.
  explicit Dictionary(const KeyList& keys);
  /// A new dictionary with these keys and their values, in the keys' order. Values that are missing
  /// are null; those too many are dropped.
  Dictionary(const KeyList& keys, std::vector<Value> values);
  [[nodiscard]] static Dictionary null() noexcept { return Dictionary(nullptr); }

  Dictionary(const Dictionary& other) noexcept;
  Dictionary(Dictionary&& other) noexcept : _object(std::exchange(other._object, nullptr)) {}
  Dictionary& operator=(Dictionary other) noexcept {
    std::swap(_object, other._object);
    return *this;
  }
  ~Dictionary();

  [[nodiscard]] bool isNull() const noexcept { return _object == nullptr; }
  /// Whether both handles refer to the same container.
  [[nodiscard]] bool isSame(const Dictionary& other) const noexcept {
    return _object == other._object;
  }
  [[nodiscard]] std::size_t size() const noexcept;
  [[nodiscard]] bool empty() const noexcept { return size() == 0; }

  /// The value under a text key; a null value when there is none. Valid until the next change.
  [[nodiscard]] const Value& operator[](std::string_view key) const noexcept;
  /// The value under any key, or a null pointer. Valid until the next change.
  [[nodiscard]] const Value* find(const Value& key) const noexcept;
  [[nodiscard]] bool contains(const Value& key) const noexcept { return find(key) != nullptr; }

  /// Replaces the value under `key` where it stands, or appends the entry; returns its index.
  std::size_t set(const Value& key, Value value);
  /// Like `set`, looking at the entry with index `hint` first: a constant-time write for a
  /// caller that writes the same keys again and again and remembers where they stood. Any hint is
  /// allowed.
  std::size_t set(const Value& key, const Value& value, std::size_t hint);
  /// Removes the entry; false when there was none. Later entries move up.
  bool remove(const Value& key);
  void clear();

  /// Entry number `index` below `size()`, in enumeration order.
  [[nodiscard]] const Value& keyAt(std::size_t index) const noexcept;
  [[nodiscard]] const Value& valueAt(std::size_t index) const noexcept;
  /// `index` must be below `size()`.
  void setValueAt(std::size_t index, Value value) noexcept;
  /// For writing over: the values in the order of their keys. Valid until a key comes or goes.
  [[nodiscard]] std::span<Value> valuesToRewrite() noexcept;
  /// Exchanges all entries for those given. The keys must be distinct, and as many as the values.
  /// Where other dictionaries share the old list of keys, they keep it and `keys` becomes empty.
  void swapEntries(std::vector<Value>& keys, std::vector<Value>& values);

  [[nodiscard]] Iterator begin() const { return {*this, 0}; }
  [[nodiscard]] Iterator end() const { return {*this, size()}; }

  /// A new dictionary with the same entries; containers among the values stay shared.
  [[nodiscard]] Dictionary copy() const;

 private:
  friend class Value;
  explicit Dictionary(detail::DictionaryObject* object) noexcept : _object(object) {}
  detail::KeyListObject& ownKeys();
  [[nodiscard]] std::size_t indexOf(const Value& key) const noexcept;

  detail::DictionaryObject* _object;
};

/// A shared, mutable array. A handle may be null (`isNull`): it reads as empty and ignores writes.
class Array {
 public:
  /// A new, empty array.
  Array();
  Array(std::initializer_list<Value> elements);
  [[nodiscard]] static Array null() noexcept { return Array(nullptr); }

  Array(const Array& other) noexcept;
  Array(Array&& other) noexcept : _object(std::exchange(other._object, nullptr)) {}
  Array& operator=(Array other) noexcept {
    std::swap(_object, other._object);
    return *this;
  }
  ~Array();

  [[nodiscard]] bool isNull() const noexcept { return _object == nullptr; }
  [[nodiscard]] bool isSame(const Array& other) const noexcept { return _object == other._object; }
  [[nodiscard]] std::size_t size() const noexcept { return elements().size(); }
  [[nodiscard]] bool empty() const noexcept { return size() == 0; }

  /// The elements in order; the span is valid until the next change.
  [[nodiscard]] std::span<const Value> elements() const noexcept;
  /// `index` must be below `size()`.
  [[nodiscard]] const Value& operator[](std::size_t index) const noexcept {
    return elements()[index];
  }
  [[nodiscard]] auto begin() const noexcept { return elements().begin(); }
  [[nodiscard]] auto end() const noexcept { return elements().end(); }

  void append(Value element);
  void reserve(std::size_t count);
  void clear();
  /// Replaces all elements.
  void assign(std::vector<Value> elements);
  /// Removes all elements and returns them.
  [[nodiscard]] std::vector<Value> take() noexcept;
  /// Removes the first `count` elements (all of them when there are fewer).
  void removeFirst(std::size_t count);

  /// A new array with the same elements; containers among them stay shared.
  [[nodiscard]] Array copy() const;

 private:
  friend class Value;
  explicit Array(detail::ArrayObject* object) noexcept : _object(object) {}

  detail::ArrayObject* _object;
};

}  // namespace kestro
