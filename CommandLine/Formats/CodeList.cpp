// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/CodeList.h"

#include <algorithm>
#include <utility>

#include "LogGenerator/DisplayKeys.h"

namespace kestro {
namespace {

void add(const CatalogueEntry& entry, std::vector<ListedCode>& codes) {
  auto code = std::ranges::find(codes, entry.code, &ListedCode::code);
  if (code == codes.end()) {
    code = codes.insert(code, {entry.code, entry.packetName, entry.minimumLength, {}, {}});
  }
  if (!entry.packetName.empty()) {
    const bool isFirst = code->name.empty();
    if (isFirst) code->name = entry.packetName;
    code->minimumLength =
        isFirst ? entry.minimumLength : std::min(code->minimumLength, entry.minimumLength);
  }
  code->entries.push_back(entry);
}

bool isExtra(const ListedCode& code) { return code.code >= kExtraCodes; }

std::string_view groupOf(const ListedCode& code) {
  if (isExtra(code)) return {};
  const auto shown = std::ranges::find_if(
      code.entries, [](const CatalogueEntry& entry) { return !entry.keys.empty(); });
  return (shown == code.entries.end() ? code.entries.front() : *shown).group;
}

}  // namespace

std::vector<ListedCode> listCodes(const LogGenerator& generator) {
  std::vector<ListedCode> codes;
  generator.catalogue([&](const CatalogueEntry& entry) { add(entry, codes); });
  generator.outline([&](const Outline& taker) {
    const auto code = std::ranges::find(codes, taker.code, &ListedCode::code);
    if (code != codes.end() && !taker.readings.empty()) code->takers.push_back(taker);
  });
  std::ranges::sort(codes, {}, &ListedCode::code);
  return codes;
}

TechnologyCodes codesOfTechnology(const GeneratorServices& services, std::string_view technology) {
  TechnologyCodes result{.generator = LogGenerator::generatorFromTechnology(services, technology),
                         .technology = technology,
                         .families = {}};
  for (ListedCode& code : listCodes(*result.generator)) {
    const std::string_view group = groupOf(code);
    auto family = std::ranges::find(result.families, group, &CodeFamily::group);
    if (family == result.families.end()) {
      const std::string_view name =
          isExtra(code) ? kExtraPacketsFamily : nameInSortedDictionary(group);
      family = result.families.insert(family, {group, name, {}});
    }
    family->codes.push_back(std::move(code));
  }
  std::ranges::sort(result.families, {}, [](const CodeFamily& family) {
    return std::pair(isExtra(family.codes.front()), family.group);
  });
  return result;
}

}  // namespace kestro
