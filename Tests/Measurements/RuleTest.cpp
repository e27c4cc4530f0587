// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "Measurements/Rule.h"

namespace kestro {
namespace {

using std::chrono::microseconds;

Rule ruleOf(std::string_view text) {
  const auto rules = parseRules(text, "rules");
  if (!rules || rules->size() != 1) {
    ADD_FAILURE() << text << ": " << (rules ? "not one rule" : rules.error().message);
    return {};
  }
  return rules->front();
}

std::string errorOf(std::string_view text) {
  const auto rules = parseRules(text, "rules");
  return rules ? "no error" : rules.error().message;
}

TEST(RuleTest, RuleHasSeriesComparisonLimitUnitAndDuration) {
  EXPECT_EQ(ruleOf("Measured RSRP < -110 dBm for 4 s"),
            (Rule{.text = "Measured RSRP < -110 dBm for 4 s",
                  .series = "Measured RSRP",
                  .comparison = Comparison::Less,
                  .limit = -110,
                  .unit = "dBm",
                  .duration = microseconds(4'000'000)}));
}

TEST(RuleTest, UnitAndDurationMayBeLeftOut) {
  EXPECT_EQ(ruleOf("Num Tx Antennas!=4").series, "Num Tx Antennas");
  EXPECT_EQ(ruleOf("Num Tx Antennas!=4").comparison, Comparison::NotEqual);
  EXPECT_EQ(ruleOf("Num Tx Antennas!=4").unit, "");
  EXPECT_EQ(ruleOf("Num Tx Antennas!=4").duration, microseconds(0));
  EXPECT_EQ(ruleOf("a > 5 for 1.5").duration, microseconds(1'500'000));
  EXPECT_EQ(ruleOf("a > 5 for 1.5").unit, "");
  EXPECT_EQ(ruleOf("a > 5 dB").duration, microseconds(0));
}

TEST(RuleTest, BlanksAreFree) {
  EXPECT_EQ(ruleOf("  a b   >=   5dB   for   2s  \r").series, "a b");
  EXPECT_EQ(ruleOf("  a b   >=   5dB   for   2s  \r").unit, "dB");
  EXPECT_EQ(ruleOf("  a b   >=   5dB   for   2s  \r").duration, microseconds(2'000'000));
  EXPECT_EQ(ruleOf("  a b   >=   5dB   for   2s  \r").text, "a b   >=   5dB   for   2s");
}

TEST(RuleTest, EveryComparisonIsRead) {
  EXPECT_EQ(ruleOf("a < 1").comparison, Comparison::Less);
  EXPECT_EQ(ruleOf("a <= 1").comparison, Comparison::LessOrEqual);
  EXPECT_EQ(ruleOf("a > 1").comparison, Comparison::Greater);
  EXPECT_EQ(ruleOf("a >= 1").comparison, Comparison::GreaterOrEqual);
  EXPECT_EQ(ruleOf("a == 1").comparison, Comparison::Equal);
  EXPECT_EQ(ruleOf("a != 1").comparison, Comparison::NotEqual);
}

TEST(RuleTest, EveryComparisonComparesAsItIsWritten) {
  const auto holds = [](Comparison comparison) {
    return std::array{compares(1, comparison, 2), compares(2, comparison, 2),
                      compares(3, comparison, 2)};
  };
  EXPECT_EQ(holds(Comparison::Less), (std::array{true, false, false}));
  EXPECT_EQ(holds(Comparison::LessOrEqual), (std::array{true, true, false}));
  EXPECT_EQ(holds(Comparison::Greater), (std::array{false, false, true}));
  EXPECT_EQ(holds(Comparison::GreaterOrEqual), (std::array{false, true, true}));
  EXPECT_EQ(holds(Comparison::Equal), (std::array{false, true, false}));
  EXPECT_EQ(holds(Comparison::NotEqual), (std::array{true, false, true}));
}

TEST(RuleTest, QuotesHoldASeriesWithAnOperatorOrANumberSign) {
  EXPECT_EQ(ruleOf(R"("DRX Cycles of S < 0" > 3)").series, "DRX Cycles of S < 0");
  EXPECT_EQ(ruleOf(R"("Cell # 5" > 3 # five)").series, "Cell # 5");
}

TEST(RuleTest, CommentsAndEmptyLinesArePassedOver) {
  const auto rules = parseRules("# all\n\n  \na < 1 # one\n#b < 2\nc < 3", "rules");
  ASSERT_TRUE(rules);
  ASSERT_EQ(rules->size(), 2u);
  EXPECT_EQ((*rules)[0].text, "a < 1");
  EXPECT_EQ((*rules)[1].text, "c < 3");
}

TEST(RuleTest, UnitMayHoldBlanksAndTheLettersOfFor) {
  EXPECT_EQ(ruleOf("a < 1 x 64chips for 2").unit, "x 64chips");
  EXPECT_EQ(ruleOf("a < 1 forks").unit, "forks");
}

TEST(RuleTest, WrongRuleIsRefusedWithLineAndColumn) {
  EXPECT_EQ(errorOf("a < 1\n\nb 5"),
            "rules:3:4: expected one of < <= > >= == !=, found the end of the line");
  EXPECT_EQ(errorOf("< 5"), "rules:1:1: expected a series, found \"< 5\"");
  EXPECT_EQ(errorOf("a = 5"), "rules:1:3: expected one of < <= > >= == !=, found \"= 5\"");
  EXPECT_EQ(errorOf("a < five"), "rules:1:5: expected a number, found \"five\"");
  EXPECT_EQ(errorOf("a <"), "rules:1:4: expected a number, found the end of the line");
  EXPECT_EQ(errorOf("a < 1 dB < 2"), "rules:1:10: expected a unit or \"for\", found \"< 2\"");
  EXPECT_EQ(errorOf("a < 1 for"),
            "rules:1:10: expected a number of seconds, found the end of the line");
  EXPECT_EQ(errorOf("a < 1 for 4 min"), "rules:1:13: expected the end of the rule, found \"min\"");
  EXPECT_EQ(errorOf("\"a < 1"), "rules:1:1: this quote is not closed");
  EXPECT_EQ(errorOf("\"\" < 1"), "rules:1:1: expected a series between the quotes");
}

TEST(RuleTest, ColumnsCountCharacters) {
  EXPECT_EQ(errorOf("Größe < x"), "rules:1:9: expected a number, found \"x\"");
}

TEST(RuleTest, NumbersThatAreNoneAreRefused) {
  EXPECT_EQ(errorOf("a < nan"), "rules:1:5: expected a number, found \"nan\"");
  EXPECT_EQ(errorOf("a < inf"), "rules:1:5: expected a number, found \"inf\"");
  EXPECT_EQ(errorOf("a < 1e999"), "rules:1:5: expected a number, found \"1e999\"");
  EXPECT_EQ(errorOf("a < +-1"), "rules:1:5: expected a number, found \"+-1\"");
  EXPECT_EQ(ruleOf("a < +1.5e1").limit, 15);
}

TEST(RuleTest, DurationIsAtMostADay) {
  EXPECT_EQ(ruleOf("a < 1 for 86400").duration, microseconds(86'400'000'000));
  EXPECT_EQ(errorOf("a < 1 for 86401 s"),
            "rules:1:11: expected 0 to 86400 seconds, found \"86401 s\"");
  EXPECT_EQ(errorOf("a < 1 for -1 s"), "rules:1:11: expected 0 to 86400 seconds, found \"-1 s\"");
}

TEST(RuleTest, LongLinesAndTooManyRulesAreRefused) {
  EXPECT_EQ(errorOf(std::string(1'001, 'a')), "rules:1:1: longer than 1000 bytes");
  std::string many;
  for (std::size_t i = 0; i < kMaximumRules; ++i) many += "a < 1\n";
  EXPECT_EQ(parseRules(many, "rules")->size(), kMaximumRules);
  EXPECT_EQ(errorOf(many + "b < 1"), "rules:1001:1: more than 1000 rules");
}

}  // namespace
}  // namespace kestro
