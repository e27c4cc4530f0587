// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/Base.h"

#include <algorithm>
#include <array>

#include "LogGenerator/ArrayLock.h"

namespace kestro {
namespace {

struct EcnoRow {
  std::uint32_t above;
  std::int16_t decibels;
};

constexpr std::uint32_t kEcnoCeiling = 524288;

constexpr std::array kEcnoTable = {
    EcnoRow{417647, -1}, EcnoRow{331808, -2}, EcnoRow{263624, -3}, EcnoRow{209463, -4},
    EcnoRow{166441, -5}, EcnoRow{132268, -6}, EcnoRow{105123, -7}, EcnoRow{83562, -8},
    EcnoRow{66435, -9},  EcnoRow{52830, -10}, EcnoRow{42023, -11}, EcnoRow{33440, -12},
    EcnoRow{26621, -13}, EcnoRow{21205, -14}, EcnoRow{16903, -15}, EcnoRow{13486, -16},
    EcnoRow{10771, -17}, EcnoRow{8615, -18},  EcnoRow{6902, -19},  EcnoRow{5542, -20},
    EcnoRow{4461, -21},  EcnoRow{3603, -22},  EcnoRow{2921, -23},  EcnoRow{2240, -24},
    EcnoRow{1949, -25},  EcnoRow{1607, -26},  EcnoRow{1336, -27},  EcnoRow{1120, -28},
    EcnoRow{949, -29},   EcnoRow{813, -30},   EcnoRow{756, -31},   EcnoRow{705, -31},
};

}  // namespace

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
