// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <QAccessible>

#include "Tests/App/AppFixture.h"

namespace kestro {
namespace {

class AccessibilityTest : public testing::AppFixture {
 protected:
  static QAccessible::Role roleOf(QObject* object) {
    return QAccessible::queryAccessibleInterface(object)->role();
  }
  static std::string textOf(QObject* object, QAccessible::Text kind) {
    return QAccessible::queryAccessibleInterface(object)->text(kind).toStdString();
  }
};

TEST_F(AccessibilityTest, ATableIsAListOfNamesWithValues) {
  launchConnected();
  show(Dictionary{{"RSCP", "-70 dBm"}, {"Band", "1"}});
  EXPECT_EQ(roleOf(&table()), QAccessible::List);
  EXPECT_EQ(textOf(&table(), QAccessible::Name), "Kestro");
  TableCell* cell = table().cellAtRow(0);
  EXPECT_EQ(roleOf(cell), QAccessible::ListItem);
  EXPECT_EQ(textOf(cell, QAccessible::Name), "RSCP");
  EXPECT_EQ(textOf(cell, QAccessible::Description), "-70 dBm");
}

TEST_F(AccessibilityTest, TheBarsSayWhatTheyShow) {
  offerSaving();
  launch();
  EXPECT_EQ(roleOf(&stack().toolbar()), QAccessible::ToolBar);
  EXPECT_EQ(roleOf(stack().toolbar().widgetOfItem(0)), QAccessible::Animation);
  EXPECT_EQ(textOf(stack().toolbar().widgetOfItem(1), QAccessible::Name), "Connecting");
  EXPECT_EQ(roleOf(stack().toolbar().widgetOfItem(3)), QAccessible::Button);
  EXPECT_EQ(textOf(stack().toolbar().widgetOfItem(3), QAccessible::Name), "Save");
}

TEST_F(AccessibilityTest, TheAlertIsAnAlert) {
  launchConnected();
  platform.deviceRoot().setWriteFailure("full");
  app().showSaveView();
  app().saveViewController()->savePressed();
  EXPECT_EQ(roleOf(app().alert()), QAccessible::AlertMessage);
  EXPECT_EQ(textOf(app().alert(), QAccessible::Name), "File Error");
  EXPECT_EQ(textOf(app().alert(), QAccessible::Description), "Unable to write file to disk");
}

}  // namespace
}  // namespace kestro
