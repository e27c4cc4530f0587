// SPDX-License-Identifier: MIT
// The sections that are measured are those that are displayed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "LogGenerator/GsmUmts/Ondrel_GSMClassIndex.h"
#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/ProgramTemplates.h"

namespace kestro::testing {
namespace {

/// Log codes to the sections that take them, in their order.
using SectionsByCode = std::map<LogCode, std::vector<std::string>>;

SectionsByCode displayedBy(std::string_view technology) {
  const auto coding = createPropertyListCoding();
  VirtualPlatform platform(*coding);
  addTemplates(platform);
  SectionsByCode sections;
  LogGenerator::generatorFromTechnology(generatorServices(platform), technology)
      ->catalogue(
          [&](const CatalogueEntry& entry) { sections[entry.code].emplace_back(entry.section); });
  return sections;
}

SectionsByCode measuredBy(std::span<const MeasuredSection> measured) {
  SectionsByCode sections;
  for (const MeasuredSection& row : measured) {
    for (const LogCode code : codesOf(*row.section)) {
      sections[code].emplace_back(row.section->name);
    }
  }
  return sections;
}

TEST(MeasuredSectionsTest, AreTheDecodersOfEachTechnologyInTheirOrder) {
  EXPECT_EQ(measuredBy(lteSections()), displayedBy(kTqLogChannelTechnology_Ondrel_LTE));
  EXPECT_EQ(measuredBy(gsmUmtsSections()), displayedBy(kTqLogChannelTechnology_Ondrel_GSM));
  EXPECT_EQ(measuredBy(utranSections()), displayedBy(kTqLogChannelTechnology_Ondrel_UTRAN2));
}

TEST(MeasuredSectionsTest, HaveListsWhoseRecordsSayWhichIsWhich) {
  for (const auto sections : {lteSections(), gsmUmtsSections(), utranSections()}) {
    for (const MeasuredSection& row : sections) {
      for (const PacketReading& reading : row.section->readings) {
        for (const ListReading& list : reading.lists) {
          if (list.use != RowsUse::Shown || list.isPlain) continue;
          EXPECT_FALSE(list.table.identity.empty()) << row.section->name;
        }
      }
    }
  }
}

}  // namespace
}  // namespace kestro::testing
