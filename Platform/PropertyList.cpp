// SPDX-License-Identifier: MIT
#include "Platform/PropertyList.h"

#include <cstring>

#include "Platform/PropertyListObjects.h"

namespace kestro {

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

}  // namespace kestro
