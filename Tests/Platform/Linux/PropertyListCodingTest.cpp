// SPDX-License-Identifier: MIT
// Well-formed property lists, read and written.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <memory>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/Linux/PropertyListDates.h"
#include "Platform/PropertyListCoding.h"
#include "Tests/Platform/Linux/PropertyListBytes.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

constexpr std::int64_t kInt64Minimum = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t kInt64Maximum = std::numeric_limits<std::int64_t>::max();
constexpr std::uint64_t kUint64Maximum = std::numeric_limits<std::uint64_t>::max();

/// 2012-03-04 13:05:09 UTC.
Moment sampleMoment() {
  using namespace std::chrono;
  return sys_days(2012y / March / 4) + 13h + 5min + 9s;
}

class PropertyListCodingTest : public ::testing::Test {
 protected:
  [[nodiscard]] Value parsed(const Bytes& bytes) const {
    const Result<Value> value = coding->parse(bytes);
    EXPECT_TRUE(value.has_value()) << (value ? "" : value.error().message);
    return value.value_or(Value());
  }
  [[nodiscard]] Value parsedXml(std::string_view elements) const {
    return parsed(xmlList(elements));
  }
  [[nodiscard]] Value parsedObject(const Bytes& object) const {
    return parsed(BinaryList{.objects = {object}}.bytes());
  }
  [[nodiscard]] std::string xml(const Value& value) const {
    const std::optional<Bytes> bytes = coding->xml(value);
    return bytes ? textOf(*bytes) : "(absent)";
  }
  void expectRoundTrips(const Value& value) const {
    const std::optional<Bytes> asXml = coding->xml(value);
    const std::optional<Bytes> asBinary = coding->binary(value);
    ASSERT_TRUE(asXml && asBinary);
    EXPECT_EQ(parsed(*asXml), value) << textOf(*asXml);
    EXPECT_EQ(parsed(*asBinary), value);
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

TEST_F(PropertyListCodingTest, XmlHasNoDoctypeLine) {
  EXPECT_EQ(xml(Dictionary{{"GetTechnology", "GetTechnology"}}),
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
            "<plist version=\"1.0\">\n"
            "<dict>\n"
            "\t<key>GetTechnology</key>\n"
            "\t<string>GetTechnology</string>\n"
            "</dict>\n"
            "</plist>\n");
}

TEST_F(PropertyListCodingTest, OnlyTheDoctypeLineIsTakenOut) {
  EXPECT_THAT(xml(Value("<!DOCTYPE plist>\nstays")),
              HasSubstr("<string>&lt;!DOCTYPE plist&gt;\nstays</string>"));
}

TEST_F(PropertyListCodingTest, BinaryOfASmallDictionaryHasTheKnownBytes) {
  const std::optional<Bytes> binary = coding->binary(Dictionary{{"k", Value::integer(5)}});
  ASSERT_TRUE(binary);
  EXPECT_EQ(*binary, bytesOf("bplist00"
                             "\xD1\x01\x02"  // a dictionary: object 1 is the key, 2 the value
                             "\x51k"
                             "\x10\x05"
                             "\x08\x0B\x0D"  // where they begin
                             "\0\0\0\0\0\0\x01\x01"
                             "\0\0\0\0\0\0\0\x03"
                             "\0\0\0\0\0\0\0\0"
                             "\0\0\0\0\0\0\0\x0F"));
}

TEST_F(PropertyListCodingTest, EntriesKeepTheOrderOfTheXml) {
  const Dictionary dictionary = parsedXml(
                                    "<dict><key>zebra</key><true/><key>ant</key><false/>"
                                    "<key>mole</key><true/></dict>")
                                    .dictionary();
  ASSERT_EQ(dictionary.size(), 3U);
  EXPECT_EQ(dictionary.keyAt(0), Value("zebra"));
  EXPECT_EQ(dictionary.keyAt(1), Value("ant"));
  EXPECT_EQ(dictionary.keyAt(2), Value("mole"));
}

TEST_F(PropertyListCodingTest, EntriesKeepTheOrderOfTheBinaryList) {
  const Dictionary dictionary =
      parsed(BinaryList{.objects = {bytesOf("\xD2\x02\x01\x03\x03"),
                                    bytesOf("\x53"
                                            "ant"),
                                    bytesOf("\x55zebra"), bytesOf("\x09")}}
                 .bytes())
          .dictionary();
  ASSERT_EQ(dictionary.size(), 2U);
  EXPECT_EQ(dictionary.keyAt(0), Value("zebra"));
  EXPECT_EQ(dictionary.keyAt(1), Value("ant"));
}

TEST_F(PropertyListCodingTest, OrderSurvivesManyEntries) {
  Dictionary dictionary;
  for (int i = 2000; i > 0; --i) dictionary.set("key " + std::to_string(i), Value::integer(i));
  expectRoundTrips(dictionary);
}

TEST_F(PropertyListCodingTest, OfEntriesWithOneKeyTheLastCounts) {
  const Value expected = Dictionary{{"k", Value::integer(2)}};
  EXPECT_EQ(parsedXml("<dict><key>k</key><integer>1</integer><key>k</key><integer>2</integer>"
                      "</dict>"),
            expected);
  EXPECT_EQ(parsed(BinaryList{.objects = {bytesOf("\xD2\x01\x01\x02\x03"), bytesOf("\x51k"),
                                          bytesOf("\x10\x01"), bytesOf("\x10\x02")}}
                       .bytes()),
            expected);
}

TEST_F(PropertyListCodingTest, RowsWithTheSameKeysAreDifferentDictionaries) {
  const Value list = parsedXml(
      "<array><dict><key>a</key><string>1</string><key>b</key><string>2</string></dict>"
      "<dict><key>a</key><string>3</string><key>b</key><string>4</string></dict>"
      "<dict><key>a</key><string>5</string></dict>"
      "<dict/>"
      "<dict><key>a</key><dict><key>a</key><string>6</string></dict></dict></array>");
  EXPECT_EQ(list, Value(Array{Dictionary{{"a", "1"}, {"b", "2"}},
                              Dictionary{{"a", "3"}, {"b", "4"}}, Dictionary{{"a", "5"}},
                              Dictionary(), Dictionary{{"a", Dictionary{{"a", "6"}}}}}));
  Dictionary first = list.array()[0].dictionary();
  first.set("c", "7");
  first.remove("a");
  EXPECT_EQ(list.array()[1], Value(Dictionary{{"a", "3"}, {"b", "4"}}));
}

TEST_F(PropertyListCodingTest, EveryKindSurvivesBothForms) {
  expectRoundTrips(Dictionary{
      {"text", "Cell DCH"},
      {"long text",
       "a text of more than fifteen bytes, with \xC3\xA9, \xE4\xB8\xAD, \xF0\x9F\x98\x80"},
      {"markup", "<a href=\"x\">&amp; 'quoted' ]]> </a>"},
      {"blanks", "  \t two\nlines \n"},
      {"empty text", ""},
      {"", "under the empty key"},
      {"<key> & more", "under a key with markup"},
      {"yes", Value::boolean(true)},
      {"no", Value::boolean(false)},
      {"data", Value::data({0x00, 0xFF, 0x10, 0x80})},
      {"no data", Value::data({})},
      {"date", Value::date(sampleMoment())},
      {"real", Value::real(-0.1)},
      {"empty", Array{}},
      {"nothing", Dictionary{}},
      {"rows", Array{Dictionary{{"Cell", Value::integer(-1)}}, Array{Array{}}, "x"}},
  });
}

TEST_F(PropertyListCodingTest, IntegersSurviveBothForms) {
  expectRoundTrips(Array{Value::integer(0), Value::integer(-1), Value::integer(255),
                         Value::integer(256), Value::integer(65535), Value::integer(65536),
                         Value::integer(4294967295), Value::integer(4294967296),
                         Value::integer(kInt64Maximum), Value::integer(kInt64Minimum)});
}

TEST_F(PropertyListCodingTest, IntegersAboveInt64SurviveBothForms) {
  expectRoundTrips(Array{Value::unsignedInteger(kUint64Maximum), Value::integer(-1),
                         Value::unsignedInteger(std::uint64_t{1} << 63),
                         Value::integer(kInt64Minimum)});
}

TEST_F(PropertyListCodingTest, RealsSurviveBothFormsToTheLastBit) {
  expectRoundTrips(Array{Value::real(0.1), Value::real(1.0 / 3), Value::real(1e300),
                         Value::real(5e-324), Value::real(-123456789.123456789), Value::real(2),
                         Value::real(std::numeric_limits<double>::infinity())});
}

TEST_F(PropertyListCodingTest, NotANumberSurvivesBothForms) {
  const Value value = Value::real(std::nan(""));
  EXPECT_TRUE(std::isnan(parsed(*coding->xml(value)).realNumber()));
  EXPECT_TRUE(std::isnan(parsed(*coding->binary(value)).realNumber()));
}

TEST_F(PropertyListCodingTest, DatesBeforeTheEpochSurviveBothForms) {
  using namespace std::chrono;
  expectRoundTrips(Value::date(sys_days(1969y / December / 31) + 23h + 59min + 58s));
}

TEST_F(PropertyListCodingTest, BinaryDatesKeepTheirFraction) {
  const Value value = Value::date(sampleMoment() + std::chrono::milliseconds(250));
  EXPECT_EQ(parsed(*coding->binary(value)), value);
  const Value early =
      Value::date(Moment(std::chrono::seconds(-5)) + std::chrono::milliseconds(750));
  EXPECT_EQ(parsed(*coding->binary(early)), early);
}

TEST_F(PropertyListCodingTest, ReadsXmlIntegers) {
  EXPECT_EQ(parsedXml("<array><integer>-70</integer><integer> +5 </integer>"
                      "<integer>0x1F</integer><integer>-0x10</integer></array>"),
            Value(Array{Value::integer(-70), Value::integer(5), Value::integer(31),
                        Value::integer(-16)}));
}

TEST_F(PropertyListCodingTest, ReadsBinaryIntegersOfEveryWidth) {
  EXPECT_EQ(parsedObject(bytesOf("\x10\xFF")), Value::integer(255));
  EXPECT_EQ(parsedObject(bytesOf("\x11\xFF\xFE")), Value::integer(65534));
  EXPECT_EQ(parsedObject(bytesOf("\x12\xFF\xFF\xFF\xFE")), Value::integer(4294967294));
  EXPECT_EQ(parsedObject(bytesOf("\x13\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xBA")), Value::integer(-70));
  EXPECT_EQ(parsedObject(bytesOf("\x14\0\0\0\0\0\0\0\0\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF")),
            Value::unsignedInteger(kUint64Maximum));
  EXPECT_EQ(parsedObject(bytesOf("\x14\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x07")), Value::integer(7));
}

TEST_F(PropertyListCodingTest, ReadsBinaryRealsOfBothWidths) {
  EXPECT_EQ(parsedObject(bytesOf("\x22\x3F\x80\0\0")), Value::real(1));
  EXPECT_EQ(parsedObject(bytesOf("\x23\xBF\xF8\0\0\0\0\0\0")), Value::real(-1.5));
}

TEST_F(PropertyListCodingTest, BinaryDatesStayAsTheyAreHoweverOftenTheyAreWritten) {
  // 352512000.74609375 s: three quarters of a microsecond are cut off.
  const Bytes fractional = bytesOf("\x33\x41\xB5\x02\xE8\x00\xBF\x00\x00");
  const Value date = parsedObject(fractional);
  EXPECT_EQ(date, Value::date(kPropertyListEpoch + std::chrono::seconds(352512000) +
                              std::chrono::microseconds(746090)));
  const auto written = coding->binary(date);
  ASSERT_TRUE(written);
  EXPECT_EQ(*coding->parse(*written), date);
}

TEST_F(PropertyListCodingTest, ReadsBinaryDates) {
  // 352,559,109 s after 2001-01-01: 4080 days and 13:05:09.
  EXPECT_EQ(parsedObject(bytesOf("\x33\x41\xB5\x03\xA0\x05\0\0\0")), Value::date(sampleMoment()));
}

TEST_F(PropertyListCodingTest, ReadsXmlDates) {
  EXPECT_EQ(parsedXml("<date>2012-03-04T13:05:09Z</date>"), Value::date(sampleMoment()));
}

TEST_F(PropertyListCodingTest, DatesOfTheYearsOneTo9999SurviveBothForms) {
  using namespace std::chrono;
  expectRoundTrips(Array{Value::date(sys_days(1y / January / 1)),
                         Value::date(sys_days(999y / December / 31) + 23h + 59min + 59s),
                         Value::date(sampleMoment()), "<date>1-2",
                         Value::date(sys_days(1932y / December / 13)),
                         Value::date(sys_days(2069y / January / 20)),
                         Value::date(sys_days(9999y / December / 31) + 23h + 59min + 59s)});
}

TEST_F(PropertyListCodingTest, ReadsDatesOfTheYearsOneTo9999) {
  using namespace std::chrono;
  const Value first = Value::date(sys_days(1y / January / 1));
  const Value last = Value::date(sys_days(9999y / December / 31) + 23h + 59min + 59s);
  EXPECT_EQ(parsedXml("<date>0001-01-01T00:00:00Z</date>"), first);
  EXPECT_EQ(parsedXml("<date>9999-12-31T23:59:59Z</date>"), last);
  // -63,113,904,000 s and 252,423,993,599 s after 2001-01-01
  EXPECT_EQ(parsedObject(bytesOf("\x33\xC2\x2D\x63\xC3\x7F\0\0\0")), first);
  EXPECT_EQ(parsedObject(bytesOf("\x33\x42\x4D\x62\xD2\x3C\x7F\x80\0")), last);
}

TEST_F(PropertyListCodingTest, LeadingZerosDoNotMakeAnIntegerOctal) {
  EXPECT_EQ(parsedXml("<array><integer>007</integer><integer>-0012</integer><integer>\n+010\t"
                      "</integer><integer>000</integer><integer>-0</integer><string>007</string>"
                      "<integer>0x0010</integer><integer>018446744073709551615</integer></array>"),
            Value(Array{Value::integer(7), Value::integer(-12), Value::integer(10),
                        Value::integer(0), Value::integer(0), "007", Value::integer(16),
                        Value::unsignedInteger(kUint64Maximum)}));
}

TEST_F(PropertyListCodingTest, ReadsXmlInUtf16) {
  const std::string list = "<plist><string>x</string></plist>";
  Bytes bigEndianOne = {0xFE, 0xFF};
  for (const char character : "<plist><string>" + std::string("\x01") + "</string></plist>") {
    bigEndianOne.push_back(character == '\x01' ? 0x4E : 0);  // U+4E2D
    bigEndianOne.push_back(static_cast<std::uint8_t>(character == '\x01' ? 0x2D : character));
  }
  EXPECT_EQ(parsed(utf16(list)), Value("x"));
  EXPECT_EQ(parsed(utf16("<?xml version='1.0' encoding='utf-16'?>" + list)), Value("x"));
  EXPECT_EQ(parsed(bigEndianOne), Value("\xE4\xB8\xAD"));
  // Without the mark the first character tells the order.
  EXPECT_EQ(parsed(Bytes(bigEndianOne.begin() + 2, bigEndianOne.end())), Value("\xE4\xB8\xAD"));
}

TEST_F(PropertyListCodingTest, ReadsXmlInIso8859_1) {
  EXPECT_EQ(parsed(bytesOf("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>\n"
                           "<plist><string>caf\xE9 \x80</string></plist>")),
            Value("caf\xC3\xA9 \xC2\x80"));
}

TEST_F(PropertyListCodingTest, ReadsABareValueBehindAnXmlDeclaration) {
  EXPECT_EQ(parsed(bytesOf("<?xml version=\"1.0\"?>\n<dict><key>a</key><string>b</string></dict>\n"
                           "<!-- end -->\n")),
            Value(Dictionary{{"a", "b"}}));
  EXPECT_EQ(parsed(bytesOf("<?xml version=\"1.0\"?><!-- c --><string/>")), Value(""));
}

TEST_F(PropertyListCodingTest, ReadsUtf16Texts) {
  EXPECT_EQ(parsedObject(bytesOf("\x64\x4E\x2D\0A\xD8\x3D\xDE\0")), Value("\xE4\xB8\xAD"
                                                                          "A\xF0\x9F\x98\x80"));
}

TEST_F(PropertyListCodingTest, ReadsCountsThatFollowTheirObject) {
  EXPECT_EQ(parsedObject(bytesOf("\x5F\x10\x03"
                                 "abc")),
            Value("abc"));
  EXPECT_EQ(parsedObject(bytesOf("\x5F\x13\0\0\0\0\0\0\0\x03"
                                 "abc")),
            Value("abc"));
}

TEST_F(PropertyListCodingTest, ReadsOffsetsAndReferencesOfUnusualWidths) {
  for (std::uint8_t width = 1; width <= 8; ++width) {
    Bytes array = {0xA1};
    BinaryList::append(array, bigEndian(1, width));
    const BinaryList list = {
        .objects = {array, bytesOf("\x51x")}, .offsetWidth = width, .referenceWidth = width};
    EXPECT_EQ(parsed(list.bytes()), Value(Array{"x"})) << int{width};
  }
}

TEST_F(PropertyListCodingTest, ReadsSharedObjects) {
  EXPECT_EQ(parsed(BinaryList{.objects = {bytesOf("\xA2\x01\x01"), bytesOf("\x51x")}}.bytes()),
            Value(Array{"x", "x"}));
}

TEST_F(PropertyListCodingTest, SharedContainersBecomeSeparateOnes) {
  const Value list =
      parsed(BinaryList{.objects = {bytesOf("\xA2\x01\x01"), bytesOf("\xA0")}}.bytes());
  EXPECT_FALSE(list.array()[0].array().isSame(list.array()[1].array()));
}

TEST_F(PropertyListCodingTest, ReadsEntitiesAndCdata) {
  EXPECT_EQ(parsedXml("<string>&lt;&gt;&amp;&apos;&quot;&#65;&#x1F600;</string>"),
            Value("<>&'\"A\xF0\x9F\x98\x80"));
  EXPECT_EQ(parsedXml("<string>a<![CDATA[<b>&c;]]>d</string>"), Value("a<b>&c;d"));
  EXPECT_EQ(parsedXml("<dict><key><![CDATA[<]]>&amp;</key><true/></dict>"),
            Value(Dictionary{{"<&", Value::boolean(true)}}));
}

TEST_F(PropertyListCodingTest, ReadsDataOverSeveralLines) {
  EXPECT_EQ(parsedXml("<data>\n\tAAEC\n\t/w==\n\t</data>"), Value::data({0, 1, 2, 0xFF}));
}

TEST_F(PropertyListCodingTest, ReadsADoctypeCommentsAndBlanks) {
  EXPECT_EQ(
      parsed(bytesOf("\xEF\xBB\xBF<?xml version='1.0' encoding='utf-8' ?>\r\n"
                     "<!-- one -->\n"
                     "<!DOCTYPE plist PUBLIC \"-//Example//DTD PLIST 1.0//EN\" \"list.dtd\">\n"
                     "<plist version=\"1.0\">\n"
                     "<!-- two - three --><array >\n<true /><!-- four -->\n</array >\n"
                     "</plist>\n<!-- five -->\n")),
      Value(Array{Value::boolean(true)}));
}

TEST_F(PropertyListCodingTest, WhatHoldsNullIsNotSerialised) {
  EXPECT_EQ(coding->xml(Value()), std::nullopt);
  EXPECT_EQ(coding->binary(Value()), std::nullopt);
  EXPECT_EQ(coding->xml(Array{"x", Value()}), std::nullopt);
  EXPECT_EQ(coding->binary(Dictionary{{"x", Value()}}), std::nullopt);
}

TEST_F(PropertyListCodingTest, ADictionaryKeyThatIsNoTextIsNotSerialised) {
  const Value value = Array{Dictionary{{Value::integer(1), "x"}}};
  EXPECT_EQ(coding->xml(value), std::nullopt);
  EXPECT_EQ(coding->binary(value), std::nullopt);
}

TEST_F(PropertyListCodingTest, TextsThatAreNoUtf8OrHoldANulAreNotSerialised) {
  EXPECT_EQ(coding->xml(Value("\xFF")), std::nullopt);
  EXPECT_EQ(coding->binary(Dictionary{{"\xC3", "x"}}), std::nullopt);
  EXPECT_EQ(coding->xml(Value(std::string_view("a\0b", 3))), std::nullopt);
}

TEST_F(PropertyListCodingTest, DatesOutsideTheYearsOneTo9999AreNotSerialised) {
  using namespace std::chrono;
  EXPECT_EQ(coding->xml(Value::date(sys_days(10'000y / January / 1))), std::nullopt);
  EXPECT_EQ(coding->binary(Value::date(sys_days(0y / December / 31))), std::nullopt);
}

TEST_F(PropertyListCodingTest, AContainerThatHoldsItselfIsNotSerialised) {
  Array array;
  array.append(array);
  EXPECT_EQ(coding->xml(array), std::nullopt);
  array.clear();
}

TEST_F(PropertyListCodingTest, WhatIsWrittenAtTheDeepestLevelIsReadAgain) {
  Value value = Array{"innermost"};
  for (int levels = 1; levels < 128; ++levels) value = Array{value};
  expectRoundTrips(value);
  EXPECT_EQ(coding->xml(Array{value}), std::nullopt);
}

}  // namespace
}  // namespace kestro
