// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "Model/NodePair.h"

namespace kestro {
namespace {

NodePointer leaf(std::string name, std::string value) {
  return std::make_shared<KestroModelLeafNode>(std::move(name), std::move(value));
}

NodePointer section(std::string name, std::vector<NodePointer> children) {
  return std::make_shared<KestroModelTreeNode>(std::move(name), std::move(children));
}

/// What a pair says of a node.
struct Fate {
  bool isNew;
  bool isChanged;
  bool operator==(const Fate&) const = default;
};

Fate fateOf(const NodePair& pair) { return {pair.isNew(), pair.isChanged()}; }

/// The fate of the root's child at `index` when `before` stood where `now` stands.
Fate fateOfChild(const NodePointer& before, const NodePointer& now, std::size_t index = 0) {
  return fateOf(NodePair(*now, before.get()).child(index));
}

constexpr Fate kSame{.isNew = false, .isChanged = false};
constexpr Fate kNew{.isNew = true, .isChanged = false};
constexpr Fate kChanged{.isNew = false, .isChanged = true};

TEST(NodePair, TheSameValueIsTheSame) {
  EXPECT_EQ(fateOfChild(section("", {leaf("a", "1")}), section("", {leaf("a", "1")})), kSame);
}

TEST(NodePair, AnotherValueIsChangedNotNew) {
  EXPECT_EQ(fateOfChild(section("", {leaf("a", "1")}), section("", {leaf("a", "2")})), kChanged);
}

TEST(NodePair, AnotherNameIsNewNotChanged) {
  EXPECT_EQ(fateOfChild(section("", {leaf("a", "1")}), section("", {leaf("b", "2")})), kNew);
}

TEST(NodePair, EitherIsNewOrChanged) {
  const NodePointer before = section("", {leaf("a", "1"), leaf("b", "1")});
  const NodePointer now = section("", {leaf("a", "1"), leaf("b", "2"), leaf("c", "3")});
  const NodePair pair(*now, before.get());
  EXPECT_FALSE(pair.child(0).isNewOrChanged());
  EXPECT_TRUE(pair.child(1).isNewOrChanged());
  EXPECT_TRUE(pair.child(2).isNewOrChanged());
}

TEST(NodePair, WithoutAPreviousTreeNothingIsNewOrChanged) {
  const NodePointer now = section("", {section("A", {leaf("k", "1")})});
  const NodePair pair(*now, nullptr);
  EXPECT_EQ(fateOf(pair.child(0).child(0)), kSame);
}

TEST(NodePair, ALeafWhereThereWasASectionIsNew) {
  EXPECT_EQ(fateOfChild(section("", {section("a", {})}), section("", {leaf("a", "1")})), kNew);
}

TEST(NodePair, ASectionIsNeitherNewNorChanged) {
  const NodePointer now = section("", {section("a", {})});
  EXPECT_EQ(fateOfChild(section("", {}), now), kSame);
  EXPECT_EQ(fateOfChild(section("", {leaf("a", "1")}), now), kSame);
}

TEST(NodePair, ValuesOfASectionThatIsNewAreNew) {
  const NodePointer before = section("", {});
  const NodePointer now = section("", {section("A", {leaf("k", "1")})});
  EXPECT_EQ(fateOf(NodePair(*now, before.get()).child(0).child(0)), kNew);
}

TEST(NodePair, ARowThatMovedIsFoundByItsName) {
  const NodePointer before = section("", {leaf("a", "1"), leaf("b", "2")});
  const NodePointer now = section("", {leaf("new", "0"), leaf("a", "1"), leaf("b", "3")});
  EXPECT_EQ(fateOfChild(before, now, 1), kSame);
  EXPECT_EQ(fateOfChild(before, now, 2), kChanged);
}

TEST(NodePair, OfSeveralWithOneNameTheOneInTheSamePlaceCounts) {
  const NodePointer before = section("", {leaf("a", "1"), leaf("a", "2")});
  const NodePointer now = section("", {leaf("a", "1"), leaf("a", "2"), leaf("a", "1")});
  EXPECT_EQ(fateOfChild(before, now, 1), kSame);
  EXPECT_EQ(fateOfChild(before, now, 2), kSame);  // beside the first one
}

TEST(NodePair, CountsTheChildrenOfTheNewTree) {
  const NodePointer before = section("", {leaf("a", "1"), leaf("b", "2")});
  const NodePointer now = section("", {leaf("a", "1")});
  EXPECT_EQ(NodePair(*now, before.get()).childCount(), 1U);
  EXPECT_EQ(NodePair(*now->childNodes()->front(), nullptr).childCount(), 0U);
  EXPECT_TRUE(NodePair(*now, before.get()).child(0).isLeaf());
  EXPECT_FALSE(NodePair(*now, before.get()).isLeaf());
}

TEST(ChildPlace, PrefersThePlaceThatIsAskedFor) {
  const NodePointer parent = section("", {leaf("a", "1"), leaf("b", "2"), leaf("a", "3")});
  EXPECT_EQ(childPlace(parent.get(), 2, "a"), 2U);
  EXPECT_EQ(childPlace(parent.get(), 1, "a"), 0U);
  EXPECT_EQ(childPlace(parent.get(), 9, "b"), 1U);
}

TEST(ChildPlace, IsAbsentWithoutSuchAChild) {
  EXPECT_EQ(childPlace(section("", {leaf("a", "1")}).get(), 0, "b"), std::nullopt);
  EXPECT_EQ(childPlace(leaf("a", "1").get(), 0, "a"), std::nullopt);
  EXPECT_EQ(childPlace(nullptr, 0, "a"), std::nullopt);
}

}  // namespace
}  // namespace kestro
