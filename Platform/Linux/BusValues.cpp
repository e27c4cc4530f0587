// SPDX-License-Identifier: MIT
#include "Platform/Linux/BusValues.h"

#include <QByteArray>
#include <QDBusArgument>
#include <QDBusObjectPath>
#include <QDBusSignature>
#include <QDBusVariant>
#include <QStringList>
#include <string>
#include <utility>

namespace kestro {
namespace {

class BusValueReader {
 public:
  explicit BusValueReader(std::size_t limit) : _left(limit) {}

  BusValue read(const QVariant& value) {
    if (!takeOne()) return {};
    const int type = value.metaType().id();
    if (type == qMetaTypeId<QDBusVariant>()) return read(value.value<QDBusVariant>().variant());
    if (type == qMetaTypeId<QDBusArgument>()) return read(value.value<QDBusArgument>());
    if (type == qMetaTypeId<QDBusObjectPath>()) {
      return {"o", value.value<QDBusObjectPath>().path().toStdString()};
    }
    if (type == qMetaTypeId<QDBusSignature>()) {
      return {"g", value.value<QDBusSignature>().signature().toStdString()};
    }
    return readBasic(value, type);
  }

  [[nodiscard]] bool isOverLimit() const noexcept { return _isOverLimit; }

 private:
  bool takeOne() {
    _isOverLimit = _isOverLimit || _left == 0;
    if (!_isOverLimit) --_left;
    return !_isOverLimit;
  }

  static BusValue signedNumber(const char* type, const QVariant& value) {
    return {type, std::int64_t{value.toLongLong()}};
  }
  static BusValue unsignedNumber(const char* type, const QVariant& value) {
    return {type, std::uint64_t{value.toULongLong()}};
  }

  BusValue readBasic(const QVariant& value, int type) {
    switch (type) {
      case QMetaType::Bool:
        return {"b", value.toBool()};
      case QMetaType::UChar:
        return unsignedNumber("y", value);
      case QMetaType::Short:
        return signedNumber("n", value);
      case QMetaType::UShort:
        return unsignedNumber("q", value);
      case QMetaType::Int:
        return signedNumber("i", value);
      case QMetaType::UInt:
        return unsignedNumber("u", value);
      case QMetaType::LongLong:
        return signedNumber("x", value);
      case QMetaType::ULongLong:
        return unsignedNumber("t", value);
      case QMetaType::Double:
        return {"d", value.toDouble()};
      case QMetaType::QString:
        return {"s", value.toString().toStdString()};
      case QMetaType::QByteArray:
        return readBytes(value.toByteArray());
      case QMetaType::QStringList:
        return readTexts(value.toStringList());
      default:
        return {};
    }
  }

  BusValue readBytes(const QByteArray& bytes) {
    BusValue::Elements elements;
    for (const char byte : bytes) {
      if (!takeOne()) break;
      elements.push_back({"y", std::uint64_t{static_cast<unsigned char>(byte)}});
    }
    return {"ay", std::move(elements)};
  }

  BusValue readTexts(const QStringList& texts) {
    BusValue::Elements elements;
    for (const QString& text : texts) {
      if (!takeOne()) break;
      elements.push_back({"s", text.toStdString()});
    }
    return {"as", std::move(elements)};
  }

  BusValue read(const QDBusArgument& argument) {
    const std::string signature = argument.currentSignature().toStdString();
    switch (argument.currentType()) {
      case QDBusArgument::ArrayType:
        argument.beginArray();
        return {signature, readElements(argument, [&] { argument.endArray(); })};
      case QDBusArgument::StructureType:
        argument.beginStructure();
        return {signature, readElements(argument, [&] { argument.endStructure(); })};
      case QDBusArgument::MapType:
        return {signature, readEntries(argument)};
      case QDBusArgument::BasicType:
      case QDBusArgument::VariantType:
        return read(argument.asVariant());
      default:
        return {};
    }
  }

  /// The value at which `argument` stands. Containers are read from it, not from a copy of it: that
  /// is what moves it on.
  BusValue readNext(const QDBusArgument& argument) {
    const auto type = argument.currentType();
    const bool isContainer = type == QDBusArgument::ArrayType ||
                             type == QDBusArgument::StructureType || type == QDBusArgument::MapType;
    if (!isContainer) return read(argument.asVariant());
    return takeOne() ? read(argument) : BusValue();
  }

  template <class End>
  BusValue::Elements readElements(const QDBusArgument& argument, End end) {
    BusValue::Elements elements;
    while (!argument.atEnd() && !_isOverLimit) elements.push_back(readNext(argument));
    end();
    return elements;
  }

  BusValue::Entries readEntries(const QDBusArgument& argument) {
    BusValue::Entries entries;
    argument.beginMap();
    while (!argument.atEnd() && !_isOverLimit) {
      argument.beginMapEntry();
      BusValue key = readNext(argument);
      BusValue value = readNext(argument);
      argument.endMapEntry();
      entries.emplace_back(std::move(key), std::move(value));
    }
    argument.endMap();
    return entries;
  }

  std::size_t _left;
  bool _isOverLimit = false;
};

}  // namespace

std::optional<std::vector<BusValue>> busValues(const QList<QVariant>& arguments,
                                               std::size_t limit) {
  BusValueReader reader(limit);
  std::vector<BusValue> values;
  for (const QVariant& argument : arguments) values.push_back(reader.read(argument));
  if (reader.isOverLimit()) return std::nullopt;
  return values;
}

QVariant qtValue(const BusValue& value) {
  if (const auto* flag = std::get_if<bool>(&value.content)) return *flag;
  if (const auto* real = std::get_if<double>(&value.content)) return *real;
  if (const auto* number = std::get_if<std::int64_t>(&value.content)) {
    return value.signature == "i" ? QVariant(static_cast<int>(*number)) : QVariant();
  }
  if (const auto* number = std::get_if<std::uint64_t>(&value.content)) {
    if (value.signature == "t") return static_cast<qulonglong>(*number);
    return value.signature == "u" ? QVariant(static_cast<uint>(*number)) : QVariant();
  }
  const auto* text = std::get_if<std::string>(&value.content);
  if (text == nullptr) return {};
  const QString qtText = QString::fromStdString(*text);
  if (value.signature == "o") return QVariant::fromValue(QDBusObjectPath(qtText));
  return value.signature == "s" ? QVariant(qtText) : QVariant();
}

}  // namespace kestro
