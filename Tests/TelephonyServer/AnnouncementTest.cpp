// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "TelephonyServer/Announcement.h"

namespace kestro {
namespace {

TEST(AnnouncementTest, SaysWhatIsPlayedAndHowToWatchIt) {
  EXPECT_EQ(announcement({.kind = "simulation", .isSimulated = true}, "LTE", "TelephonyServer"),
            "playing simulation as LTE, under the name TelephonyServer; watch it with `kestro` or "
            "`kestro-cli watch`");
}

TEST(AnnouncementTest, AnotherNameIsSaidToTheDisplays) {
  EXPECT_EQ(announcement({.kind = "capture", .name = "/a/b.pcap"}, "IFX", "Other"),
            "playing capture b.pcap as IFX, under the name Other; watch it with `kestro "
            "--server=Other` or `kestro-cli watch --server=Other`");
}

}  // namespace
}  // namespace kestro
