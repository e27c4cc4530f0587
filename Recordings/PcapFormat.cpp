// SPDX-License-Identifier: MIT
// The table of link types.
#include "Recordings/PcapFormat.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>

#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

struct LinkType {
  int number;
  std::string_view technology;
};

// User link types: their meaning is private to whoever writes the file.
constexpr std::array kLinkTypes = {
    LinkType{147, kTqLogChannelTechnology_IFX},
    LinkType{148, kTqLogChannelTechnology_Ondrel_GSM},
    LinkType{149, kTqLogChannelTechnology_Ondrel_CDMA},
    LinkType{150, kTqLogChannelTechnology_Ondrel_LTE},
    LinkType{151, kTqLogChannelTechnology_Ondrel_UTRAN2},
};

}  // namespace

std::optional<int> linkTypeOfTechnology(std::string_view technology) noexcept {
  const auto* found = std::ranges::find(kLinkTypes, technology, &LinkType::technology);
  if (found == kLinkTypes.end()) return std::nullopt;
  return found->number;
}

std::optional<std::string_view> technologyOfLinkType(int linkType) noexcept {
  const auto* found = std::ranges::find(kLinkTypes, linkType, &LinkType::number);
  if (found == kLinkTypes.end()) return std::nullopt;
  return found->technology;
}

std::string linkTypeRefusal(int linkType) {
  return fmt::format("link type {} stands for no technology ({} to {} do)", linkType,
                     kLinkTypes.front().number, kLinkTypes.back().number);
}

}  // namespace kestro
