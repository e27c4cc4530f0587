// SPDX-License-Identifier: MIT
// The containers of property lists.
#include <algorithm>
#include <iterator>
#include <utility>

#include "Platform/PropertyList.h"
#include "Platform/PropertyListObjects.h"

namespace kestro {

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
