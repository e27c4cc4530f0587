// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <future>
#include <memory>
#include <thread>
#include <utility>
#include <vector>

#include "LogGenerator/ArrayLock.h"
#include "Model/KestroModelNode.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

class KestroModelNodeTest : public ::testing::Test {
 protected:
  void build(const Value& object) {
    nodesByPath.clear();
    root = KestroModelNode::makeTreeFromObjectWithPathDictionary(object, nodesByPath);
  }

  std::vector<std::string> names(std::string_view path = "/") {
    std::vector<std::string> result;
    for (const auto& child : *nodesByPath.at(std::string(path))->childNodes()) {
      result.push_back(child->displayName());
    }
    return result;
  }

  std::vector<std::string> paths() {
    std::vector<std::string> result;
    for (const auto& [path, node] : nodesByPath) result.push_back(path);
    return result;
  }

  NodesByPath nodesByPath;
  NodePointer root;
};

TEST_F(KestroModelNodeTest, MakesALeafOfAText) {
  build("value");
  EXPECT_EQ(root->displayName(), "Kestro");
  EXPECT_EQ(*root->value(), "value");
  EXPECT_EQ(root->childNodes(), nullptr);
}

TEST_F(KestroModelNodeTest, MakesAnUnknownLeafOfNothing) {
  build(Value());
  EXPECT_EQ(root->displayName(), "Kestro");
  EXPECT_EQ(*root->value(), "(unknown)");
  EXPECT_THAT(paths(), ElementsAre("/"));
}

TEST_F(KestroModelNodeTest, ShowsNumbersDataAndDatesAsUnknown) {
  for (const Value& value : {Value::integer(7), Value::real(0.5), Value::boolean(true),
                             Value::data({1}), Value::date(Moment())}) {
    build(Dictionary{{"key", value}});
    EXPECT_EQ(*nodesByPath.at("/key")->value(), "(unknown)");
  }
}

TEST_F(KestroModelNodeTest, KeepsTheOrderOfAnUnsortedDictionary) {
  build(Dictionary{{"b", "1"}, {"a", "2"}, {"c", "3"}});
  EXPECT_THAT(names(), ElementsAre("b", "a", "c"));
}

TEST_F(KestroModelNodeTest, KeepsWholeKeysInAnUnsortedDictionary) {
  build(Dictionary{{"02;B", "x"}, {"01;A", "y"}});
  EXPECT_THAT(names(), ElementsAre("02;B", "01;A"));
}

TEST_F(KestroModelNodeTest, SortsByStringAndShowsTheSecondPiece) {
  build(Dictionary{{"_sorted", "_sorted"}, {"02;B", "x"}, {"01;A", "y"}, {"10;C", "z"}});
  EXPECT_THAT(names(), ElementsAre("A", "B", "C"));
}

TEST_F(KestroModelNodeTest, SortsTenBeforeTwoWithoutPadding) {
  build(Dictionary{{"_sorted", "_sorted"}, {"2;B", "x"}, {"10;C", "z"}});
  EXPECT_THAT(names(), ElementsAre("C", "B"));
}

TEST_F(KestroModelNodeTest, SortsTenBeforeOneWithoutPadding) {
  // The digit comes before the semicolon.
  build(Dictionary{{"_sorted", "_sorted"}, {"1;168", "x"}, {"10;12", "y"}, {"11;4", "z"}});
  EXPECT_THAT(names(), ElementsAre("12", "4", "168"));
}

TEST_F(KestroModelNodeTest, SortsByUnsignedBytes) {
  build(Dictionary{{"_sorted", "_sorted"}, {"\xC3\x84", "x"}, {"z", "y"}, {"Z", "w"}});
  EXPECT_THAT(names(), ElementsAre("Z", "z", "\xC3\x84"));
}

TEST_F(KestroModelNodeTest, KeepsKeysWithoutOneSeparatorWhole) {
  build(
      Dictionary{{"_sorted", Value::boolean(false)}, {"a;b;c", "x"}, {"plain", "y"}, {"1;", "z"}});
  EXPECT_THAT(names(), ElementsAre("", "a;b;c", "plain"));
}

TEST_F(KestroModelNodeTest, LeavesOutKeysThatAreNoTextAndNullValues) {
  Dictionary dictionary{{"a", "1"}, {"null", Value()}};
  dictionary.set(Value::integer(3), "three");
  build(dictionary);
  EXPECT_THAT(names(), ElementsAre("a"));
  EXPECT_THAT(paths(), UnorderedElementsAre("/", "/a"));
}

TEST_F(KestroModelNodeTest, NeverShowsTheSortedMarkerEvenWithoutAValue) {
  build(Dictionary{{"_sorted", Value()}, {"02;b", "1"}, {"01;a", "2"}});
  EXPECT_THAT(names(), ElementsAre("02;b", "01;a"));
}

TEST_F(KestroModelNodeTest, NamesArrayElementsByTheirNumber) {
  build(Dictionary{{"Active Set", Array{"x", Dictionary{{"PSC", "9"}}}}});
  EXPECT_THAT(names("/Active Set"), ElementsAre("0", "1"));
  EXPECT_EQ(*nodesByPath.at("/Active Set/0")->value(), "x");
  EXPECT_EQ(*nodesByPath.at("/Active Set/1/PSC")->value(), "9");
}

TEST_F(KestroModelNodeTest, MakesTreeNodesOfEmptyContainers) {
  build(Dictionary{{"d", Dictionary()}, {"a", Array()}});
  EXPECT_THAT(names("/d"), IsEmpty());
  EXPECT_THAT(names("/a"), IsEmpty());
  EXPECT_EQ(nodesByPath.at("/a")->value(), nullptr);
}

TEST_F(KestroModelNodeTest, PutsAnArrayAtTheRootUnderNumbers) {
  build(Array{"x"});
  EXPECT_THAT(paths(), UnorderedElementsAre("/", "/0"));
}

TEST_F(KestroModelNodeTest, TakesSlashesInNamesAsTheyStand) {
  build(Dictionary{{"EF-GPRS/PS-LOCI", "1"}});
  EXPECT_THAT(paths(), UnorderedElementsAre("/", "/EF-GPRS/PS-LOCI"));
}

TEST_F(KestroModelNodeTest, KeepsTheLaterOfTwoNodesWithOnePath) {
  build(Dictionary{{"_sorted", "_sorted"}, {"1;A", "first"}, {"2;A", "second"}});
  EXPECT_THAT(names(), ElementsAre("A", "A"));
  EXPECT_EQ(*nodesByPath.at("/A")->value(), "second");
}

TEST_F(KestroModelNodeTest, HoldsTheArrayLockOncePerNestedArrayAndGivesItBack) {
  ArrayLock::initialize();
  build(Array{Array{Array{"x"}}});
  EXPECT_EQ(ArrayLock::nesting(), 0);
  EXPECT_EQ(*nodesByPath.at("/0/0/0")->value(), "x");
}

/// A thread that takes the array lock, keeps it until it is told to go on, and gives it back. One
/// that waits for a lock which nobody can give back is left behind.
class OtherThread {
 public:
  OtherThread() {
    std::thread([shared = _shared] {
      shared->isRunning = true;
      ArrayLock::lockArray();
      shared->hasLock = true;
      shared->mayGoOn.get_future().wait();
      ArrayLock::unlockArray();
    }).detach();
    waitUntil(_shared->isRunning, std::chrono::seconds(30));
  }
  ~OtherThread() { goOn(); }
  OtherThread(const OtherThread&) = delete;
  OtherThread& operator=(const OtherThread&) = delete;

  /// Whether it has the lock, or gets it within that time.
  [[nodiscard]] bool hasLock(std::chrono::milliseconds time) const {
    return waitUntil(_shared->hasLock, time);
  }
  void goOn() {
    if (!std::exchange(_isOver, true)) _shared->mayGoOn.set_value();
  }

 private:
  struct Shared {
    std::atomic<bool> isRunning = false;
    std::atomic<bool> hasLock = false;
    std::promise<void> mayGoOn;
  };

  static bool waitUntil(const std::atomic<bool>& flag, std::chrono::milliseconds time) {
    const auto end = std::chrono::steady_clock::now() + time;
    while (!flag && std::chrono::steady_clock::now() < end) {
      std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return flag;
  }

  std::shared_ptr<Shared> _shared = std::make_shared<Shared>();
  bool _isOver = false;
};

constexpr std::chrono::milliseconds kLong = std::chrono::seconds(30);
/// What would be done without the lock is done by then.
constexpr std::chrono::milliseconds kShort{300};

class ArrayLockUseTest : public KestroModelNodeTest {
 protected:
  void SetUp() override { ArrayLock::initialize(); }
  void TearDown() override { ArrayLock::initialize(); }
};

TEST_F(ArrayLockUseTest, AWalkOfAnArrayWaitsForTheLock) {
  OtherThread other;
  ASSERT_TRUE(other.hasLock(kLong));
  auto walk = std::async(std::launch::async, [this] { build(Array{"x"}); });
  EXPECT_EQ(walk.wait_for(kShort), std::future_status::timeout);
  other.goOn();
  EXPECT_EQ(walk.wait_for(kLong), std::future_status::ready);
}

TEST_F(ArrayLockUseTest, AWalkWithoutArraysNeedsNoLock) {
  OtherThread other;
  ASSERT_TRUE(other.hasLock(kLong));
  build(Dictionary{{"A", "x"}});
}

TEST_F(ArrayLockUseTest, TheLockIsFreeAfterAWalkOfOneArray) {
  build(Dictionary{{"A", Array{"x"}}, {"B", Array{"y"}}});
  EXPECT_TRUE(OtherThread().hasLock(kLong));
}

TEST_F(ArrayLockUseTest, TheLockStaysHeldAfterAWalkOfNestedArrays) {
  build(Array{Array{"x"}});
  EXPECT_FALSE(OtherThread().hasLock(kShort));
}

TEST(PathByAppendingTest, PutsOneSlashBetween) {
  EXPECT_EQ(pathByAppending("/", "A"), "/A");
  EXPECT_EQ(pathByAppending("/A", "B"), "/A/B");
}

}  // namespace
}  // namespace kestro
