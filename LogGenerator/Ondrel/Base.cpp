// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/Base.h"

#include <algorithm>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/Ondrel/EcnoTable.h"

namespace kestro {
// --- CodeDictionary ------------------------------------------------------------------------------

std::string CodeDictionary::keyOf(LogCode code) { return std::to_string(code); }

void CodeDictionary::append(LogCode code, Base& subscriber) {
  const auto [entry, isNew] = _subscribers.try_emplace(code);
  if (isNew) _codes.push_back(code);
  entry->second.push_back(&subscriber);
}

const std::vector<Base*>* CodeDictionary::find(LogCode code) const noexcept {
  const auto entry = _subscribers.find(code);
  return entry == _subscribers.end() ? nullptr : &entry->second;
}

std::vector<std::string> CodeDictionary::keys() const {
  std::vector<std::string> keys;
  for (const LogCode code : _codes) keys.push_back(keyOf(code));
  return keys;
}

// --- Base ----------------------------------------------------------------------------------------

Base::Base(const GeneratorServices& services) : _services(services) {}

void Base::initWithDictCodeDict(ClassDictionary& sections, CodeDictionary& codes) {
  sections.insert_or_assign(std::string(getSectionName()), this);
  updateLogCodeDict(codes);
}

void Base::updateSectionRef(const Value& section) {
  _sectionRef = WeakValue(section);
  systemLog().write(LogPriority::Warning, getSectionName());
}

void Base::updateLogCodeDict(CodeDictionary& codes) {
  const std::span<const LogCode> wanted = getLogCodeArray();
  systemLog().log(LogPriority::Warning, "Array Count: {}", wanted.size());
  for (const LogCode code : wanted) codes.append(code, *this);
}

std::int16_t Base::lookUpECNO(std::uint32_t linear) noexcept {
  if (linear >= kEcnoCeiling) return 0;
  const auto row = std::ranges::partition_point(
      kEcnoTable, [linear](const EcnoRow& candidate) { return linear <= candidate.above; });
  return row == kEcnoTable.end() ? std::int16_t{0} : row->decibels;
}

std::vector<Value> Base::takeElementsOfArray(Array& array) {
  if (array.empty()) return {};  // who walks an empty array sees no change
  const ArrayLockScope lock;
  return array.take();
}

void Base::replaceArrayWith(Array& array, std::vector<Value> elements) {
  const ArrayLockScope lock;
  array.assign(std::move(elements));
}

void Base::reportUnknownCode(LogCode code) const {
  systemLog().log(LogPriority::Error, "Received an unknown log message: {}", code);
}

}  // namespace kestro
