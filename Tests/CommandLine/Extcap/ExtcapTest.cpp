// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "CommandLine/Extcap/Extcap.h"
#include "CommandLine/Extcap/ExtcapInterfaces.h"
#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {
namespace {

using ::testing::Contains;
using ::testing::Field;
using ::testing::HasSubstr;
using ::testing::StartsWith;

TEST(ExtcapTest, NamesItsInterfaces) {
  EXPECT_EQ(interfacesAnswer("1.2"),
            "extcap {version=1.2}{display=Kestro}\n"
            "interface {value=kestro-channel}{display=Kestro log channel}\n"
            "interface {value=kestro-simulation}{display=Kestro simulation}\n");
  EXPECT_TRUE(isExtcapInterface("kestro-simulation"));
  EXPECT_FALSE(isExtcapInterface("eth0"));
}

TEST(ExtcapTest, NamesTheLinkTypes) {
  EXPECT_EQ(linkTypesAnswer(),
            "dlt {number=147}{name=IFX}{display=Kestro IFX}\n"
            "dlt {number=148}{name=Ondrel_GSM}{display=Kestro Ondrel_GSM}\n"
            "dlt {number=149}{name=Ondrel_CDMA}{display=Kestro Ondrel_CDMA}\n"
            "dlt {number=150}{name=LTE}{display=Kestro LTE}\n"
            "dlt {number=151}{name=UTRAN2}{display=Kestro UTRAN2}\n");
}

TEST(ExtcapTest, TellsAnInterfacesOptions) {
  EXPECT_EQ(optionsAnswer(kChannelInterface),
            "arg {number=0}{call=--server-name}{display=Server name}"
            "{tooltip=The telephony server's port}{type=string}{default=TelephonyServer}\n");
  const std::string simulation = optionsAnswer(kSimulationInterface);
  EXPECT_THAT(simulation, StartsWith("arg {number=0}{call=--source}{display=Source}"));
  EXPECT_THAT(simulation, HasSubstr("\narg {number=1}{call=--technology}{display=Technology}"
                                    "{tooltip=Of the source simulation}{type=selector}\n"));
  EXPECT_THAT(simulation, HasSubstr("\nvalue {arg=1}{value=LTE}{display=LTE}{default=true}\n"));
  EXPECT_THAT(simulation, HasSubstr("\nvalue {arg=1}{value=IFX}{display=IFX}{default=false}\n"));
}

TEST(ExtcapTest, HasARowForEveryOptionItTells) {
  const auto bundle = createBundle();
  const CommandRow program = extcapProgram(*bundle);
  for (const char* name : {"--server-name", "--source", "--technology"}) {
    EXPECT_THAT(program.options, Contains(Field(&OptionRow::name, name)));
  }
}

}  // namespace
}  // namespace kestro
