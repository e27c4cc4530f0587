// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Formats/SiblingNames.h"
#include "Tests/CommandLine/Formats/DisplayTrees.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using testing::treeOf;

std::vector<std::string> namesOf(const Dictionary& display) {
  const NodePointer tree = treeOf(display);
  const SiblingNames names(*tree);
  std::vector<std::string> result;
  for (std::size_t i = 0; i < tree->childNodes()->size(); ++i) result.push_back(names[i]);
  return result;
}

/// A dictionary whose entries are shown under these names.
Dictionary namedEntries(const std::vector<std::string>& names) {
  Dictionary result{{"_sorted", "yes"}};
  int position = 100;
  for (const std::string& name : names) {
    result.set(std::to_string(position++) + ";" + name, "x");
  }
  return result;
}

TEST(SiblingNames, DifferentNamesStay) {
  EXPECT_THAT(namesOf(Dictionary{{"b", "x"}, {"a", "x"}}), ElementsAre("b", "a"));
}

TEST(SiblingNames, LaterOnesOfOneNameAreNumbered) {
  EXPECT_THAT(namesOf(namedEntries({"A", "B", "A", "A"})), ElementsAre("A", "B", "A (2)", "A (3)"));
}

TEST(SiblingNames, ANumberedNameThatExistsIsPassedOver) {
  EXPECT_THAT(namesOf(namedEntries({"A", "A", "A (2)"})), ElementsAre("A", "A (3)", "A (2)"));
}

TEST(SiblingNames, ManyNamesAreToldApartToo) {
  std::vector<std::string> names;
  names.reserve(31);
  for (int i = 0; i < 30; ++i) names.push_back("N" + std::to_string(i));
  names.emplace_back("N7");
  const auto result = namesOf(namedEntries(names));
  EXPECT_EQ(result[7], "N7");
  EXPECT_EQ(result[30], "N7 (2)");
}

}  // namespace
}  // namespace kestro
