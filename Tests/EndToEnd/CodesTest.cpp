// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "Tests/EndToEnd/Process.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::SizeIs;

TEST(Codes, TheDocumentIsWhatTheTablesSay) {
  const Outcome outcome = run({"kestro-cli", "codes", "--format=markdown"});
  EXPECT_EQ(outcome.status, 0);
  const bool isSame =
      outcome.output == TemporaryDirectory::text(KESTRO_DOCUMENTATION_DIRECTORY "/log-codes.md");
  EXPECT_TRUE(isSame) << "run: kestro-cli codes --format=markdown > Documentation/log-codes.md";
}

TEST(Codes, ListsOneTechnology) {
  const Outcome outcome = run({"kestro-cli", "codes", "--technology=LTE"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.output, HasSubstr("LTE: Serving Cell\n"
                                        "  0xB0C1    LTE transmit antennas, from 22 bytes\n"
                                        "    Serving Cell Info\n"
                                        "      Num Tx Antennas\n"));
  EXPECT_THAT(outcome.output,
              HasSubstr("  0xB179    LTE intra-frequency measurement, from 29 bytes\n"
                        "    Connected mode LTE Intra-frequency Measurement\n"));
}

TEST(Codes, ListsEveryTechnologyForPrograms) {
  const Outcome outcome = run({"kestro-cli", "codes", "--format=json"});
  EXPECT_EQ(outcome.status, 0);
  const auto json = nlohmann::json::parse(outcome.output);
  ASSERT_THAT(json, SizeIs(5));
  // How many codes each asks for, extra packets included.
  const std::vector<std::pair<std::string, std::size_t>> expected = {
      {"IFX", 0}, {"Ondrel_GSM", 28}, {"Ondrel_CDMA", 8}, {"LTE", 9}, {"UTRAN2", 8}};
  for (std::size_t i = 0; i < expected.size(); ++i) {
    EXPECT_EQ(json[i]["technology"], expected[i].first);
    EXPECT_THAT(json[i]["codes"], SizeIs(expected[i].second)) << expected[i].first;
  }
}

}  // namespace
}  // namespace kestro::testing
