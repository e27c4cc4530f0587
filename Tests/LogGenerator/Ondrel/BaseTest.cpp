// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/Ondrel/Base.h"
#include "LogGenerator/Ondrel/ClassIndex.h"
#include "LogGenerator/Ondrel/SectionDecoder.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Tests/Support/DecoderFixture.h"

namespace kestro::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

// --- Ec/N0 ---------------------------------------------------------------------------------------

TEST(LookUpECNOTest, IsZeroAtBothEnds) {
  EXPECT_EQ(Base::lookUpECNO(4294967295U), 0);
  EXPECT_EQ(Base::lookUpECNO(524288), 0);
  EXPECT_EQ(Base::lookUpECNO(705), 0);
  EXPECT_EQ(Base::lookUpECNO(0), 0);
}

TEST(LookUpECNOTest, StepsJustAboveEachThreshold) {
  const std::vector<std::pair<std::uint32_t, int>> thresholds = {
      {417647, -1}, {331808, -2}, {263624, -3}, {209463, -4}, {166441, -5}, {132268, -6},
      {105123, -7}, {83562, -8},  {66435, -9},  {52830, -10}, {42023, -11}, {33440, -12},
      {26621, -13}, {21205, -14}, {16903, -15}, {13486, -16}, {10771, -17}, {8615, -18},
      {6902, -19},  {5542, -20},  {4461, -21},  {3603, -22},  {2921, -23},  {2240, -24},
      {1949, -25},  {1607, -26},  {1336, -27},  {1120, -28},  {949, -29},   {813, -30},
      {756, -31},   {705, -31}};
  EXPECT_EQ(Base::lookUpECNO(524287), -1);
  for (std::size_t i = 0; i < thresholds.size(); ++i) {
    EXPECT_EQ(Base::lookUpECNO(thresholds[i].first + 1), thresholds[i].second);
    const int next = i + 1 < thresholds.size() ? thresholds[i + 1].second : 0;
    EXPECT_EQ(Base::lookUpECNO(thresholds[i].first), next);
  }
}

// --- Decoders and their registry -----------------------------------------------------------------

constexpr PacketKind kFirstPacket = {0x4179, "first", 13};
constexpr PacketKind kShorterPacket = {0x4179, "first, shorter", 0};
constexpr PacketKind kOtherPacket = {0x0005, "other", 13};
constexpr PacketKind kListPacket = {0xFF0000, "list", 13};

// Two readings of one code make one subscription.
constexpr PacketReading kFirstReadings[] = {
    {.packet = kFirstPacket}, {.packet = kShorterPacket}, {.packet = kOtherPacket}};
constexpr PropertyListReading kFirstList = {.packet = kListPacket, .part = ListedPart::Root};
constexpr Section kFirstSection = {
    .name = "Cells", .readings = kFirstReadings, .propertyList = &kFirstList};
constexpr PacketReading kSecondReadings[] = {{.packet = kFirstPacket}};
constexpr Section kSecondSection = {
    .name = "Cells", .kind = SectionKind::List, .readings = kSecondReadings};

using First = TableDecoder<kFirstSection>;
using Second = TableDecoder<kSecondSection>;

class TestIndex : public ClassIndex {
 public:
  explicit TestIndex(const GeneratorServices& services) : ClassIndex(services) {}

  std::unique_ptr<First> first = make<First>();
  std::unique_ptr<Second> second = make<Second>();
};

class ClassIndexTest : public ::testing::Test {
 protected:
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<TestIndex> index = std::make_unique<TestIndex>(generatorServices(platform));
};

TEST_F(ClassIndexTest, ListsSubscribersInConstructionOrder) {
  ASSERT_NE(index->getSubscribers(0x4179), nullptr);
  EXPECT_THAT(*index->getSubscribers(0x4179), ElementsAre(index->first.get(), index->second.get()));
}

TEST_F(ClassIndexTest, ListsADecoderUnderEachOfItsCodes) {
  ASSERT_NE(index->getSubscribers(0x0005), nullptr);
  EXPECT_THAT(*index->getSubscribers(0x0005), ElementsAre(index->first.get()));
  ASSERT_NE(index->getSubscribers(0xFF0000), nullptr);
  EXPECT_THAT(*index->getSubscribers(0xFF0000), ElementsAre(index->first.get()));
}

TEST_F(ClassIndexTest, HasNoListForACodeThatNobodyWants) {
  EXPECT_EQ(index->getSubscribers(0x4180), nullptr);
  EXPECT_EQ(index->getSubscribers(0), nullptr);
}

TEST_F(ClassIndexTest, NamesCodesInDecimal) {
  EXPECT_THAT(index->getAllLogCodes(), ElementsAre("16761", "5", "16711680"));
}

TEST_F(ClassIndexTest, TheLaterDecoderOfASectionReplacesTheEarlier) {
  EXPECT_EQ(index->getClass("Cells"), index->second.get());
  EXPECT_EQ(index->getClass("cells"), nullptr);
}

TEST_F(ClassIndexTest, LogsTheNumberOfEachDecodersCodes) {
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(warningLine("Array Count: 3"), warningLine("Array Count: 1")));
}

TEST_F(ClassIndexTest, StatusLeavesTwoLines) {
  static_cast<void>(platform.systemLog().take());
  index->status();
  EXPECT_THAT(platform.systemLog().lines(),
              ElementsAre(warningLine("Dictionary = 1"), warningLine("String = 0")));
}

TEST_F(ClassIndexTest, LeavesALineOnDestruction) {
  index.reset();
  EXPECT_THAT(platform.standardOutput().lines(), ElementsAre("Deallocing ClassIndex"));
}

TEST_F(ClassIndexTest, BindingADecoderLogsItsSection) {
  static_cast<void>(platform.systemLog().take());
  index->first->updateSectionRef(Dictionary());
  EXPECT_THAT(platform.systemLog().lines(), ElementsAre(warningLine("Cells")));
}

TEST(CodeDictionaryTest, KeepsTheOrderOfFirstRequests) {
  EXPECT_EQ(CodeDictionary::keyOf(0x417A), "16762");
  EXPECT_EQ(CodeDictionary::keyOf(0xFF0000), "16711680");
  EXPECT_THAT(CodeDictionary().keys(), IsEmpty());
}

// --- Arrays of the display -----------------------------------------------------------------------

TEST(DisplayArrayTest, IsClearedAndReplacedAsAWhole) {
  Array array{"a", "b"};
  const Array same = array;
  Base::replaceArrayWith(array, {"c", "d", "e"});
  EXPECT_EQ(Value(same), Value(Array{"c", "d", "e"}));
  Base::clearElementsInArray(array);
  EXPECT_THAT(same, IsEmpty());
  EXPECT_EQ(ArrayLock::nesting(), 0);
}

TEST(DisplayArrayTest, AnArrayThatIsNoneStaysSo) {
  Array none = Array::null();
  Base::replaceArrayWith(none, {"a"});
  Base::clearElementsInArray(none);
  EXPECT_TRUE(none.isNull());
}

}  // namespace
}  // namespace kestro::testing
