// SPDX-License-Identifier: MIT
#include "LogGenerator/Measurer.h"

#include <algorithm>
#include <string>

#include "LogGenerator/C2K/C2KMeasurer.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "LogGenerator/GsmUmts/Ondrel_GSMLogGenerator.h"
#include "LogGenerator/IFX/IFXMeasurer.h"
#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/Ondrel/PacketMeasurer.h"
#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

using MakeMeasurer = std::unique_ptr<TechnologyMeasurer> (*)(const MeasurerServices& services,
                                                             SeriesTable& series);

struct MeasuredTechnology {
  std::string_view technology;
  MakeMeasurer make;
};

template <class MeasurerOfTechnology>
std::unique_ptr<TechnologyMeasurer> make(const MeasurerServices& services, SeriesTable& series) {
  return std::make_unique<MeasurerOfTechnology>(services, series);
}

std::unique_ptr<TechnologyMeasurer> makeGsmUmts(const MeasurerServices& services,
                                                SeriesTable& series) {
  return std::make_unique<PacketMeasurer>(services, series, kTqLogChannelTechnology_Ondrel_GSM,
                                          kGsmUmtsTemplate, gsmUmtsSections());
}

std::unique_ptr<TechnologyMeasurer> makeLTE(const MeasurerServices& services, SeriesTable& series) {
  return std::make_unique<PacketMeasurer>(services, series, kTqLogChannelTechnology_Ondrel_LTE,
                                          kLTETemplate, lteSections());
}

std::unique_ptr<TechnologyMeasurer> makeUTRAN(const MeasurerServices& services,
                                              SeriesTable& series) {
  return std::make_unique<PacketMeasurer>(services, series, kTqLogChannelTechnology_Ondrel_UTRAN2,
                                          utranTemplateName(services.bundle).value_or(""),
                                          utranSections());
}

constexpr MeasuredTechnology kMeasuredTechnologies[] = {
    {kTqLogChannelTechnology_IFX, make<IFXMeasurer>},
    {kTqLogChannelTechnology_Ondrel_GSM, makeGsmUmts},
    {kTqLogChannelTechnology_Ondrel_CDMA, make<C2KMeasurer>},
    {kTqLogChannelTechnology_Ondrel_LTE, makeLTE},
    {kTqLogChannelTechnology_Ondrel_UTRAN2, makeUTRAN},
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
  _values.cut(0);
  const LogCode code = measurer->measure(message, _values);
  return {.code = code, .values = _values.all()};
}

TechnologyMeasurer* Measurer::measurerOf(std::string_view technology) {
  const auto known = std::ranges::find(_known, technology, &Known::technology);
  if (known != _known.end()) return known->measurer.get();
  const auto row =
      std::ranges::find(kMeasuredTechnologies, technology, &MeasuredTechnology::technology);
  if (row == std::end(kMeasuredTechnologies)) return nullptr;
  _known.push_back({std::string(technology), row->make(_services, _series)});
  return _known.back().measurer.get();
}

}  // namespace kestro
