// SPDX-License-Identifier: MIT
// What the technologies have in common: framing, SIM files, contexts, cells.
#include "Fuzz/PlainReader/PlainReader.h"

#include <array>
#include <cstdarg>
#include <cstdio>
#include <optional>
#include <string>

namespace kestro::plain {
namespace {

struct SimFile {
  std::string_view listed;
  std::string_view shown;
};
constexpr SimFile kSimFiles[] = {
    {"kSimFile_ICCID", "EF-ICCID"},
    {"kSimFile_MSISDN", "EF-MSISDN"},
    {"kSimFile_MBDN", "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN", "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI", "EF-LOCI"},
    {"kSimFile_PSLOCI", "EF-GPRS/PS-LOCI"},
    {"kSimFile_ACC", "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD", "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN", "EF-FPLMN"},
    {"kSimFile_AHPLMN", "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE", "EF-RAT MODE"},
    {"kSimFile_PNN", "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL", "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
};

std::string cellConstant(std::string_view name) {
  return std::string("kTqCellMonitor").append(name);
}

bool holdsText(const Dictionary& cell, std::string_view key, const std::string& text) {
  const Value value = cell[cellConstant(key)];
  return value.isText() && value.text() == text;
}

/// Only whole numbers count, of which the low 32 bits are taken.
std::optional<int> numberIn(const Dictionary& cell, std::string_view key) {
  const Value value = cell[cellConstant(key)];
  if (!value.isInteger()) return std::nullopt;
  return static_cast<std::int32_t>(value.integerBits() & 0xFFFFFFFF);
}

int product(int number, int factor) {
  return static_cast<std::int32_t>(std::int64_t{number} * factor);
}

}  // namespace

std::string text(const char* format, ...) {
  std::array<char, 512> buffer{};
  std::va_list arguments;
  va_start(arguments, format);
  const int size = std::vsnprintf(buffer.data(), buffer.size(), format, arguments);
  va_end(arguments);
  return size < 0 ? std::string() : std::string(buffer.data());
}

std::string_view nameOf(std::uint32_t value, std::span<const std::string_view> names,
                        std::string_view other) {
  return value < names.size() ? names[value] : other;
}

Packet PlainReader::packetOf(ByteView message) {
  return Packet(message[0] == 0x81 ? message.subspan(2) : message);
}

std::uint32_t PlainReader::codeOf(const Packet& packet) {
  const auto code = static_cast<std::uint32_t>(packet.half(3));
  return packet.byte(0) == 0xFF ? 0xFF0000 + code : code;
}

bool isCell(const Dictionary& cell, std::string_view technology, std::string_view type) {
  return holdsText(cell, "CellRadioAccessTechnology",
                   cellConstant("RadioAccessTechnology").append(technology)) &&
         holdsText(cell, "CellType", cellConstant("CellType").append(type));
}

void showNumber(Dictionary& target, std::string_view key, const Dictionary& cell,
                std::string_view cellKey, const char* format, int factor) {
  const auto number = numberIn(cell, cellKey);
  if (number) target.set(key, text(format, product(*number, factor)));
}

void showLevel(Dictionary& target, std::string_view key, const Dictionary& cell,
               std::string_view cellKey, const char* format, int factor) {
  const auto number = numberIn(cell, cellKey);
  if (number && (*number & 0xFFFF) == 0x7FFF) {
    target.set(key, "");
  } else {
    showNumber(target, key, cell, cellKey, format, factor);
  }
}

SectionReader::SectionReader(const PropertyListCoding& coding,
                             std::span<const std::string_view> dictionaries,
                             std::span<const std::string_view> lists)
    : _coding(coding) {
  for (const std::string_view name : dictionaries) _template.set(name, Dictionary());
  // Lists begin with something, so that it shows when they are emptied.
  for (const std::string_view name : lists) _template.set(name, Array{"before"});
  shown() = Value(_template).deepCopy().dictionary();
}

bool SectionReader::receive(ByteView message) {
  bool isSurvived = true;
  if (message.size() >= 13) {
    const Packet packet = packetOf(message);
    const std::uint32_t code = codeOf(packet);
    const bool isKnownType = packet.byte(0) == 1 || packet.byte(0) == 0xFF;
    if (isKnownType && code == 0xFF0000) {
      isSurvived = readSimFiles(packet);
    } else if (isKnownType && code == 0xFF0002) {
      readContexts(packet);
    } else if (isKnownType) {
      read(packet, code);
    }
  }
  if (isSurvived) collect(message);
  return isSurvived;
}

bool SectionReader::readSimFiles(const Packet& packet) {
  const auto root = _coding.parse(packet.payload());
  if (!root) return false;
  Dictionary shown = section("SIM Info");
  const Dictionary files = root->dictionary();
  for (const SimFile& file : kSimFiles) {
    if (files.contains(file.listed)) shown.set(file.shown, files[file.listed]);
  }
  return true;
}

void SectionReader::readContexts(const Packet& packet) {
  const auto root = _coding.parse(packet.payload());
  if (!root || !root->isArray()) return;
  const auto contexts = root->array().elements();
  show("PDP Context Info", {contexts.begin(), contexts.end()});
}

std::vector<Dictionary> SectionReader::cellsIn(const Packet& packet) const {
  std::vector<Dictionary> cells;
  const auto root = _coding.parse(packet.payload());
  if (!root) return cells;
  for (const Value& element : root->array()) {
    if (element.isDictionary()) cells.push_back(element.dictionary());
  }
  return cells;
}

std::unique_ptr<PlainReader> makePlainReader(std::string_view technology,
                                             const PropertyListCoding& coding) {
  if (technology == "LTE") return makeLTEReader(coding);
  if (technology == "Ondrel_GSM") return makeGsmUmtsReader(coding);
  if (technology == "UTRAN2") return makeUTRANReader(coding);
  if (technology == "Ondrel_CDMA") return makeC2KReader();
  return nullptr;
}

}  // namespace kestro::plain
