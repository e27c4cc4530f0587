// SPDX-License-Identifier: MIT
// One application object for all tests, off screen; each test launches it anew.
#include <gtest/gtest.h>

#include "App/KestroApp.h"

int main(int argumentCount, char** arguments) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  ::testing::InitGoogleTest(&argumentCount, arguments);
  kestro::KestroApp app(argumentCount, arguments);
  // Tests close the window again and again.
  QGuiApplication::setQuitOnLastWindowClosed(false);
  return RUN_ALL_TESTS();
}
