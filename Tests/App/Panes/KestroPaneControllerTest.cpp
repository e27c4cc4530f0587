// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QApplication>
#include <QClipboard>
#include <QGuiApplication>
#include <QScrollBar>
#include <QTest>

#include "App/Panes/KestroPaneController.h"
#include "Tests/App/Screen.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

NodePointer leaf(const std::string& name, const std::string& value) {
  return std::make_shared<KestroModelLeafNode>(name, value);
}

NodePointer tree(const std::string& name, std::vector<NodePointer> children) {
  return std::make_shared<KestroModelTreeNode>(name, std::move(children));
}

class Host : public PaneHost {
 public:
  [[nodiscard]] bool allowSaveButton() const override { return allows; }
  [[nodiscard]] bool marksChanges() const override { return true; }
  void showSaveView() override { ++saves; }
  void pushPane(std::unique_ptr<ViewController> pane) override {
    pushed.emplace_back(static_cast<KestroPaneController*>(pane.release()));
  }

  bool allows = false;
  int saves = 0;
  std::vector<std::unique_ptr<KestroPaneController>> pushed;
};

class KestroPaneControllerTest : public ::testing::Test {
 protected:
  void makePane(NodePointer node, const std::string& path = "/") {
    pane = std::make_unique<KestroPaneController>(host, std::move(node), path);
    pane->resize(390, 600);
    pane->show();
  }
  TableView& table() { return pane->tableView(); }
  std::vector<std::string> rows() { return testing::rowsOf(table()); }
  void press(int row) {
    table().setFocusedRow(row);
    QTest::keyClick(&table(), Qt::Key_Return);
  }

  Host host;
  std::unique_ptr<KestroPaneController> pane;
};

TEST_F(KestroPaneControllerTest, WithoutANodeItIsKestroWithoutRows) {
  makePane(nullptr);
  EXPECT_EQ(pane->title(), "Kestro");
  EXPECT_EQ(table().rowCount(), 0);
  EXPECT_EQ(pane->path(), "/");
}

TEST_F(KestroPaneControllerTest, AtFirstItsStatusIsEmptyAndItIsLoading) {
  makePane(nullptr);
  pane->viewWillAppear(false);
  EXPECT_EQ(testing::kindsOf(pane->toolbarItems()), "indicator label space ");
  EXPECT_TRUE(pane->toolbarItems()[0].isAnimating);
  EXPECT_EQ(pane->toolbarItems()[1].text, "");
}

TEST_F(KestroPaneControllerTest, ItShowsItsNodesChildren) {
  makePane(tree("Cells", {tree("0", {}), leaf("Count", "7")}), "/Cells");
  EXPECT_EQ(pane->title(), "Cells");
  EXPECT_THAT(rows(), ElementsAre("0 >", "Count = 7"));
}

TEST_F(KestroPaneControllerTest, ALeafNodeHasNoRows) {
  makePane(leaf("Kestro", "(unknown)"));
  EXPECT_EQ(pane->title(), "Kestro");
  EXPECT_THAT(rows(), IsEmpty());
}

TEST_F(KestroPaneControllerTest, TheStatusIsInTheToolbar) {
  makePane(nullptr);
  pane->setStatus("Updated", false);
  EXPECT_FALSE(pane->toolbarItems()[0].isAnimating);
  EXPECT_EQ(pane->toolbarItems()[1].text, "Updated");
}

TEST_F(KestroPaneControllerTest, ANullStatusIsEmpty) {
  makePane(nullptr);
  pane->setStatus(QString(), true);
  EXPECT_FALSE(pane->toolbarItems()[1].text.isNull());
  EXPECT_EQ(pane->toolbarItems()[1].text, "");
}

TEST_F(KestroPaneControllerTest, TheSaveButtonAsksTheHost) {
  host.allows = true;
  makePane(nullptr);
  pane->viewWillAppear(false);
  ASSERT_EQ(testing::kindsOf(pane->toolbarItems()), "indicator label space button ");
  pane->toolbarItems()[3].action();
  EXPECT_EQ(host.saves, 1);
}

TEST_F(KestroPaneControllerTest, AReloadBuildsTheToolbarAnew) {
  makePane(nullptr);
  pane->viewWillAppear(false);
  host.allows = true;
  pane->reloadWithNode(nullptr);
  EXPECT_EQ(testing::kindsOf(pane->toolbarItems()), "indicator label space button ");
}

TEST_F(KestroPaneControllerTest, ItsToolbarItemsAreSetWithAnimation) {
  makePane(nullptr);
  std::vector<bool> animated;
  pane->setChangeHandler([&](bool isAnimated) { animated.push_back(isAnimated); });
  const auto last = [&] {
    const bool result = animated.back();
    animated = {false};
    return result;
  };
  pane->viewWillAppear(false);
  EXPECT_TRUE(last());
  pane->setStatus("Updated", false);
  EXPECT_TRUE(last());
  pane->reloadWithNode(nullptr);
  EXPECT_TRUE(last());
}

TEST_F(KestroPaneControllerTest, APaneThatDisappearsGivesUpTheKeys) {
  makePane(tree("Kestro", {leaf("Count", "7")}));
  QApplication::setActiveWindow(pane.get());
  table().setFocus();
  ASSERT_TRUE(table().hasFocus());
  pane->viewWillDisappear(true);
  EXPECT_FALSE(table().hasFocus());
}

TEST_F(KestroPaneControllerTest, BothKindsOfCellsHaveOneIdentifier) {
  makePane(tree("Kestro", {tree("A", {}), leaf("B", "1")}));
  EXPECT_EQ(table().cellAtRow(0)->reuseIdentifier(), "KestroPaneControllerCell");
  EXPECT_EQ(table().cellAtRow(1)->reuseIdentifier(), "KestroPaneControllerCell");
}

TEST_F(KestroPaneControllerTest, ALeafRowOpensNothingAndIsDeselected) {
  makePane(tree("Kestro", {leaf("Count", "7")}));
  press(0);
  EXPECT_THAT(host.pushed, IsEmpty());
  EXPECT_EQ(table().selectedRow(), -1);
}

TEST_F(KestroPaneControllerTest, ATreeRowOpensAPaneWithThisOnesStatus) {
  makePane(tree("Cells", {tree("0", {leaf("ARFCN", "62")})}), "/Cells");
  pane->setStatus("Updated", false);
  press(0);
  ASSERT_EQ(host.pushed.size(), 1);
  EXPECT_EQ(host.pushed[0]->path(), "/Cells/0");
  EXPECT_EQ(host.pushed[0]->title(), "0");
  EXPECT_EQ(host.pushed[0]->toolbarItems()[1].text, "Updated");
  EXPECT_FALSE(host.pushed[0]->toolbarItems()[0].isAnimating);
}

TEST_F(KestroPaneControllerTest, ATreeRowWithoutChildrenOpensTooFromTheRoot) {
  makePane(tree("Kestro", {tree("Empty", {})}));
  press(0);
  ASSERT_EQ(host.pushed.size(), 1);
  EXPECT_EQ(host.pushed[0]->path(), "/Empty");
  EXPECT_EQ(host.pushed[0]->tableView().rowCount(), 0);
}

TEST_F(KestroPaneControllerTest, AReloadShowsTheNewNode) {
  makePane(nullptr);
  pane->reloadWithNode(tree("Other", {leaf("A", "1")}));
  EXPECT_EQ(pane->title(), "Other");
  EXPECT_THAT(rows(), ElementsAre("A = 1"));
  pane->reloadWithNode(nullptr);
  EXPECT_EQ(pane->title(), "Kestro");
  EXPECT_THAT(rows(), IsEmpty());
}

TEST_F(KestroPaneControllerTest, AKeyOnlyCellOnALeafRowShowsOnlyTheName) {
  makePane(tree("Kestro", {tree("A", {})}));
  pane->reloadWithNode(tree("Kestro", {leaf("A", "1")}));
  EXPECT_THAT(rows(), ElementsAre("A"));
  pane->reloadWithNode(tree("Kestro", {tree("A", {})}));
  EXPECT_THAT(rows(), ElementsAre("A >"));
}

TEST_F(KestroPaneControllerTest, AKeyValueCellOnATreeRowIsClearedOfItsValue) {
  makePane(tree("Kestro", {leaf("A", "1")}));
  pane->reloadWithNode(tree("Kestro", {tree("A", {})}));
  EXPECT_THAT(rows(), ElementsAre("A >"));
  EXPECT_EQ(static_cast<KestroCell*>(table().cellAtRow(0))->value(), "");
  pane->reloadWithNode(tree("Kestro", {leaf("A", "2")}));
  EXPECT_THAT(rows(), ElementsAre("A = 2"));
}

TEST_F(KestroPaneControllerTest, OnlyTheRowThatChangedItsKindKeepsTheOtherCell) {
  makePane(tree("Kestro", {tree("A", {}), leaf("B", "1"), leaf("C", "2")}));
  pane->reloadWithNode(tree("Kestro", {leaf("A", "0"), leaf("B", "1"), leaf("C", "2")}));
  EXPECT_THAT(rows(), ElementsAre("A", "B = 1", "C = 2"));
}

std::vector<NodePointer> numberedLeaves(int count) {
  std::vector<NodePointer> result;
  result.reserve(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) result.push_back(leaf("n" + std::to_string(i), "v"));
  return result;
}

TEST_F(KestroPaneControllerTest, AReloadKeepsScrollPositionAndFocus) {
  makePane(tree("Kestro", numberedLeaves(100)));
  table().setFocusedRow(42);
  table().scrollToRow(42);
  const int position = table().verticalScrollBar()->value();
  ASSERT_GT(position, 0);
  pane->reloadWithNode(tree("Kestro", numberedLeaves(100)));
  EXPECT_EQ(table().verticalScrollBar()->value(), position);
  EXPECT_EQ(table().focusedRow(), 42);
}

TEST_F(KestroPaneControllerTest, TheFocusFollowsItsNameWhenRowsComeAbove) {
  makePane(tree("Kestro", {leaf("A", "1"), leaf("B", "2")}));
  table().setFocusedRow(1);
  pane->reloadWithNode(tree("Kestro", {leaf("New", "0"), leaf("A", "1"), leaf("B", "2")}));
  EXPECT_EQ(table().focusedRow(), 2);
}

TEST_F(KestroPaneControllerTest, TheFocusStaysInATableThatShrinks) {
  makePane(tree("Kestro", {leaf("A", "1"), leaf("B", "2")}));
  table().setFocusedRow(1);
  pane->reloadWithNode(tree("Kestro", {leaf("A", "1")}));
  EXPECT_EQ(table().focusedRow(), 0);
  pane->reloadWithNode(nullptr);
  EXPECT_EQ(table().focusedRow(), -1);
}

TEST_F(KestroPaneControllerTest, CopyingARowGivesKeyTabValue) {
  makePane(tree("Kestro", {leaf("RSCP", "-70 dBm"), tree("Cells", {})}));
  table().setFocusedRow(0);
  QTest::keyClick(&table(), Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(QGuiApplication::clipboard()->text(), "RSCP\t-70 dBm");
  table().setFocusedRow(1);
  QTest::keyClick(&table(), Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(QGuiApplication::clipboard()->text(), "Cells");
}

TEST_F(KestroPaneControllerTest, AValueIsMarkedOnlyAgainstItsOwnName) {
  makePane(tree("Kestro", {leaf("A", "1"), leaf("B", "2")}));
  pane->reloadWithNode(tree("Kestro", {leaf("New", "0"), leaf("A", "1"), leaf("B", "3")}));
  EXPECT_FALSE(table().cellAtRow(0)->isMarkedChanged());
  EXPECT_FALSE(table().cellAtRow(1)->isMarkedChanged());
  EXPECT_TRUE(table().cellAtRow(2)->isMarkedChanged());
}

}  // namespace
}  // namespace kestro
