// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/SharedDecoders.h"

#include <string>

#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

constexpr ListedValue kSimFileValues[] = {
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
constexpr PropertyListReading kSimFiles = {
    .packet = kSimFilesPacket,
    .part = ListedPart::Root,
    .values = kSimFileValues,
};

constexpr PropertyListReading kPacketDataContexts = {
    .packet = kPacketDataContextsPacket,
    .part = ListedPart::Elements,
};

}  // namespace

constexpr Section kSimInfoSection = {
    .name = "SIM Info",
    .logLine = "SimInfo",
    .kind = SectionKind::Dictionary,
    .reportsUnknownCodes = false,
    .propertyList = &kSimFiles,
};

constexpr Section kPDPContextListSection = {
    .name = "PDP Context Info",
    .logLine = "PDPContextList",
    .kind = SectionKind::List,
    .propertyList = &kPacketDataContexts,
};

LogCode_0xFF0000::PropertyListReader::PropertyListReader(const Packet& packet,
                                                         const PropertyListCoding& coding,
                                                         SystemLog& log)
    : _files(Dictionary::null()) {
  const Result<Value>& root = packet.propertyList(coding);
  if (!root) {
    log.write(LogPriority::Error, "SIM File dictionary data could not be constructed");
    throw UnknownDataException();
  }
  _files = root->dictionary();
}

bool SimInfo::updateWithOtherPacket(const Packet& packet, LogCode code) {
  if (code != kSimFiles.packet.code) return false;
  const LogCode_0xFF0000::PropertyListReader files(packet, services().propertyListCoding,
                                                   systemLog());
  Dictionary target = sectionDictionary();
  for (const ListedValue& file : kSimFileValues) {
    if (const Value* value = files.find(file.listKey)) target.set(file.key, *value);
  }
  return true;
}

void SimInfo::explainOtherPacket(const Packet& packet, LogCode code,
                                 const ExplainVisitor& visit) const {
  const Result<Value>& root = packet.propertyList(services().propertyListCoding);
  if (code != kSimFiles.packet.code || !root) return;
  const Dictionary files = root->dictionary();
  for (const ListedValue& file : kSimFileValues) {
    const Value* value = files.find(file.listKey);
    if (value == nullptr) continue;
    visit({.section = section().name,
           .key = file.key,
           .sources = {{.listKey = std::string(file.listKey), .isNumber = false}},
           .text = *value});
  }
}

bool PDPContextList::updateWithOtherPacket(const Packet& packet, LogCode /*code*/) {
  const Result<Value>& root = packet.propertyList(services().propertyListCoding);
  if (!root || !root->isArray()) return true;
  const auto contexts = root->array();
  Array target = sectionList();
  replaceArrayWith(target, {contexts.begin(), contexts.end()});
  return true;
}

void PDPContextList::explainOtherPacket(const Packet& packet, LogCode /*code*/,
                                        const ExplainVisitor& visit) const {
  const Result<Value>& root = packet.propertyList(services().propertyListCoding);
  if (!root) return;
  std::size_t row = 0;
  for (const Value& context : root->array()) {
    for (const auto& [key, value] : context.dictionary()) {
      visit({.section = section().name,
             .row = row,
             .key = key.text(),
             .sources = {{.listKey = std::string(key.text()), .isNumber = false}},
             .text = value});
    }
    ++row;
  }
}

}  // namespace kestro
