// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "Platform/Linux/XmlPropertyListEdits.h"

namespace kestro {
namespace {

constexpr std::string_view kList = "<dict><key>a</key><true/><key/><true/></dict>";

/// A list of many keys: the first stands behind its tag, the second is empty.
PropertyListFacts factsOfKeys() {
  PropertyListFacts facts;
  facts.needsEdits = facts.hasManyKeys = true;
  facts.edits = {{.at = 11, .length = 0, .kind = XmlEdit::Kind::Key},
                 {.at = 25, .length = 6, .kind = XmlEdit::Kind::Key}};
  return facts;
}

TEST(XmlPropertyListEdits, KeysGetABeginningEach) {
  const std::string edited = editedXml(kList, factsOfKeys());
  ASSERT_EQ(edited.size(), kList.size() + 2 * kKeyBeginning + 5);
  EXPECT_EQ(edited.substr(0, 11), "<dict><key>");
  EXPECT_EQ(edited.substr(19, 19), "a</key><true/><key>");
  EXPECT_EQ(edited.substr(46), "</key><true/></dict>");
  EXPECT_NE(edited.substr(11, 8), edited.substr(38, 8));
  EXPECT_EQ(edited.substr(11, 8).find_first_of("<&"), std::string::npos);
}

TEST(XmlPropertyListEdits, NobodyCanForeseeTheBeginnings) {
  EXPECT_NE(editedXml(kList, factsOfKeys()), editedXml(kList, factsOfKeys()));
}

TEST(XmlPropertyListEdits, TextsAreDividedAndZerosLeftOutWhereThereAreFewKeys) {
  PropertyListFacts facts = factsOfKeys();
  facts.hasManyKeys = false;
  facts.edits.push_back({.at = 33, .length = 2, .kind = XmlEdit::Kind::Zeros});
  facts.edits.push_back({.at = 37, .length = 0, .kind = XmlEdit::Kind::TextBreak});
  EXPECT_EQ(editedXml("<dict><key>a</key><true/><key/><x0012</dict>", facts),
            "<dict><key>a</key><true/><key/><x12<![CDATA[]]></dict>");
}

}  // namespace
}  // namespace kestro
