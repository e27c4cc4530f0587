// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/PacketMeasurer.h"

#include "LogGenerator/DisplayTemplate.h"
#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {
namespace {

/// The keys that lead to each container of a template; of several under one key the last counts, as
/// in the display.
class SectionPaths {
 public:
  explicit SectionPaths(const Value& displayTemplate) { add(displayTemplate.dictionary(), {}); }

  [[nodiscard]] std::vector<std::string> of(const Section& section) const {
    const auto path = _paths.find(section.name);
    if (path == _paths.end() || path->second.kind != section.kind) return {};
    return path->second.keys;
  }

 private:
  struct Path {
    std::vector<std::string> keys;
    SectionKind kind;
  };

  void add(const Dictionary& dictionary, const std::vector<std::string>& path) {
    for (const auto& [key, value] : dictionary) {
      if (!key.isText() || !(value.isDictionary() || value.isArray())) continue;
      std::vector<std::string> inner = path;
      inner.emplace_back(key.text());
      add(value.dictionary(), inner);
      const SectionKind kind = value.isArray() ? SectionKind::List : SectionKind::Dictionary;
      _paths.insert_or_assign(std::string(key.text()), Path{std::move(inner), kind});
    }
  }

  std::map<std::string, Path, std::less<>> _paths;
};

}  // namespace

PacketMeasurer::PacketMeasurer(const MeasurerServices& services, SeriesTable& series,
                               std::string_view technology, std::string_view templateName,
                               std::span<const MeasuredSection> sections)
    : _coding(services.propertyListCoding) {
  const SectionPaths paths(
      loadTemplate(services.bundle, services.propertyListCoding, templateName));
  for (const auto& [section, make] : sections) {
    const SectionPlace place{.technology = std::string(technology),
                             .section = std::string(section->name),
                             .container = paths.of(*section)};
    _sections.push_back(make(*section, place, series));
    for (const LogCode code : codesOf(*section)) {
      _subscribers[code].push_back(_sections.back().get());
    }
  }
}

LogCode PacketMeasurer::measure(ByteView message, MeasuredValues& values) {
  if (message.size() < kPacketHeaderSize) return 0;
  const ByteView bytes = packetOfMessage(message);
  if (!isKnownLogType(logTypeOf(PacketView(bytes)))) return 0;
  const LogCode code = logCodeOf(PacketView(bytes));
  const auto subscribers = _subscribers.find(code);
  if (subscribers == _subscribers.end()) return code;
  const Packet& packet = _packet.emplace(bytes);
  for (SectionMeasurer* section : subscribers->second) {
    section->measure(packet, code, _coding, values);
  }
  return code;
}

}  // namespace kestro
