// SPDX-License-Identifier: MIT
#include "LogGenerator/IFX/GSMLogGenerator.h"

#include <fmt/format.h>

#include "LogGenerator/InternalConsistencyFailure.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

constexpr const char* kSource = "LogGenerator/GSM/GSMLogGenerator";
constexpr int kUnknownTypeLine = 78;
constexpr int kUnparsableLine = 90;

/// A part of the message, cleaned, and replaced by its only value if it has just one.
Value processPart(const Value& part) {
  Value cleaned = GSMLogGenerator::processObject(part);
  Value only = GSMLogGenerator::canCollapse(cleaned);
  return only.isNull() ? cleaned : only;
}

Dictionary processDictionary(const Dictionary& dictionary) {
  Dictionary result = dictionary.copy();
  for (std::size_t i = 0; i < result.size(); ++i) {
    result.setValueAt(i, processPart(result.valueAt(i)));
  }
  return result;
}

Array processArray(const Array& array) {
  Array result;
  if (array.empty()) return result;
  result.reserve(array.size() - 1);
  for (const Value& element : array.elements().subspan(1)) result.append(processPart(element));
  return result;
}

/// The bytes of all texts and keys in an object.
std::size_t textBytes(const Value& object) {
  std::size_t bytes = object.text().size();
  for (const Value& element : object.array()) bytes += textBytes(element);
  for (const auto& [key, value] : object.dictionary()) {
    bytes += key.text().size() + textBytes(value);
  }
  return bytes;
}

}  // namespace

std::unique_ptr<GSMLogGenerator> GSMLogGenerator::generator(const GeneratorServices& services) {
  return std::make_unique<GSMLogGenerator>(services);
}

GSMLogGenerator::GSMLogGenerator(const GeneratorServices& services) : LogGenerator(services) {
  init();
}

void GSMLogGenerator::updateStateWithData(Dictionary& state, ByteView data) {
  const Result<Value> parsed = services().propertyListCoding.parse(data);
  if (!parsed) {
    throw InternalConsistencyFailure("Could not deserialize the object", kSource, kUnparsableLine);
  }
  Value cleaned = processObject(*parsed);
  state.set(kStateDisplayState, *parsed);
  state.set(kStateDisplay, std::move(cleaned));
  state.set(kStateExtraInfo, Dictionary());
}

Value GSMLogGenerator::generateLogUsingState(Dictionary& state) {
  const std::size_t text = textBytes(state[kStateDisplayState]) + textBytes(state[kStateDisplay]);
  if (text > kMaximumEntryBytes) {
    services().systemLog.log(
        LogPriority::Error, "History: an entry beyond 16 MiB of text is not kept ({} bytes)", text);
    appendToHistory(state, Dictionary());
  } else {
    updateHistoryInState(state, services().clock);
  }
  return state[kStateDisplay];
}

Dictionary GSMLogGenerator::getStartCommand() const {
  return {{kTelephonySetState, kTelephonyStreaming}};
}

Array GSMLogGenerator::getSaveContentsFromState(const Dictionary& state) {
  return historyOfState(state);
}

Value GSMLogGenerator::processObject(const Value& object) {
  switch (object.type()) {
    case ValueType::Text:
      return object;
    case ValueType::Dictionary:
      return processDictionary(object.dictionary());
    case ValueType::Array:
      return processArray(object.array());
    default:
      throw InternalConsistencyFailure(
          fmt::format("Unknown object of type {} encountered", object.typeName()), kSource,
          kUnknownTypeLine);
  }
}

Value GSMLogGenerator::canCollapse(const Value& object) {
  const Dictionary dictionary = object.dictionary();
  return dictionary.size() == 1 ? dictionary.valueAt(0) : Value();
}

}  // namespace kestro
