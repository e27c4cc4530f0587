// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CodesLua.h"

#include <algorithm>
#include <array>

#include "CommandLine/Formats/LayoutData.h"
#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/PacketNames.h"
#include "LogGenerator/C2K/SubPackets.h"
#include "LogGenerator/Ondrel/EcnoTable.h"
#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/TelephonyService.h"
#include "Recordings/PcapFormat.h"

namespace kestro {
namespace {

constexpr std::array kParts = {
    ResourceName{"Dissector/Functions", "lua"}, ResourceName{"Dissector/Places", "lua"},
    ResourceName{"Dissector/Texts", "lua"},     ResourceName{"Dissector/Fields", "lua"},
    ResourceName{"Dissector/Walk", "lua"},      ResourceName{"Dissector/PropertyLists", "lua"},
    ResourceName{"Dissector/Messages", "lua"},
};

/// What a technology is called in the names of fields, and for people.
struct DissectorName {
  std::string_view technology;
  std::string_view word;
  std::string_view title;
  bool dropsUnknownTypes = true;  ///< packets of a log type that is not known
};

constexpr std::array kNames = {
    DissectorName{kTqLogChannelTechnology_IFX, "ifx", "IFX"},
    DissectorName{kTqLogChannelTechnology_Ondrel_GSM, "gsmumts", "GSM/UMTS"},
    DissectorName{kTqLogChannelTechnology_Ondrel_CDMA, "c2k", "CDMA2000", false},
    DissectorName{kTqLogChannelTechnology_Ondrel_LTE, "lte", "LTE"},
    DissectorName{kTqLogChannelTechnology_Ondrel_UTRAN2, "utran", "UTRAN"},
};

/// Writes Lua's tables of what the walkers need besides the packets.
class LuaTables {
 public:
  explicit LuaTables(std::string& output) : _writer(output) {}

  /// Where a packet begins, and what its header holds.
  void header() {
    _writer.beginObject();
    number("size", kPacketHeaderSize);
    number("prefixMark", kPrefixMark);
    number("prefixSize", kPrefixSize);
    place("type", u8(kLogTypeOffset));
    place("length", u16(kRecordLengthOffset));
    place("code", u16(kLogCodeOffset));
    number("timeOffset", kRecordTimeOffset);
    number("basebandType", kBasebandLogType);
    number("extraType", kExtraLogType);
    number("extraCodes", kExtraCodes);
    _writer.endObject();
  }

  void subPackets() {
    _writer.beginObject();
    place("count", kSubPacketCount);
    number("first", kFirstSubPacket);
    place("identifier", kSubPacketId);
    place("size", kSubPacketSize);
    number("overrun", kSubPacketOverrun);
    _writer.endObject();
  }

  void ecnoTable() {
    _writer.beginObject();
    number("ceiling", kEcnoCeiling);
    _writer.key("rows");
    _writer.beginArray();
    for (const EcnoRow& row : kEcnoTable) {
      _writer.beginObject();
      number("above", row.above);
      _writer.key("decibels");
      _writer.integer(row.decibels);
      _writer.endObject();
    }
    _writer.endArray();
    _writer.endObject();
  }

  void remarks() {
    _writer.beginObject();
    text("tooShortForAPacket", remarkTooShortForAPacket());
    text("unknownType", kRemarkUnknownType);
    text("unknownCode", kRemarkUnknownCode);
    text("unknownContents", kRemarkUnknownContents);
    text("tooShort", kRemarkTooShort);
    text("noValue", kRemarkNoValue);
    _writer.endObject();
  }

  void technologies(std::span<const TechnologyCodes> all) {
    _writer.beginArray();
    for (const TechnologyCodes& one : all) technology(one);
    _writer.endArray();
  }

 private:
  void text(std::string_view key, std::string_view value) {
    _writer.key(key);
    _writer.text(value);
  }
  void number(std::string_view key, std::uint64_t value) {
    _writer.key(key);
    _writer.number(value);
  }
  void place(std::string_view key, const Place& value) {
    _writer.key(key);
    writePlace(_writer, value);
  }

  void technology(const TechnologyCodes& technology) {
    const auto name = std::ranges::find(kNames, technology.technology, &DissectorName::technology);
    const auto linkType = linkTypeOfTechnology(technology.technology);
    if (name == kNames.end() || !linkType) return;
    _writer.beginObject();
    text("word", name->word);
    text("title", name->title);
    number("linkType", static_cast<std::uint64_t>(*linkType));
    _writer.key("dropsUnknownTypes");
    _writer.boolean(name->dropsUnknownTypes);
    if (!technology.families.empty()) codes(technology);
    _writer.endObject();
  }

  void codes(const TechnologyCodes& technology) {
    _writer.key("codes");
    _writer.beginArray();
    for (const CodeFamily& family : technology.families) {
      for (const ListedCode& known : family.codes) code(known);
    }
    _writer.endArray();
  }

  void code(const ListedCode& code) {
    _writer.beginObject();
    number("code", code.code);
    text("name", code.name);
    number("minimumLength", code.minimumLength);
    _writer.key("takers");
    writeTakers(_writer, code.takers);
    _writer.endObject();
  }

  LuaWriter _writer;
};

}  // namespace

std::span<const ResourceName> dissectorParts() { return kParts; }

std::string codesLua(std::span<const TechnologyCodes> technologies) {
  std::string text = "\nkestro.header = ";
  LuaTables tables(text);
  tables.header();
  text += "\nkestro.subPackets = ";
  tables.subPackets();
  text += "\nkestro.ecnoTable = ";
  tables.ecnoTable();
  text += "\nkestro.remarks = ";
  tables.remarks();
  text += "\nkestro.register(";
  tables.technologies(technologies);
  return text + ")\n";
}

}  // namespace kestro
