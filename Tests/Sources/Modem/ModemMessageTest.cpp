// SPDX-License-Identifier: MIT
// What of a modem is shown, and how; what cannot be used is named and absent.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "Sources/Modem/ModemMessage.h"
#include "Sources/SourceCatalogue.h"
#include "Tests/Sources/Modem/VirtualModemManager.h"

namespace kestro {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

class ModemMessageTest : public testing::ModemTest {
 protected:
  /// The answer of GetCellInfo with one cell of a type, which serves or not, with these values.
  void addCell(unsigned type, bool isServing, BusValue::Entries values) {
    values.push_back(entry("cell-type", busUnsigned(type)));
    values.push_back(entry("serving", busFlag(isServing)));
    auto elements = std::get<BusValue::Elements>(cells.content);
    elements.push_back(map(std::move(values)));
    cells = busList("aa{sv}", std::move(elements));
  }
  BusValue& modem(const std::string& key) {
    return objects[path(0)][std::string(kModemInterface)][key];
  }
  BusValue& signal(const std::string& key) {
    return objects[path(0)][std::string(kSignalInterface)][key];
  }
  void SetUp() override { addModem(0, 8); }
};

// --- Cells ---------------------------------------------------------------------------------------

TEST_F(ModemMessageTest, AnLTECellInItsOwnNumbers) {
  addCell(5, true,
          {entry("operator-id", busText("21034")), entry("tac", busText("84CD")),
           entry("ci", busText("D30156")), entry("physical-ci", busText("1A0")),
           entry("earfcn", busUnsigned(1300)), entry("rsrp", busReal(-86)),
           entry("rsrq", busReal(-10.5)), entry("timing-advance", busUnsigned(7))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "Technology"), "LTE");
  EXPECT_EQ(shown("Serving Cell", "MCC"), "210");
  EXPECT_EQ(shown("Serving Cell", "MNC"), "34");
  EXPECT_EQ(shown("Serving Cell", "TAC"), "33997");
  EXPECT_EQ(shown("Serving Cell", "Cell ID"), "13828438");
  EXPECT_EQ(shown("Serving Cell", "Physical Cell ID"), "416");
  EXPECT_EQ(shown("Serving Cell", "EARFCN"), "1300");
  EXPECT_EQ(shown("Serving Cell", "Band"), "3");
  EXPECT_EQ(shown("Serving Cell", "Downlink Frequency"), "1815 MHz");
  EXPECT_EQ(shown("Serving Cell", "RSRP"), "-86 dBm");
  EXPECT_EQ(shown("Serving Cell", "RSRQ"), "-10.5 dB");
  EXPECT_EQ(shown("Serving Cell", "Timing Advance"), "7");
}

TEST_F(ModemMessageTest, AGSMCellInItsOwnNumbers) {
  addCell(2, true,
          {entry("operator-id", busText("310260")), entry("lac", busText("8BE3")),
           entry("ci", busText("2BAF")), entry("arfcn", busUnsigned(62)),
           entry("base-station-id", busText("2D")), entry("rx-level", busUnsigned(20)),
           entry("timing-advance", busUnsigned(3))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "MNC"), "260");
  EXPECT_EQ(shown("Serving Cell", "LAC"), "35811");
  EXPECT_EQ(shown("Serving Cell", "Cell ID"), "11183");
  EXPECT_EQ(shown("Serving Cell", "BSIC"), "5-5");
  EXPECT_EQ(shown("Serving Cell", "RxLev"), "-91 dBm");
  EXPECT_EQ(shown("Serving Cell", "Downlink Frequency"), "947.4 MHz");
}

TEST_F(ModemMessageTest, TheEndsOfGSMLevels) {
  addCell(2, false, {entry("rx-level", busUnsigned(0))});
  addCell(2, false, {entry("rx-level", busUnsigned(1))});
  addCell(2, false, {entry("rx-level", busUnsigned(63))});
  addCell(2, false, {entry("rx-level", busUnsigned(64))});
  watch();
  EXPECT_EQ(shownIn("Neighbour Cells", 0, "RxLev"), "< -110 dBm");
  EXPECT_EQ(shownIn("Neighbour Cells", 1, "RxLev"), "-110 dBm");
  EXPECT_EQ(shownIn("Neighbour Cells", 2, "RxLev"), "-48 dBm");
  EXPECT_EQ(shownIn("Neighbour Cells", 3, "RxLev"), "");
  EXPECT_THAT(lines, ElementsAre(HasSubstr("rx-level is left out: 64 makes no sense")));
}

TEST_F(ModemMessageTest, AUMTSCellInItsOwnNumbers) {
  addCell(3, true,
          {entry("uarfcn", busUnsigned(10700)), entry("psc", busUnsigned(511)),
           entry("rscp", busReal(-95)), entry("ecio", busReal(-6.5)),
           entry("path-loss", busUnsigned(120)), entry("frequency-fdd-dl", busUnsigned(10700)),
           entry("frequency-fdd-ul", busUnsigned(9750)), entry("lac", busText("FFFE")),
           entry("ci", busText("FFFFFFF"))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "UARFCN"), "10700");
  EXPECT_EQ(shown("Serving Cell", "Band"), "I");
  EXPECT_EQ(shown("Serving Cell", "Downlink Frequency"), "2140 MHz");
  EXPECT_EQ(shown("Serving Cell", "PSC"), "511");
  EXPECT_EQ(shown("Serving Cell", "RSCP"), "-95 dBm");
  EXPECT_EQ(shown("Serving Cell", "Ec/Io"), "-6.5 dB");
  EXPECT_EQ(shown("Serving Cell", "Path Loss"), "120 dB");
  EXPECT_EQ(shown("Serving Cell", "Frequency FDD DL"), "10700");
  EXPECT_EQ(shown("Serving Cell", "Frequency FDD UL"), "9750");
  EXPECT_EQ(shown("Serving Cell", "LAC"), "65534");
  EXPECT_EQ(shown("Serving Cell", "Cell ID"), "268435455");
}

TEST_F(ModemMessageTest, ATDSCDMACellInItsOwnNumbers) {
  addCell(4, true,
          {entry("uarfcn", busUnsigned(10054)), entry("cell-parameter-id", busUnsigned(127)),
           entry("rscp", busReal(-90)), entry("path-loss", busUnsigned(99)),
           entry("timing-advance", busUnsigned(2))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "Technology"), "UTRA TDD");
  EXPECT_EQ(shown("Serving Cell", "Cell Parameter ID"), "127");
  EXPECT_EQ(shown("Serving Cell", "Downlink Frequency"), "2010.8 MHz");
}

TEST_F(ModemMessageTest, A5GCellInItsOwnNumbers) {
  addCell(6, true,
          {entry("nrarfcn", busUnsigned(632'628)), entry("physical-ci", busText("3EF")),
           entry("rsrp", busReal(-101)), entry("rsrq", busReal(-11)), entry("sinr", busReal(3.5)),
           entry("ci", busText("FFFFFFFFF")), entry("tac", busText("FFFFFF"))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "Technology"), "5G");
  EXPECT_EQ(shown("Serving Cell", "Physical Cell ID"), "1007");
  EXPECT_EQ(shown("Serving Cell", "SS-RSRP"), "-101 dBm");
  EXPECT_EQ(shown("Serving Cell", "SS-SINR"), "3.5 dB");
  EXPECT_EQ(shown("Serving Cell", "Cell ID"), "68719476735");
  EXPECT_EQ(shown("Serving Cell", "TAC"), "16777215");
  EXPECT_EQ(shown("Serving Cell", "Downlink Frequency"), "3489.42 MHz");
}

TEST_F(ModemMessageTest, ACDMACellInItsOwnNumbers) {
  addCell(1, true,
          {entry("sid", busText("1004")), entry("nid", busText("2")),
           entry("base-station-id", busText("3F")), entry("ref-pn", busText("1FF")),
           entry("pilot-strength", busUnsigned(12))});
  watch();
  EXPECT_EQ(shown("Serving Cell", "SID"), "4100");
  EXPECT_EQ(shown("Serving Cell", "NID"), "2");
  EXPECT_EQ(shown("Serving Cell", "Base Station ID"), "63");
  EXPECT_EQ(shown("Serving Cell", "PN Offset"), "511");
  EXPECT_EQ(shown("Serving Cell", "Pilot Strength"), "12");
}

TEST_F(ModemMessageTest, OtherCellsAreNeighbours) {
  addCell(5, true, {entry("physical-ci", busText("1"))});
  addCell(5, false, {entry("physical-ci", busText("2"))});
  addCell(6, true, {entry("physical-ci", busText("3"))});
  addCell(99, false, {});
  watch();
  EXPECT_EQ(shown("Serving Cell", "Physical Cell ID"), "1");
  ASSERT_THAT(list("Neighbour Cells").elements(), SizeIs(2));
  EXPECT_EQ(shownIn("Neighbour Cells", 0, "Role"), "neighbour");
  EXPECT_EQ(shownIn("Neighbour Cells", 1, "Role"), "serving, too");
}

TEST_F(ModemMessageTest, TheLocationTellsTheServingCellWhereCellsAreNotReported) {
  refusals["GetCellInfo"] = "org.freedesktop.ModemManager1.Error.Core.Unsupported";
  location = busEntries("a{uv}", {{busUnsigned(1), busText("001,01,0,1003AB,259")}});
  watch();
  EXPECT_EQ(shown("Serving Cell", "MCC"), "001");
  EXPECT_EQ(shown("Serving Cell", "MNC"), "01");
  EXPECT_EQ(shown("Serving Cell", "TAC"), "601");
  EXPECT_EQ(shown("Serving Cell", "Cell ID"), "1049515");
  EXPECT_EQ(shown("Serving Cell", "LAC"), "") << "0 stands for unknown";
}

// --- Quality -------------------------------------------------------------------------------------

TEST_F(ModemMessageTest, MeasurementsOfEveryRadio) {
  signal("Lte") = map({entry("rsrp", busReal(-86)), entry("rsrq", busReal(-10)),
                       entry("snr", busReal(12.4)), entry("rssi", busReal(-60))});
  signal("Nr5g") =
      map({entry("rsrp", busReal(-99)), entry("rsrq", busReal(-11)), entry("snr", busReal(1.5))});
  signal("Umts") =
      map({entry("rscp", busReal(-95)), entry("ecio", busReal(-6)), entry("rssi", busReal(-70))});
  watch();
  EXPECT_EQ(shown("Radio Quality", "Technology"), "LTE");
  EXPECT_EQ(shown("Radio Quality", "RSRP"), "-86 dBm");
  EXPECT_EQ(shown("Radio Quality", "RSRQ"), "-10 dB");
  EXPECT_EQ(shown("Radio Quality", "SNR"), "12.4 dB");
  EXPECT_EQ(shown("Radio Quality", "RSSI"), "-60 dBm");
  EXPECT_EQ(shown("Radio Quality", "SS-RSRP"), "-99 dBm");
  EXPECT_EQ(shown("Radio Quality", "SS-SINR"), "1.5 dB");
  EXPECT_EQ(shown("Radio Quality", "RSCP"), "-95 dBm");
  EXPECT_EQ(shown("Radio Quality", "Ec/Io"), "-6 dB");
  EXPECT_EQ(shown("Radio Quality", "UMTS RSSI"), "-70 dBm");
}

TEST_F(ModemMessageTest, NumbersBeyondSenseAreAbsent) {
  signal("Lte") = map({entry("rsrp", busReal(std::numeric_limits<double>::quiet_NaN())),
                       entry("rsrq", busReal(1e300)), entry("snr", busReal(-1e300)),
                       entry("rssi", busReal(-60))});
  watch();
  EXPECT_EQ(shown("Radio Quality", "RSRP"), "");
  EXPECT_EQ(shown("Radio Quality", "RSRQ"), "");
  EXPECT_EQ(shown("Radio Quality", "SNR"), "");
  EXPECT_EQ(shown("Radio Quality", "RSSI"), "-60 dBm");
  EXPECT_THAT(lines, SizeIs(3));
}

// --- Identities ----------------------------------------------------------------------------------

TEST_F(ModemMessageTest, IdentitiesAreMaskedButForTheirLastFourDigits) {
  modem("Sim") = busPath("/sim");
  modem("Bearers") = busList("ao", {busPath("/org/freedesktop/ModemManager1/Bearer/4")});
  modem("OwnNumbers") = busList("as", {busText("+9990100000001")});
  parts["/sim"] = {{"Imsi", busText("001010123456789")},
                   {"SimIdentifier", busText("89990000000000000313")}};
  parts["/org/freedesktop/ModemManager1/Bearer/4"] = {
      {"Connected", busFlag(true)},
      {"Ip4Config", map({entry("address", busText("10.64.12.7"))})},
      {"Ip6Config", map({entry("address", busText("2001:db8::1:2f"))})},
      {"Properties", map({entry("apn", busText("internet"))})},
      {"Stats",
       map({entry("rx-bytes", busLong(5'000'000'000)), entry("duration", busUnsigned(61))})}};
  watch();
  EXPECT_EQ(shown("Mode", "Equipment Identifier"), "***********7518");
  EXPECT_EQ(shown("SIM", "IMSI"), "***********6789");
  EXPECT_EQ(shown("SIM", "ICCID"), "****************0313");
  EXPECT_EQ(shown("SIM", "Own Numbers"), "+*********0001");
  EXPECT_EQ(shownIn("Data Connections", 0, "IPv4 Address"), "**.*4.12.7");
  EXPECT_EQ(shownIn("Data Connections", 0, "IPv6 Address"), "****:**8::1:2f");
  EXPECT_EQ(shownIn("Data Connections", 0, "Bearer"), "4");
  EXPECT_EQ(shownIn("Data Connections", 0, "APN"), "internet");
  EXPECT_EQ(shownIn("Data Connections", 0, "Received"), "5000000000 bytes");
  EXPECT_EQ(shownIn("Data Connections", 0, "Duration"), "61 s");
}

TEST_F(ModemMessageTest, IdentitiesAreWholeForThoseWhoAsk) {
  modem("Sim") = busPath("/sim");
  parts["/sim"] = {{"Imsi", busText("001010123456789")}, {"Active", busFlag(true)}};
  open("", std::nullopt, true);
  watch();
  EXPECT_EQ(shown("Mode", "Equipment Identifier"), "490154203237518");
  EXPECT_EQ(shown("SIM", "IMSI"), "001010123456789");
}

TEST_F(ModemMessageTest, TheSourcesNameMasksAnIdentityToo) {
  const auto request = parseSource("modem:490154203237518", "");
  ASSERT_TRUE(request);
  EXPECT_EQ(stateOf(*request).name, "***********7518");
  auto personal = *request;
  personal.isPersonal = true;
  EXPECT_EQ(stateOf(personal).name, "490154203237518");
  EXPECT_EQ(stateOf(*parseSource("modem:12", "")).name, "12");
}

// --- What cannot be used -------------------------------------------------------------------------

TEST_F(ModemMessageTest, AWrongTypeIsNamedOnceAndAbsent) {
  modem("Manufacturer") = busUnsigned(7);
  signal("Lte") = map({entry("rsrp", busText("-86"))});
  addCell(5, true, {entry("physical-ci", busUnsigned(416)), entry("earfcn", busText("1300"))});
  watch();
  pass(Seconds(10));
  EXPECT_EQ(shown("Mode", "Modem"), "0: Model X");
  EXPECT_EQ(shown("Radio Quality", "RSRP"), "");
  EXPECT_EQ(shown("Serving Cell", "Physical Cell ID"), "");
  EXPECT_EQ(shown("Serving Cell", "EARFCN"), "");
  EXPECT_THAT(lines,
              ::testing::UnorderedElementsAre(
                  "ModemManager's Modem Manufacturer is left out: it has the type u, not s",
                  "ModemManager's Modem.Signal Lte rsrp is left out: it has the type s, not d",
                  "ModemManager's Modem GetCellInfo physical-ci is left out: it has the type u, "
                  "not s",
                  "ModemManager's Modem GetCellInfo earfcn is left out: it has the type s, not u"));
}

TEST_F(ModemMessageTest, CellsOfAWrongTypeAreNotNoCells) {
  cells = busList("as", {busText("cell")});
  watch();
  EXPECT_THAT(lines, ElementsAre(HasSubstr("GetCellInfo is left out: it has the type as, not "
                                           "aa{sv}")));
}

TEST_F(ModemMessageTest, NoTextIsNeverAnEmptyOne) {
  modem("Revision") = busText("");
  objects[path(0)][std::string(kModem3gppInterface)]["OperatorName"] = busText("");
  watch();
  EXPECT_FALSE(Value(messages.back()).dictionary().empty());
  EXPECT_EQ(shown("Mode", "Revision"), "");
  const auto mode = Value(messages.back()).dictionary().valueAt(1);
  EXPECT_FALSE(mode.dictionary().contains("Revision"));
}

TEST_F(ModemMessageTest, LongTextsAreCutAndControlCharactersReplaced) {
  modem("Model") = busText("a\x1b[2Jb\n" + std::string(10'000, 'x'));
  watch();
  EXPECT_THAT(shown("Mode", "Modem"), HasSubstr("a?[2Jb?xxx"));
  EXPECT_LT(shown("Mode", "Modem").size(), 300);
}

TEST_F(ModemMessageTest, ThousandsOfObjectsAreBounded) {
  for (int i = 1; i < 1'000; ++i) addModem(i, 3, "");
  watch();
  EXPECT_EQ(shown("Mode", "State"), "registered");
  EXPECT_THAT(lines, Contains(HasSubstr("number of objects is left out: more than 128")));
}

TEST_F(ModemMessageTest, SignalsOfWrongTypesChangeNothing) {
  watch();
  for (const std::string member : {"InterfacesAdded", "InterfacesRemoved", "PropertiesChanged"}) {
    platform.modemService().signal({path(0), "x", member, {}});
    platform.modemService().signal({path(0), "x", member, {busUnsigned(1), busUnsigned(2)}});
  }
  pass(Seconds(1));
  EXPECT_EQ(shown("Mode", "State"), "registered");
  EXPECT_THAT(lines, SizeIs(3));
}

TEST_F(ModemMessageTest, AStateThatMeansNothingIsShownAsItsNumber) {
  modem("State") = busInteger(77);
  watch();
  EXPECT_EQ(shown("Mode", "State"), "unknown (77)");
}

TEST_F(ModemMessageTest, ASectionOfOneValueKeepsTheValuesName) {
  objects[path(0)][std::string(kModem3gppInterface)] = {{"RegistrationState", busUnsigned(5)}};
  watch();
  EXPECT_EQ(shown("Registration", "State"), "roaming");
}

}  // namespace
}  // namespace kestro
