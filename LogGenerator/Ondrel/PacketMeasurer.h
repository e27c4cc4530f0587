// SPDX-License-Identifier: MIT
// What measures the messages of a technology whose packets sections describe.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/Ondrel/SectionMeasurer.h"
#include "LogGenerator/TechnologyMeasurer.h"

namespace kestro {

/// Measures the packets of all sections that want them, in the order of the sections.
class PacketMeasurer : public TechnologyMeasurer {
 public:
  /// `templateName` names the resource that says where the display shows the sections; the sections
  /// are constants.
  PacketMeasurer(const MeasurerServices& services, SeriesTable& series, std::string_view technology,
                 std::string_view templateName, std::span<const MeasuredSection> sections);

  LogCode measure(ByteView message, MeasuredValues& values) override;

 private:
  const PropertyListCoding& _coding;
  std::vector<std::unique_ptr<SectionMeasurer>> _sections;
  std::unordered_map<LogCode, std::vector<SectionMeasurer*>> _subscribers;
  std::optional<Packet> _packet;  ///< the last, whose texts the values borrow
};

}  // namespace kestro
