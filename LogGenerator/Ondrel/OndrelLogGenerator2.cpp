// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/OndrelLogGenerator2.h"

#include <array>
#include <charconv>

#include "LogGenerator/DisplayTemplate.h"
#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

LogCode codeOfKey(std::string_view key) {
  LogCode code = 0;
  std::from_chars(key.data(), key.data() + key.size(), code);
  return code;
}

bool isContainerOf(SectionKind kind, const Value& value) {
  return kind == SectionKind::List ? value.isArray() : value.isDictionary();
}

}  // namespace

void OndrelLogGenerator2::initWithPListNameCIndexObj(std::string pListName,
                                                     std::unique_ptr<ClassIndex> index) {
  services().systemLog.log(LogPriority::Error, "Creating OndrelLogGenerator2 object with {}",
                           addressText(index.get()));
  init();
  _cIndex = std::move(index);
  _pListName = std::move(pListName);
  // The index has one owner, this generator.
  services().systemLog.log(LogPriority::Error, "Class Index: {}", _cIndex ? 1 : 0);
}

OndrelLogGenerator2::~OndrelLogGenerator2() {
  services().systemLog.log(LogPriority::Warning, "Ondrel_GSMLogGenerator is destructed {}",
                           addressText(this));
}

// --- Packets -------------------------------------------------------------------------------------

void OndrelLogGenerator2::updateStateWithData(Dictionary& state, ByteView data) {
  getDisplayFromState(state);
  if (!_cIndex) return;
  updateWithData(data);
  collect(data);
}

void OndrelLogGenerator2::updateWithData(ByteView message) {
  if (message.size() < kPacketHeaderSize) return;
  const PacketView view(packetOfMessage(message));
  const std::uint8_t type = logTypeOf(view);
  if (!isKnownLogType(type)) {
    services().systemLog.log(LogPriority::Error, "Invalid log type: {:x}. Dropping.", type);
    return;
  }
  const LogCode code = logCodeOf(view);
  const Packet packet(view.bytes());
  for (Base* subscriber : subscribersOf(code)) subscriber->updateWithDataLogCode(packet, code);
}

std::span<Base* const> OndrelLogGenerator2::subscribersOf(LogCode code) const {
  const auto* subscribers = _cIndex ? _cIndex->getSubscribers(code) : nullptr;
  return subscribers == nullptr ? std::span<Base* const>() : std::span<Base* const>(*subscribers);
}

void OndrelLogGenerator2::explainMessage(ByteView message, const ExplainVisitor& visit) const {
  if (message.size() < kPacketHeaderSize) return;
  const PacketView view(packetOfMessage(message));
  if (!isKnownLogType(logTypeOf(view))) return;
  const LogCode code = logCodeOf(view);
  const Packet packet(view.bytes());
  for (const Base* subscriber : subscribersOf(code)) {
    subscriber->explainPacket(packet, code, visit);
  }
}

void OndrelLogGenerator2::catalogue(const CatalogueVisitor& visit) const {
  if (!_cIndex) return;
  for (const std::string& key : _cIndex->getAllLogCodes()) {
    const LogCode code = codeOfKey(key);
    for (const Base* subscriber : subscribersOf(code)) {
      CatalogueEntry entry = subscriber->catalogueCode(code);
      const auto group = sectionGroups().find(entry.section);
      if (group != sectionGroups().end()) entry.group = group->second;
      visit(entry);
    }
  }
}

void OndrelLogGenerator2::outline(const OutlineVisitor& visit) const {
  if (!_cIndex) return;
  for (const std::string& key : _cIndex->getAllLogCodes()) {
    const LogCode code = codeOfKey(key);
    for (const Base* subscriber : subscribersOf(code)) visit(subscriber->outlineCode(code));
  }
}

Dictionary OndrelLogGenerator2::getStartCommand() const {
  Array logCodes;
  Array extraCodes;
  for (const std::string& key : _cIndex ? _cIndex->getAllLogCodes() : std::vector<std::string>()) {
    const LogCode code = codeOfKey(key);
    if (code < kExtraCodes) {
      logCodes.append(Value::integer(code));
    } else {
      extraCodes.append(Value::integer(code - kExtraCodes));
    }
  }
  return {{kTelephonySetState, kTelephonyStreaming},
          {kTelephonySetOndrelLogCodes, logCodes},
          {kTelephonySetTqExtraCodes, extraCodes}};
}

// --- Display -------------------------------------------------------------------------------------

Value OndrelLogGenerator2::generateLogUsingState(Dictionary& state) {
  Value display = getDisplayFromState(state);
  handOverCollected(state);
  updateHistoryInState(state, services().clock);
  return display;
}

std::span<const std::string_view> OndrelLogGenerator2::stateKeys() const {
  static constexpr std::array kKeys = {kStateDisplay, kStateExtraInfo, kStateTemplate};
  return kKeys;
}

Value OndrelLogGenerator2::getDisplayFromState(Dictionary& state) {
  Value display = state[kStateDisplay];
  if (display.isNull()) {
    buildDisplay(state);
  } else {
    bindDisplay(display);
  }
  return display;
}

void OndrelLogGenerator2::buildDisplay(Dictionary& state) {
  const Value displayTemplate = templateOfState(services(), _pListName, state);
  if (displayTemplate.isNull()) {
    services().systemLog.write(LogPriority::Error, "Cannot load template for display");
    return;
  }
  services().systemLog.log(LogPriority::Warning, "Initialized class index: {}, Self: {}",
                           addressText(_cIndex.get()), addressText(this));
  if (_cIndex) _cIndex->status();
  const Value display = processTemplate(displayTemplate);
  printDict(display);
  state.set(kStateDisplay, display);
  state.set(kStateExtraInfo, Dictionary());
  _boundDisplay = WeakValue(display);
}

const OndrelLogGenerator2::SectionGroups& OndrelLogGenerator2::sectionGroups() const {
  if (_sectionGroups) return *_sectionGroups;
  _sectionGroups.emplace();
  for (const auto& [group, sections] : loadTemplate(services(), _pListName).dictionary()) {
    if (!group.isText()) continue;
    for (const auto& [section, value] : sections.dictionary()) {
      if (decoderOf(section) == nullptr) continue;
      (*_sectionGroups)[std::string(section.text())] = group.text();
    }
  }
  return *_sectionGroups;
}

Value OndrelLogGenerator2::processTemplate(const Value& templateObject) {
  if (templateObject.isText()) return templateObject;
  if (templateObject.isDictionary()) return processDictionary(templateObject.dictionary());
  if (templateObject.isArray()) {
    Array result;
    for (const Value& element : templateObject.array()) result.append(processTemplate(element));
    return result;
  }
  services().systemLog.write(LogPriority::Error, "Received an object of unknown type");
  services().systemLog.write(LogPriority::Warning, "Processing the template");
  return {};
}

Value OndrelLogGenerator2::processDictionary(const Dictionary& dictionary) {
  Dictionary result;
  for (const auto& [key, value] : dictionary) {
    if (!key.isText()) {
      services().systemLog.write(LogPriority::Error, "Dictionary Key is not a string?");
      continue;
    }
    Value processed = processTemplate(value);
    if (Base* decoder = decoderOf(key)) decoder->updateSectionRef(processed);
    result.set(key, std::move(processed));
  }
  return result;
}

void OndrelLogGenerator2::printDict(const Value& object) const {
  if (object.isDictionary()) {
    for (const auto& [key, value] : object.dictionary()) printDict(value);
  } else if (object.isArray()) {
    for (const Value& element : object.array()) printDict(element);
  } else if (!object.isText() && !object.isNull()) {
    services().systemLog.write(LogPriority::Error, "Received an object of unknown type");
  }
}

Base* OndrelLogGenerator2::decoderOf(const Value& key) const {
  return _cIndex && key.isText() ? _cIndex->getClass(key.text()) : nullptr;
}

void OndrelLogGenerator2::bindDisplay(const Value& display) {
  if (_boundDisplay.refersTo(display)) return;
  bindSections(display);
  _boundDisplay = WeakValue(display);
}

void OndrelLogGenerator2::bindSections(const Value& object) {
  if (object.isArray()) {
    for (const Value& element : object.array()) bindSections(element);
    return;
  }
  for (const auto& [key, value] : object.dictionary()) {
    Base* decoder = decoderOf(key);
    if (decoder == nullptr) {
      bindSections(value);
    } else if (isContainerOf(decoder->sectionKind(), value)) {
      decoder->updateSectionRef(value);
    }
  }
}

}  // namespace kestro
