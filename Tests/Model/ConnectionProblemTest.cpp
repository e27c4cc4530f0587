// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "Model/ConnectionProblem.h"

namespace kestro {
namespace {

TEST(ProblemTextTest, SaysWhatHelps) {
  EXPECT_EQ(problemText({ConnectionProblem::Kind::NoServer}, "TelephonyServer"),
            "no telephony server \"TelephonyServer\" is running: start kestro-telephonyd, or use "
            "--demo");
  EXPECT_EQ(problemText({ConnectionProblem::Kind::NoServer}, "Other"),
            "no telephony server \"Other\" is running: start kestro-telephonyd --name=Other, or "
            "use --demo");
}

TEST(ProblemTextTest, SaysWhatIsWrong) {
  EXPECT_EQ(
      problemText({ConnectionProblem::Kind::Ports, "port directory /x: its mode is 0755"}, "A"),
      "port directory /x: its mode is 0755");
  EXPECT_EQ(problemText({ConnectionProblem::Kind::NoChannel, "3"}, "A"),
            "the telephony server \"A\" gives no log channel (error 3)");
  EXPECT_EQ(problemText({ConnectionProblem::Kind::Technology, "5G"}, "A"),
            "the telephony server \"A\" speaks 5G, which nothing here decodes");
  EXPECT_EQ(problemText({ConnectionProblem::Kind::NoAnswer}, "A"),
            "the telephony server \"A\" does not answer");
}

}  // namespace
}  // namespace kestro
