// SPDX-License-Identifier: MIT
#include "LogGenerator/Measurer.h"

#include <algorithm>
#include <string>

#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/Ondrel/PacketMeasurer.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

using MakeMeasurer = std::unique_ptr<TechnologyMeasurer> (*)(const MeasurerServices& services,
                                                             SeriesTable& series);

struct MeasuredTechnology {
  std::string_view technology;
  MakeMeasurer make;
};

std::unique_ptr<TechnologyMeasurer> makeLTE(const MeasurerServices& services, SeriesTable& series) {
  return std::make_unique<PacketMeasurer>(services, series, kTqLogChannelTechnology_Ondrel_LTE,
                                          kLTETemplate, lteSections());
}

constexpr MeasuredTechnology kMeasuredTechnologies[] = {
    {kTqLogChannelTechnology_Ondrel_LTE, makeLTE},
};

}  // namespace

struct Measurer::Known {
  std::string technology;
  std::unique_ptr<TechnologyMeasurer> measurer;
};

Measurer::Measurer(const MeasurerServices& services) : _services(services) {}
Measurer::~Measurer() = default;

Measured Measurer::measure(std::string_view technology, ByteView message) {
  TechnologyMeasurer* measurer = measurerOf(technology);
  if (measurer == nullptr) return {};
  _values.clear();
  const LogCode code = measurer->measure(message, _values);
  return {.code = code, .values = _values};
}

TechnologyMeasurer* Measurer::measurerOf(std::string_view technology) {
  const auto known = std::ranges::find(_known, technology, &Known::technology);
  if (known != _known.end()) return known->measurer.get();
  const auto row =
      std::ranges::find(kMeasuredTechnologies, technology, &MeasuredTechnology::technology);
  if (row == std::end(kMeasuredTechnologies)) return nullptr;
  return _known.emplace_back(std::string(technology), row->make(_services, _series)).measurer.get();
}

}  // namespace kestro
