// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QLabel>
#include <QTest>

#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/NavigationController.h"
#include "App/Toolkit/TextStyle.h"
#include "Tests/App/Screen.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class Screen : public ViewController {
 public:
  Screen(const QString& name, std::vector<std::string>& events) : _events(events) {
    setTitle(name);
  }
  ~Screen() override { note("gone"); }
  void viewWillAppear(bool) override { note("appears"); }
  void viewWillDisappear(bool) override { note("disappears"); }

 private:
  void note(const char* event) { _events.push_back(title().toStdString() + " " + event); }
  std::vector<std::string>& _events;
};

class NavigationControllerTest : public ::testing::Test {
 protected:
  NavigationControllerTest() {
    stack.setWillShow([this](ViewController& screen, bool animated) {
      events.push_back(screen.title().toStdString() + (animated ? " slides" : " jumps"));
    });
    stack.resize(390, 700);
    stack.show();
    events.clear();
  }

  std::unique_ptr<Screen> screen(const QString& name) {
    return std::make_unique<Screen>(name, events);
  }
  void push(const QString& name) {
    stack.pushViewController(screen(name), false);
    events.clear();
  }
  /// What happened since the last call, with what was put off.
  std::vector<std::string> take() {
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    return std::exchange(events, {});
  }
  std::string top() { return stack.topViewController().title().toStdString(); }

  std::vector<std::string> events;
  NavigationController stack{screen("Root")};
};

TEST_F(NavigationControllerTest, TheRootHasNoWayBack) {
  EXPECT_EQ(stack.navigationBar().title(), "Root");
  EXPECT_TRUE(stack.navigationBar().backButton().isHidden());
  stack.popViewController(false);
  EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationControllerTest, APushedScreenComesOnTop) {
  stack.pushViewController(screen("A"), false);
  EXPECT_THAT(take(), ElementsAre("Root disappears", "A appears", "A jumps"));
  EXPECT_EQ(stack.navigationBar().title(), "A");
  EXPECT_EQ(stack.navigationBar().backButton().text(), "Root");
  EXPECT_FALSE(stack.viewControllers()[0]->isVisible());
}

TEST_F(NavigationControllerTest, APoppedScreenIsGone) {
  push("A");
  stack.popViewController(false);
  EXPECT_THAT(take(), ElementsAre("A disappears", "Root appears", "Root jumps", "A gone"));
  EXPECT_TRUE(stack.topViewController().isVisible());
}

TEST_F(NavigationControllerTest, PoppingToAScreenPopsAllAboveIt) {
  push("A");
  push("B");
  push("C");
  stack.popToIndex(1, false);
  EXPECT_EQ(top(), "A");
  EXPECT_THAT(take(), ElementsAre("C disappears", "A appears", "A jumps", "B gone", "C gone"));
  stack.popToIndex(1, false);
  EXPECT_THAT(take(), IsEmpty());
}

TEST_F(NavigationControllerTest, AnAnimatedScreenSlidesIntoPlace) {
  stack.pushViewController(screen("A"), true);
  EXPECT_TRUE(QTest::qWaitFor([&] { return !stack.isMoving(); }));
  EXPECT_EQ(stack.topViewController().pos(), QPoint(0, 0));
  EXPECT_FALSE(stack.viewControllers()[0]->isVisible());
}

TEST_F(NavigationControllerTest, AMovementThatOvertakesAnotherEndsItFirst) {
  stack.pushViewController(screen("A"), true);
  stack.pushViewController(screen("B"), true);
  stack.popToIndex(0, true);
  EXPECT_TRUE(QTest::qWaitFor([&] { return !stack.isMoving(); }));
  EXPECT_EQ(top(), "Root");
  EXPECT_EQ(stack.topViewController().pos(), QPoint(0, 0));
  EXPECT_TRUE(stack.topViewController().isVisible());
}

TEST_F(NavigationControllerTest, AScreenThatLeavesIsDisabledUntilItHasLeft) {
  stack.pushViewController(screen("A"), true);
  QWidget& root = *stack.viewControllers()[0];
  EXPECT_FALSE(root.isEnabled());
  EXPECT_TRUE(stack.topViewController().isEnabled());
  EXPECT_TRUE(QTest::qWaitFor([&] { return !stack.isMoving(); }));
  EXPECT_TRUE(root.isEnabled());
  const QPointer<QWidget> popped = &stack.topViewController();
  stack.popViewController(true);
  EXPECT_FALSE(popped->isEnabled());
  EXPECT_TRUE(root.isEnabled());
}

TEST_F(NavigationControllerTest, AFocusThatWasMovedDuringASlideStays) {
  stack.pushViewController(screen("A"), true);
  stack.navigationBar().backButton().setFocus();
  EXPECT_TRUE(QTest::qWaitFor([&] { return !stack.isMoving(); }));
  EXPECT_EQ(stack.focusWidget(), &stack.navigationBar().backButton());
}

TEST_F(NavigationControllerTest, BackspaceEscapeAndTheButtonGoBack) {
  for (const Qt::Key key : {Qt::Key_Backspace, Qt::Key_Escape}) {
    push("A");
    QTest::keyClick(&stack, key);
    EXPECT_EQ(top(), "Root");
  }
  push("A");
  QTest::mouseClick(&stack.navigationBar().backButton(), Qt::LeftButton);
  EXPECT_EQ(top(), "Root");
  push("A");
  QTest::mouseClick(&stack, Qt::BackButton);
  EXPECT_EQ(top(), "Root");
}

TEST_F(NavigationControllerTest, TheBarsFollowTheTopScreen) {
  stack.topViewController().setToolbarItems({ToolbarItem::label("one")}, false);
  EXPECT_EQ(testing::statusOf(stack.toolbar()), "one");
  stack.topViewController().setTitle("Other");
  EXPECT_EQ(stack.navigationBar().title(), "Other");
  push("A");
  stack.viewControllers()[0]->setToolbarItems({ToolbarItem::label("two")}, false);
  EXPECT_THAT(stack.toolbar().items(), IsEmpty());
}

TEST_F(NavigationControllerTest, ItemsOfTheSameKindsKeepTheirWidgets) {
  ViewController& screen = stack.topViewController();
  screen.setToolbarItems({ToolbarItem::activityIndicator(true), ToolbarItem::label("a")}, true);
  QWidget* label = stack.toolbar().widgetOfItem(1);
  screen.setToolbarItems({ToolbarItem::activityIndicator(false), ToolbarItem::label("b")}, true);
  EXPECT_EQ(stack.toolbar().widgetOfItem(1), label);
  EXPECT_EQ(static_cast<QLabel*>(label)->text(), "b");
}

TEST_F(NavigationControllerTest, AToolbarsLabelHasRoomForItsTextInFourteenPoints) {
  stack.topViewController().setToolbarItems({ToolbarItem::label("Updated 2012-03-04")}, false);
  const QSize room = stack.toolbar().widgetOfItem(0)->sizeHint();
  EXPECT_EQ(room - QSize(1, 0), systemTextStyle(14).size("Updated 2012-03-04").toSize());
}

TEST_F(NavigationControllerTest, AButtonsShortcutPressesIt) {
  int presses = 0;
  stack.topViewController().setToolbarItems(
      {ToolbarItem::button("Save", QKeySequence::Save, [&] { ++presses; })}, false);
  QTest::keyClick(&stack, Qt::Key_S, Qt::ControlModifier);
  QTest::keyClick(&stack, Qt::Key_S);
  QTest::mouseClick(stack.toolbar().widgetOfItem(0), Qt::LeftButton);
  EXPECT_EQ(presses, 2);
}

TEST_F(NavigationControllerTest, ASheetCoversEverythingUntilItIsDismissed) {
  push("A");
  stack.present(std::make_unique<QWidget>(), false);
  EXPECT_EQ(stack.presented()->geometry(), stack.rect());
  EXPECT_FALSE(stack.navigationBar().isEnabled());
  QTest::keyClick(&stack, Qt::Key_Escape);
  EXPECT_EQ(top(), "A");
  stack.dismiss(false);
  EXPECT_EQ(stack.presented(), nullptr);
  EXPECT_TRUE(stack.navigationBar().isEnabled());
}

TEST(ActivityIndicatorTest, ItHidesWhenStopped) {
  ActivityIndicator indicator;
  EXPECT_TRUE(indicator.isHidden());
  indicator.startAnimating();
  EXPECT_TRUE(indicator.isAnimating());
  EXPECT_FALSE(indicator.isHidden());
  indicator.stopAnimating();
  EXPECT_FALSE(indicator.isAnimating());
  EXPECT_TRUE(indicator.isHidden());
}

}  // namespace
}  // namespace kestro
