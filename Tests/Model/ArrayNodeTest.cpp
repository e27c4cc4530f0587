// SPDX-License-Identifier: MIT
// Array nodes and dictionary nodes are told apart, for writers of formats that know both.
#include <gtest/gtest.h>

#include "Model/KestroModelNode.h"

namespace kestro {
namespace {

NodePointer treeOf(const Value& display) {
  NodesByPath nodesByPath;
  return KestroModelNode::makeTreeFromObjectWithPathDictionary(display, nodesByPath);
}

TEST(ArrayNode, ArrayElementsMakeAnArrayNode) { EXPECT_TRUE(treeOf(Array{"a"})->isArray()); }

TEST(ArrayNode, AnEmptyArrayIsAnArrayNode) { EXPECT_TRUE(treeOf(Array())->isArray()); }

TEST(ArrayNode, DictionaryEntriesMakeNoArrayNode) {
  EXPECT_FALSE(treeOf(Dictionary{{"0", "a"}})->isArray());
}

TEST(ArrayNode, ALeafIsNoArrayNode) { EXPECT_FALSE(treeOf("a")->isArray()); }

}  // namespace
}  // namespace kestro
