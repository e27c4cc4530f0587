// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/CommandLine.h"
#include "Platform/Virtual/VirtualServices.h"
#include "Tests/Options/RowFaults.h"

namespace kestro {
namespace {

using ::testing::IsEmpty;

TEST(CommandLineTest, EveryRowExplainsItself) {
  const VirtualBundle bundle;
  EXPECT_THAT(rowFaults(commandLineProgram(bundle)), IsEmpty());
}

TEST(CommandLineTest, WhatHasNoCommandsOfItsOwnRuns) {
  const VirtualBundle bundle;
  for (const CommandRow& command : commandLineProgram(bundle).commands) {
    EXPECT_NE(static_cast<bool>(command.run), !command.commands.empty()) << command.name;
    for (const CommandRow& action : command.commands) EXPECT_TRUE(action.run) << action.name;
  }
}

}  // namespace
}  // namespace kestro
