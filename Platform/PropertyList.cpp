// SPDX-License-Identifier: MIT
#include "Platform/PropertyList.h"

#include <algorithm>
#include <memory>
#include <new>
#include <unordered_set>
#include <vector>

namespace kestro {
namespace detail {
namespace {

/// Lists of keys longer than this are searched through an index.
constexpr std::size_t kLinearSearchLimit = 24;

bool isKey(const Value& key, const Value& wanted) noexcept { return key == wanted; }
bool isKey(const Value& key, std::string_view wanted) noexcept {
  return key.isText() && key.text() == wanted;
}

}  // namespace

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

namespace {

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

void emptyDictionary(DictionaryObject& object) noexcept {
  const std::vector<Value> values = std::move(object.values);
  object.values.clear();
  object.dropKeys();
}

void emptyArray(ArrayObject& object) noexcept {
  const std::vector<Value> elements = std::move(object.elements);
  object.elements.clear();
}

void releaseDictionary(DictionaryObject* object) noexcept {
  if (object != nullptr && --object->strong == 0) endContainer(object, emptyDictionary);
}

void releaseArray(ArrayObject* object) noexcept {
  if (object != nullptr && --object->strong == 0) endContainer(object, emptyArray);
}

const Value kNullValue;

}  // namespace
}  // namespace detail

// --- Value ---------------------------------------------------------------------------------------

namespace {

/// Copies up to 15 bytes, in two pieces that may overlap: a call for so few would cost more.
void copyShort(unsigned char* to, const char* from, std::size_t count) noexcept {
  if (count >= 8) {
    std::memcpy(to, from, 8);
    std::memcpy(to + count - 8, from + count - 8, 8);
  } else if (count >= 4) {
    std::memcpy(to, from, 4);
    std::memcpy(to + count - 4, from + count - 4, 4);
  } else {
    for (std::size_t i = 0; i < count; ++i) to[i] = static_cast<unsigned char>(from[i]);
  }
}

}  // namespace

Value::Value(std::string_view text) {
  if (text.size() <= kInlineCapacity) {
    copyShort(_bytes, text.data(), text.size());
    _tag = static_cast<std::uint8_t>(text.size());
    return;
  }
  *this = tagged<detail::SharedObject*>(kSharedText, detail::TextObject::make(text));
}

Value::Value(const Dictionary& dictionary) noexcept {
  if (dictionary.isNull()) return;
  *this = tagged<detail::SharedObject*>(kDictionary, detail::retained(dictionary._object));
}

Value::Value(const Array& array) noexcept {
  if (array.isNull()) return;
  *this = tagged<detail::SharedObject*>(kArray, detail::retained(array._object));
}

Value Value::integer(std::int64_t number) noexcept { return tagged(kInteger, number); }

Value Value::unsignedInteger(std::uint64_t number) noexcept {
  return tagged(number > static_cast<std::uint64_t>(INT64_MAX) ? kUnsigned : kInteger, number);
}

Value Value::real(double number) noexcept { return tagged(kReal, number); }

Value Value::boolean(bool flag) noexcept { return tagged(kBoolean, flag); }

Value Value::date(Moment moment) noexcept {
  return tagged(kDate, static_cast<std::int64_t>(moment.time_since_epoch().count()));
}

Value Value::data(Bytes bytes) {
  auto* object = new detail::DataObject;
  object->bytes = std::move(bytes);
  return tagged<detail::SharedObject*>(kData, object);
}

ValueType Value::type() const noexcept {
  switch (_tag) {
    case kNull:
      return ValueType::Null;
    case kInteger:
    case kUnsigned:
      return ValueType::Integer;
    case kReal:
      return ValueType::Real;
    case kBoolean:
      return ValueType::Boolean;
    case kDate:
      return ValueType::Date;
    case kData:
      return ValueType::Data;
    case kDictionary:
      return ValueType::Dictionary;
    case kArray:
      return ValueType::Array;
    default:
      return ValueType::Text;
  }
}

std::string_view Value::typeName() const noexcept {
  switch (type()) {
    case ValueType::Null:
      return "null";
    case ValueType::Text:
      return "string";
    case ValueType::Integer:
    case ValueType::Real:
      return "number";
    case ValueType::Boolean:
      return "boolean";
    case ValueType::Date:
      return "date";
    case ValueType::Data:
      return "data";
    case ValueType::Dictionary:
      return "dictionary";
    case ValueType::Array:
      return "array";
  }
  return "null";
}

std::string_view Value::text() const& noexcept {
  if (_tag <= kInlineCapacity) return {reinterpret_cast<const char*>(_bytes), _tag};
  if (_tag == kSharedText) {
    return static_cast<detail::TextObject*>(payload<detail::SharedObject*>())->text();
  }
  return {};
}

std::int64_t Value::integerBits() const noexcept {
  return isInteger() ? payload<std::int64_t>() : 0;
}

double Value::realNumber() const noexcept { return _tag == kReal ? payload<double>() : 0; }

bool Value::flag() const noexcept { return _tag == kBoolean && payload<bool>(); }

Moment Value::moment() const noexcept {
  return Moment(std::chrono::microseconds(_tag == kDate ? payload<std::int64_t>() : 0));
}

ByteView Value::bytes() const noexcept {
  if (_tag != kData) return {};
  return static_cast<detail::DataObject*>(payload<detail::SharedObject*>())->bytes;
}

Dictionary Value::dictionary() const noexcept {
  if (_tag != kDictionary) return Dictionary::null();
  return Dictionary(
      detail::retained(static_cast<detail::DictionaryObject*>(payload<detail::SharedObject*>())));
}

Array Value::array() const noexcept {
  if (_tag != kArray) return Array::null();
  return Array(
      detail::retained(static_cast<detail::ArrayObject*>(payload<detail::SharedObject*>())));
}

std::span<Value> Value::soleRow(const KeyList& keys) const noexcept {
  if (!isOnlyReference() || _tag != kDictionary) return {};
  auto* object = static_cast<detail::DictionaryObject*>(payload<detail::SharedObject*>());
  return object->keys == keys._object ? std::span<Value>(object->values) : std::span<Value>();
}

Value Value::deepCopy() const {
  if (_tag == kDictionary) {
    Dictionary result = dictionary().copy();
    for (std::size_t i = 0; i < result.size(); ++i) {
      result.setValueAt(i, result.valueAt(i).deepCopy());
    }
    return result;
  }
  if (_tag == kArray) {
    Array result;
    result.reserve(array().size());
    for (const Value& element : array().elements()) result.append(element.deepCopy());
    return result;
  }
  return *this;
}

void Value::destroyShared(const Value& last) noexcept {
  auto* object = last.payload<detail::SharedObject*>();
  switch (last._tag) {
    case kSharedText:
      static_cast<detail::TextObject*>(object)->destroy();
      break;
    case kData:
      delete static_cast<detail::DataObject*>(object);
      break;
    case kDictionary:
      detail::endContainer(static_cast<detail::DictionaryObject*>(object), detail::emptyDictionary);
      break;
    default:
      detail::endContainer(static_cast<detail::ArrayObject*>(object), detail::emptyArray);
      break;
  }
}

bool Value::equalContents(const Value& other) const noexcept {
  switch (type()) {
    case ValueType::Text:
      return text() == other.text();
    case ValueType::Real:
      return realNumber() == other.realNumber();
    case ValueType::Data:
      return std::ranges::equal(bytes(), other.bytes());
    case ValueType::Array:
      return std::ranges::equal(array().elements(), other.array().elements());
    case ValueType::Dictionary: {
      const Dictionary left = dictionary();
      const Dictionary right = other.dictionary();
      if (left.size() != right.size()) return false;
      for (std::size_t i = 0; i < left.size(); ++i) {
        if (!(left.keyAt(i) == right.keyAt(i) && left.valueAt(i) == right.valueAt(i))) return false;
      }
      return true;
    }
    default:
      return false;  // the same bits were equal already
  }
}

// --- WeakValue -----------------------------------------------------------------------------------

WeakValue::WeakValue(const Value& value) noexcept {
  if (!value.isDictionary() && !value.isArray()) return;
  _value = {value.payload<detail::SharedObject*>(), value._tag};
  ++_value.object->weak;
}

WeakValue::WeakValue(const WeakValue& other) noexcept : _value(other._value) {
  if (_value.object != nullptr) ++_value.object->weak;
}

WeakValue::~WeakValue() {
  if (_value.object == nullptr || --_value.object->weak != 0 || _value.object->strong != 0) return;
  if (_value.tag == Value::kDictionary) {
    delete static_cast<detail::DictionaryObject*>(_value.object);
  } else {
    delete static_cast<detail::ArrayObject*>(_value.object);
  }
}

Value WeakValue::lock() const noexcept {
  if (_value.object == nullptr || _value.object->strong == 0) return {};
  ++_value.object->strong;
  return Value::tagged(static_cast<Value::Tag>(_value.tag), _value.object);
}

bool WeakValue::refersTo(const Value& value) const noexcept {
  return _value.object != nullptr && _value.object->strong != 0 && value._tag == _value.tag &&
         value.payload<detail::SharedObject*>() == _value.object;
}

// --- KeyList -------------------------------------------------------------------------------------

KeyList::KeyList(std::span<const Value> keys) : _object(new detail::KeyListObject) {
  for (const Value& key : keys) _object->append(key);
}

KeyList::KeyList(const KeyList& other) noexcept : _object(other._object) {
  if (_object != nullptr) _object->retain();
}

KeyList::~KeyList() {
  if (_object != nullptr) _object->release();
}

std::size_t KeyList::size() const noexcept { return _object->keys.size(); }

const Value& KeyList::operator[](std::size_t index) const noexcept { return _object->keys[index]; }

// --- Dictionary ----------------------------------------------------------------------------------

Dictionary::Dictionary() : _object(new detail::DictionaryObject) {}

Dictionary::Dictionary(std::initializer_list<std::pair<Value, Value>> entries) : Dictionary() {
  for (const auto& [key, value] : entries) set(key, value);
}

Dictionary::Dictionary(const KeyList& keys) : Dictionary(keys, {}) {}

Dictionary::Dictionary(const KeyList& keys, std::vector<Value> values) : Dictionary() {
  _object->values = std::move(values);
  _object->values.resize(keys.size());
  _object->keys = keys._object;
  _object->keys->retain();
}

Dictionary::Dictionary(const Dictionary& other) noexcept
    : _object(detail::retained(other._object)) {}

Dictionary::~Dictionary() { detail::releaseDictionary(_object); }

std::size_t Dictionary::size() const noexcept {
  return _object == nullptr ? 0 : _object->values.size();
}

std::size_t Dictionary::indexOf(const Value& key) const noexcept {
  if (_object == nullptr || _object->keys == nullptr) return size();
  return _object->keys->find(key);
}

const Value& Dictionary::operator[](std::string_view key) const noexcept {
  if (_object == nullptr || _object->keys == nullptr) return detail::kNullValue;
  const detail::KeyListObject& keys = *_object->keys;
  const bool isShort = key.size() <= Value::kInlineCapacity;  // and quickly made
  const std::size_t index = isShort ? keys.find(Value(key)) : keys.find(key);
  return index == size() ? detail::kNullValue : _object->values[index];
}

const Value* Dictionary::find(const Value& key) const noexcept {
  const std::size_t index = indexOf(key);
  return index == size() ? nullptr : &_object->values[index];
}

detail::KeyListObject& Dictionary::ownKeys() {
  if (_object->keys == nullptr) {
    _object->keys = new detail::KeyListObject;
  } else if (_object->keys->references > 1) {
    auto* own = new detail::KeyListObject;
    own->keys.reserve(_object->keys->keys.size() + 1);
    for (const Value& key : _object->keys->keys) own->append(key);
    _object->keys->release();
    _object->keys = own;
  }
  return *_object->keys;
}

std::size_t Dictionary::set(const Value& key, Value value) {
  if (_object == nullptr) return 0;
  const std::size_t index = indexOf(key);
  if (index != size()) {
    _object->values[index] = std::move(value);
    return index;
  }
  ownKeys().append(key);
  _object->values.push_back(std::move(value));
  return index;
}

std::size_t Dictionary::set(const Value& key, const Value& value, std::size_t hint) {
  if (hint >= size() || !(keyAt(hint) == key)) return set(key, value);
  _object->values[hint] = value;
  return hint;
}

bool Dictionary::remove(const Value& key) {
  const std::size_t index = indexOf(key);
  if (index == size()) return false;
  ownKeys().removeAt(index);
  const Value removed = std::move(_object->values[index]);
  _object->values.erase(_object->values.begin() + static_cast<std::ptrdiff_t>(index));
  return true;
}

void Dictionary::clear() {
  if (_object != nullptr) detail::emptyDictionary(*_object);
}

const Value& Dictionary::keyAt(std::size_t index) const noexcept {
  return _object->keys->keys[index];
}

const Value& Dictionary::valueAt(std::size_t index) const noexcept {
  return _object->values[index];
}

void Dictionary::setValueAt(std::size_t index, Value value) noexcept {
  _object->values[index] = std::move(value);
}

std::span<Value> Dictionary::valuesToRewrite() noexcept {
  if (_object == nullptr) return {};
  return _object->values;
}

void Dictionary::swapEntries(std::vector<Value>& keys, std::vector<Value>& values) {
  if (_object == nullptr) return;
  if (_object->keys != nullptr && _object->keys->references > 1) _object->dropKeys();
  if (_object->keys == nullptr) _object->keys = new detail::KeyListObject;
  _object->keys->swap(keys);
  _object->values.swap(values);
}

Dictionary Dictionary::copy() const {
  Dictionary result;
  if (_object == nullptr) return result;
  result._object->keys = _object->keys;
  if (result._object->keys != nullptr) result._object->keys->retain();
  result._object->values = _object->values;
  return result;
}

// --- Array ---------------------------------------------------------------------------------------

Array::Array() : _object(new detail::ArrayObject) {}

Array::Array(std::initializer_list<Value> elements) : Array() {
  _object->elements.assign(elements.begin(), elements.end());
}

Array::Array(const Array& other) noexcept : _object(detail::retained(other._object)) {}

Array::~Array() { detail::releaseArray(_object); }

std::span<const Value> Array::elements() const noexcept {
  if (_object == nullptr) return {};
  return _object->elements;
}

void Array::append(Value element) {
  if (_object != nullptr) _object->elements.push_back(std::move(element));
}

void Array::reserve(std::size_t count) {
  if (_object != nullptr) _object->elements.reserve(count);
}

void Array::clear() {
  if (_object != nullptr) detail::emptyArray(*_object);
}

void Array::assign(std::vector<Value> elements) {
  if (_object != nullptr) _object->elements.swap(elements);
}

std::vector<Value> Array::take() noexcept {
  return _object == nullptr ? std::vector<Value>() : std::exchange(_object->elements, {});
}

void Array::removeFirst(std::size_t count) {
  if (_object == nullptr) return;
  auto& elements = _object->elements;
  const auto end = elements.begin() + static_cast<std::ptrdiff_t>(std::min(count, elements.size()));
  const std::vector<Value> removed(std::make_move_iterator(elements.begin()),
                                   std::make_move_iterator(end));
  elements.erase(elements.begin(), end);
}

Array Array::copy() const {
  Array result;
  if (_object != nullptr) result._object->elements = _object->elements;
  return result;
}

}  // namespace kestro
