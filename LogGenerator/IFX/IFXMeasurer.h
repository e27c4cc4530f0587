// SPDX-License-Identifier: MIT
// What measures the messages of the IFX channel: texts that are shaped for display.
#pragma once

#include <string>
#include <string_view>

#include "LogGenerator/TechnologyMeasurer.h"
#include "Platform/PropertyList.h"

namespace kestro {

/// Reads numbers and units out of the texts that the display shows; what is neither stays a text. A
/// series is named by the names on the way to its text.
class IFXMeasurer : public TechnologyMeasurer {
 public:
  IFXMeasurer(const MeasurerServices& services, SeriesTable& series)
      : _coding(services.propertyListCoding), _series(series) {}

  /// A message has no log code. One that the display refuses says nothing.
  LogCode measure(ByteView message, MeasuredValues& values) override;

 private:
  /// Where a walk of the display stands.
  struct Position {
    SectionPlace place;
    const Item* item = nullptr;
    std::uint32_t row = MeasuredValue::kNoRow;
  };

  void measureEntries(const Dictionary& entries, const Position& position, MeasuredValues& values);
  void measureEntry(const Value& key, std::string_view name, const Value& value,
                    const Position& position, MeasuredValues& values);
  void measureRows(const Array& rows, const Position& position, MeasuredValues& values);
  void measureText(DisplayPath path, std::string_view name, const Value& text,
                   const Position& position, MeasuredValues& values);

  const PropertyListCoding& _coding;
  SeriesTable& _series;
  Value _display;  ///< of the last message, whose texts the values borrow
};

}  // namespace kestro
