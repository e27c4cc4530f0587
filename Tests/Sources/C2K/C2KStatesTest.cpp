// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

#include "Sources/C2K/C2KStates.h"

namespace kestro {
namespace {

using std::chrono::milliseconds;
using ::testing::ElementsAre;

constexpr milliseconds kStep{500};

/// The states of so many steps, each once in a row.
template <class Advance>
auto statesIn(int steps, Advance&& advance) {
  std::vector<decltype(advance())> states;
  for (int i = 0; i < steps; ++i) {
    const auto state = advance();
    if (states.empty() || states.back() != state) states.push_back(state);
  }
  return states;
}

TEST(OneXCallProcessingTest, FindsASystemAndWaitsInItsSlots) {
  OneXCallProcessing oneX(1);
  EXPECT_EQ(oneX.state(), OneXState::PowerUp);
  EXPECT_FALSE(oneX.hasPilot());
  const auto states = statesIn(8, [&] {
    oneX.advance(kStep);
    return oneX.state();
  });
  EXPECT_THAT(states, ElementsAre(OneXState::Acquisition, OneXState::Sync, OneXState::Paging,
                                  OneXState::Sleep, OneXState::Paging));
  EXPECT_TRUE(oneX.isIdle());
  EXPECT_TRUE(oneX.hasPilot());
}

TEST(OneXCallProcessingTest, IsCalledAfterAWhileAndLooksForTheSystemAgainBehindTheCall) {
  OneXCallProcessing oneX(1);
  int before = 0;
  while (!oneX.isInTraffic() && before < 1'000) {
    oneX.advance(kStep);
    ++before;
  }
  EXPECT_GE(before, 24);
  EXPECT_LT(before, 40);
  int during = 0;
  while (oneX.isInTraffic() && during < 1'000) {
    oneX.advance(kStep);
    ++during;
  }
  EXPECT_GE(during, 12);
  EXPECT_LE(during, 29);
  EXPECT_EQ(oneX.state(), OneXState::Initial);
  const auto states = statesIn(3, [&] {
    oneX.advance(kStep);
    return oneX.state();
  });
  EXPECT_THAT(states, ElementsAre(OneXState::Acquisition, OneXState::Sync, OneXState::Paging));
}

class EVDOConnectionTest : public ::testing::Test {
 protected:
  EVDOState advance(bool hasReceiver, Activity activity = Activity::Idle) {
    evdo.advance(kStep, hasReceiver, activity);
    return evdo.state();
  }
  void openSession() {
    for (int i = 0; i < 20; ++i) advance(true);
    ASSERT_EQ(evdo.session(), EVDOSession::Open);
  }

  EVDOConnection evdo;
};

TEST_F(EVDOConnectionTest, IsInactiveWithoutTheReceiver) {
  for (int i = 0; i < 10; ++i) EXPECT_EQ(advance(false), EVDOState::Inactive);
  EXPECT_EQ(evdo.session(), EVDOSession::Closed);
  EXPECT_FALSE(evdo.hasPilot());
}

TEST_F(EVDOConnectionTest, SetsASessionUpOnceAndThenRests) {
  const auto states = statesIn(20, [&] { return advance(true); });
  EXPECT_THAT(states, ElementsAre(EVDOState::Acquisition, EVDOState::Sync, EVDOState::Idle,
                                  EVDOState::Access, EVDOState::Connected, EVDOState::Idle));
  EXPECT_EQ(evdo.session(), EVDOSession::Open);
}

TEST_F(EVDOConnectionTest, NegotiatesTheSessionStepByStep) {
  const auto sessions = statesIn(20, [&] {
    advance(true);
    return evdo.session();
  });
  EXPECT_THAT(sessions,
              ElementsAre(EVDOSession::Closed, EVDOSession::Setup, EVDOSession::Negotiation,
                          EVDOSession::Initiated, EVDOSession::Open));
}

TEST_F(EVDOConnectionTest, ConnectsForDataAndStaysForAWhile) {
  openSession();
  EXPECT_EQ(advance(true, Activity::Transfer), EVDOState::Access);
  EXPECT_EQ(advance(true, Activity::Transfer), EVDOState::Connected);
  EXPECT_EQ(advance(true, Activity::Tail), EVDOState::Connected);
  EXPECT_EQ(advance(true, Activity::Idle), EVDOState::Idle);
}

TEST_F(EVDOConnectionTest, KeepsTheSessionThroughACall) {
  openSession();
  EXPECT_EQ(advance(false, Activity::Transfer), EVDOState::Inactive);
  EXPECT_EQ(evdo.session(), EVDOSession::Open);
  const auto states = statesIn(5, [&] { return advance(true, Activity::Transfer); });
  EXPECT_THAT(states, ElementsAre(EVDOState::Acquisition, EVDOState::Sync, EVDOState::Idle,
                                  EVDOState::Access, EVDOState::Connected));
}

}  // namespace
}  // namespace kestro
