// SPDX-License-Identifier: MIT
// Property lists that nobody should have sent: each is refused with a reason, at once.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Tests/Platform/Linux/PropertyListBytes.h"

namespace kestro {
namespace {

using ::testing::HasSubstr;

constexpr std::size_t kMebibyte = std::size_t{1024} * 1024;

class HostilePropertyListTest : public ::testing::Test {
 protected:
  /// Why the list is refused; "(accepted)" when it is not.
  [[nodiscard]] std::string refusal(
      const Bytes& bytes, const PropertyListLimits& limits = PropertyListLimits::message()) const {
    const Result<Value> value = coding->parse(bytes, limits);
    return value ? "(accepted)" : value.error().message;
  }
  [[nodiscard]] std::string xmlRefusal(std::string_view elements) const {
    return refusal(xmlList(elements));
  }
  [[nodiscard]] std::string objectRefusal(const Bytes& object) const {
    return refusal(BinaryList{.objects = {object}}.bytes());
  }
  void expectEveryPrefixRefused(const Bytes& whole, std::size_t shortestAccepted) const {
    for (std::size_t length = 0; length < shortestAccepted; ++length) {
      const Bytes prefix(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length));
      EXPECT_NE(refusal(prefix), "(accepted)") << length;
    }
    EXPECT_EQ(refusal(whole), "(accepted)");
  }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

/// A sample with every kind of object.
Bytes binarySample() {
  return BinaryList{.objects = {bytesOf("\xD2\x01\x02\x03\x04"),
                                bytesOf("\x54"
                                        "Rows"),
                                bytesOf("\x62\x4E\x2D\0A"), bytesOf("\xA5\x05\x06\x07\x08\x09"),
                                bytesOf("\x5F\x10\x10sixteen letters."),
                                bytesOf("\x13\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xBA"),
                                bytesOf("\x23\xBF\xF8\0\0\0\0\0\0"),
                                bytesOf("\x33\x41\xB5\x03\xA0\x05\0\0\0"),
                                bytesOf("\x43\x01\x02\x03"), bytesOf("\x09")}}
      .bytes();
}

// --- Both forms

TEST_F(HostilePropertyListTest, NothingAndGarbageAreRefused) {
  EXPECT_THAT(refusal({}), HasSubstr("<plist>"));
  EXPECT_THAT(refusal(bytesOf("garbage")), HasSubstr("<plist>"));
  EXPECT_THAT(refusal(bytesOf("\x01\x02\x03\xFE")), HasSubstr("UTF-8"));
  EXPECT_THAT(refusal(bytesOf("bplist00")), HasSubstr("too short"));
  EXPECT_THAT(refusal(Bytes(4096, 0)), HasSubstr("NUL"));
}

TEST_F(HostilePropertyListTest, ABinaryListCutAnywhereIsRefused) {
  const Bytes sample = binarySample();
  expectEveryPrefixRefused(sample, sample.size());
}

TEST_F(HostilePropertyListTest, AnXmlListCutAnywhereIsRefused) {
  const Bytes sample = xmlList(
      "<dict><key>a &amp; b</key><array><integer>-70</integer><real>1.5</real><true/>"
      "<date>2012-03-04T13:05:09Z</date><data>AAEC</data><!-- c --></array>"
      "<key>d</key><string>x<![CDATA[<y>]]></string></dict>");
  expectEveryPrefixRefused(sample, sample.size() - 1);  // the last newline may be missing
}

TEST_F(HostilePropertyListTest, ABinaryListWithAnyByteChangedNeverCrashes) {
  const Bytes sample = binarySample();
  std::size_t accepted = 0;
  for (std::size_t at = 0; at < sample.size(); ++at) {
    for (const unsigned mask : {0x01U, 0x80U, 0xFFU, 0x0FU, 0xF0U}) {
      Bytes changed = sample;
      changed[at] = static_cast<std::uint8_t>(changed[at] ^ mask);
      accepted += coding->parse(changed).has_value() ? 1U : 0U;
    }
  }
  EXPECT_GT(accepted, 0U);                     // such as another letter in a text
  EXPECT_LT(accepted, 5 * sample.size() / 2);  // most of the list is structure
}

TEST_F(HostilePropertyListTest, SeventeenMebibytesAreRefused) {
  const std::string text(17 * kMebibyte, 'x');
  EXPECT_THAT(xmlRefusal("<string>" + text + "</string>"), HasSubstr("16777216 at most"));
}

TEST_F(HostilePropertyListTest, ASnapshotFileMayBeLongerThanAMessage) {
  const std::string text(17 * kMebibyte, 'x');
  EXPECT_EQ(refusal(xmlList("<string>" + text + "</string>"), PropertyListLimits::snapshotFile()),
            "(accepted)");
}

// --- Levels and nodes

std::string nestedXml(std::size_t levels) {
  return repeated("<array>", levels) + repeated("</array>", levels);
}

BinaryList nestedBinary(std::size_t levels) {
  BinaryList list = {.offsetWidth = 4, .referenceWidth = 2};
  for (std::size_t i = 1; i < levels; ++i) {
    Bytes array = {0xA1};
    BinaryList::append(array, bigEndian(i, 2));
    list.objects.push_back(array);
  }
  list.objects.push_back({0xA0});
  return list;
}

TEST_F(HostilePropertyListTest, A129thLevelIsRefused) {
  EXPECT_EQ(xmlRefusal(nestedXml(128)), "(accepted)");
  EXPECT_THAT(xmlRefusal(nestedXml(129)), HasSubstr("nested too deeply"));
  EXPECT_EQ(refusal(nestedBinary(128).bytes()), "(accepted)");
  EXPECT_THAT(refusal(nestedBinary(129).bytes()), HasSubstr("nested too deeply"));
}

TEST_F(HostilePropertyListTest, TenThousandLevelsAreRefused) {
  EXPECT_THAT(xmlRefusal(nestedXml(10'000)), HasSubstr("nested too deeply"));
  EXPECT_THAT(refusal(nestedBinary(10'000).bytes()), HasSubstr("nested too deeply"));
}

TEST_F(HostilePropertyListTest, OpenTagsWithoutEndAreRefused) {
  EXPECT_THAT(xmlRefusal(repeated("<dict><key>k</key>", 10'000)), HasSubstr("nested too deeply"));
}

TEST_F(HostilePropertyListTest, TheNode200001IsRefusedInXml) {
  // The array itself is a node.
  EXPECT_EQ(xmlRefusal("<array>" + repeated("<true/>", 199'999) + "</array>"), "(accepted)");
  EXPECT_THAT(xmlRefusal("<array>" + repeated("<true/>", 200'000) + "</array>"),
              HasSubstr("too many nodes"));
}

TEST_F(HostilePropertyListTest, ASnapshotFileMayHoldTenMessages) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "two million nodes take minutes under the sanitizers";
#endif
  const auto limits = PropertyListLimits::snapshotFile();
  const auto list = [](std::size_t booleans) {
    return xmlList("<array>" + repeated("<true/>", booleans) + "</array>");
  };
  EXPECT_EQ(refusal(list(2'099'999), limits), "(accepted)");
  EXPECT_THAT(refusal(list(2'100'000), limits), HasSubstr("too many nodes"));
}

TEST_F(HostilePropertyListTest, XmlKeysAreNodesToo) {
  const std::string row = "<dict>" + repeated("<key>k</key><true/>", 4) + "</dict>";  // 9 nodes
  EXPECT_EQ(xmlRefusal("<array>" + repeated(row, 22'222) + "</array>"), "(accepted)");
  EXPECT_THAT(xmlRefusal("<array>" + repeated(row, 22'223) + "</array>"),
              HasSubstr("too many nodes"));
}

/// An array that refers to one object `count` times.
BinaryList repeatedReference(std::size_t count, const Bytes& object) {
  Bytes array = {0xAF, 0x12};
  BinaryList::append(array, bigEndian(count, 4));
  array.resize(array.size() + count, 0x01);
  return {.objects = {array, object}, .offsetWidth = 4};
}

TEST_F(HostilePropertyListTest, TheNode200001IsRefusedInABinaryList) {
  EXPECT_EQ(refusal(repeatedReference(199'999, {0x09}).bytes()), "(accepted)");
  EXPECT_THAT(refusal(repeatedReference(200'000, {0x09}).bytes()), HasSubstr("too many nodes"));
}

TEST_F(HostilePropertyListTest, ASmallListThatUnfoldsToAGigabyteIsRefused) {
  // Nine arrays, each of ten references to the next; the last refers to a text of four bytes.
  BinaryList list = {.offsetWidth = 1};
  for (std::uint8_t i = 1; i <= 9; ++i) {
    Bytes array(11, i);
    array[0] = 0xAA;
    list.objects.push_back(array);
  }
  list.objects.push_back(bytesOf("\x54xxxx"));
  ASSERT_EQ(list.bytes().size(), 154U);
  EXPECT_THAT(refusal(list.bytes()), HasSubstr("too many nodes"));
}

TEST_F(HostilePropertyListTest, AnArrayOfOneLongTextThatUnfoldsToAGigabyteIsRefused) {
  Bytes text = {0x5F, 0x12};
  BinaryList::append(text, bigEndian(kMebibyte, 4));
  text.resize(text.size() + kMebibyte, 'x');
  EXPECT_EQ(refusal(repeatedReference(16, text).bytes()), "(accepted)");
  EXPECT_THAT(refusal(repeatedReference(1024, text).bytes()), HasSubstr("unfold"));
}

TEST_F(HostilePropertyListTest, AContainerThatHoldsItselfIsRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\xA1\0")), HasSubstr("nested too deeply"));
  EXPECT_THAT(objectRefusal(bytesOf("\xA2\0\0")), HasSubstr("nested too deeply"));
  EXPECT_THAT(
      refusal(BinaryList{.objects = {bytesOf("\xA1\x01"), bytesOf("\xD1\x02\0"), bytesOf("\x51k")}}
                  .bytes()),
      HasSubstr("nested too deeply"));
}

// --- Binary structure

TEST_F(HostilePropertyListTest, ABinaryListOfAnotherVersionIsRefused) {
  Bytes list = BinaryList{.objects = {bytesOf("\x09")}}.bytes();
  list[7] = '1';
  EXPECT_NE(refusal(list), "(accepted)");
}

/// A list of one boolean with some bytes of its trailer replaced.
Bytes withTrailer(std::size_t at, const Bytes& replacement) {
  Bytes list = BinaryList{.objects = {bytesOf("\x09")}}.bytes();
  std::ranges::copy(replacement, list.end() - 32 + static_cast<std::ptrdiff_t>(at));
  return list;
}

TEST_F(HostilePropertyListTest, BadTrailersAreRefused) {
  EXPECT_THAT(refusal(withTrailer(6, {0})), HasSubstr("widths"));
  EXPECT_THAT(refusal(withTrailer(6, {9})), HasSubstr("widths"));
  EXPECT_THAT(refusal(withTrailer(7, {0})), HasSubstr("widths"));
  EXPECT_THAT(refusal(withTrailer(8, bigEndian(0, 8))), HasSubstr("no object"));
  EXPECT_THAT(refusal(withTrailer(8, bigEndian(UINT64_MAX, 8))), HasSubstr("more objects"));
  EXPECT_THAT(refusal(withTrailer(8, bigEndian(UINT64_MAX / 2 + 2, 8))), HasSubstr("more objects"));
  EXPECT_THAT(refusal(withTrailer(16, bigEndian(1, 8))), HasSubstr("no object"));
  EXPECT_THAT(refusal(withTrailer(24, bigEndian(UINT64_MAX, 8))), HasSubstr("offset table"));
  EXPECT_THAT(refusal(withTrailer(24, bigEndian(7, 8))), HasSubstr("offset table"));
}

TEST_F(HostilePropertyListTest, ObjectsOutsideTheListAreRefused) {
  Bytes list = BinaryList{.objects = {bytesOf("\x09")}}.bytes();
  const std::size_t offset = 9;  // after the header and the one object
  list[offset + 1] = 0xFF;
  EXPECT_THAT(refusal(list), HasSubstr("outside the list"));
  list[offset + 1] = 0x07;  // inside the header
  EXPECT_THAT(refusal(list), HasSubstr("outside the list"));
  list[offset + 1] = 0x09;  // inside the offset table
  EXPECT_THAT(refusal(list), HasSubstr("outside the list"));
}

TEST_F(HostilePropertyListTest, ReferencesToNoObjectAreRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\xA1\x01")), HasSubstr("no object"));
  EXPECT_THAT(objectRefusal(bytesOf("\xD1\x05\x06")), HasSubstr("no object"));
}

TEST_F(HostilePropertyListTest, CountsBeyondTheListAreRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\x5F\x13\x7F\xFF\xFF\xFF\xFF\xFF\xFF\xFF")),
              HasSubstr("cut off"));
  EXPECT_THAT(objectRefusal(bytesOf("\x6F\x13\x80\0\0\0\0\0\0\x01")), HasSubstr("cut off"));
  EXPECT_THAT(objectRefusal(bytesOf("\xAF\x13\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF")),
              HasSubstr("cut off"));
  EXPECT_THAT(objectRefusal(bytesOf("\xDF\x13\x80\0\0\0\0\0\0\0")), HasSubstr("cut off"));
  EXPECT_THAT(objectRefusal(bytesOf("\x4F\x12\0\x01\0\0")), HasSubstr("cut off"));
  EXPECT_THAT(objectRefusal(bytesOf("\x13\0")), HasSubstr("cut off"));
}

TEST_F(HostilePropertyListTest, CountsThatAreNoIntegersAreRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\x5F\x51\x03"
                                    "abc")),
              HasSubstr("count"));
  EXPECT_THAT(objectRefusal(bytesOf("\x5F\x14\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x03"
                                    "abc")),
              HasSubstr("count"));
  EXPECT_THAT(objectRefusal(bytesOf("\x5F")), HasSubstr("cut off"));
}

TEST_F(HostilePropertyListTest, KeysThatAreNoTextsAreRefused) {
  for (const Bytes& key : {bytesOf("\x10\x01"), bytesOf("\x09"), bytesOf("\xA0"), bytesOf("\x41k"),
                           bytesOf("\x23\0\0\0\0\0\0\0\0")}) {
    const BinaryList list = {.objects = {bytesOf("\xD1\x01\x02"), key, bytesOf("\x09")}};
    EXPECT_THAT(refusal(list.bytes()), HasSubstr("no text"));
  }
}

TEST_F(HostilePropertyListTest, OtherKindsOfObjectsAreRefused) {
  for (const Bytes& object :
       {bytesOf("\x00"), bytesOf("\x0F"), bytesOf("\x80\x01"), bytesOf("\xB0"), bytesOf("\xC0"),
        bytesOf("\xE0"), bytesOf("\xF0"), bytesOf("\x71x"), bytesOf("\x90"), bytesOf("\x15"),
        bytesOf("\x21\0\0"), bytesOf("\x32\0\0\0\0")}) {
    EXPECT_THAT(objectRefusal(object), HasSubstr("kind")) << int{object[0]};
  }
}

TEST_F(HostilePropertyListTest, BinaryTextsThatAreNoneAreRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\x52"
                                    "a\xFF")),
              HasSubstr("ASCII"));
  EXPECT_THAT(objectRefusal(bytesOf("\x53"
                                    "a\0b")),
              HasSubstr("ASCII"));
  EXPECT_THAT(objectRefusal(bytesOf("\x61\xD8\x3D")), HasSubstr("UTF-16"));
  EXPECT_THAT(objectRefusal(bytesOf("\x62\xD8\x3D\0A")), HasSubstr("UTF-16"));
  EXPECT_THAT(objectRefusal(bytesOf("\x61\xDE\x00")), HasSubstr("UTF-16"));
  EXPECT_THAT(objectRefusal(bytesOf("\x62\0A\0\0")), HasSubstr("UTF-16"));
}

TEST_F(HostilePropertyListTest, BinaryNumbersAndDatesOutOfRangeAreRefused) {
  EXPECT_THAT(objectRefusal(bytesOf("\x14\0\0\0\0\0\0\0\x01\0\0\0\0\0\0\0\0")),
              HasSubstr("64 bits"));
  EXPECT_THAT(objectRefusal(bytesOf("\x33\x7F\xF8\0\0\0\0\0\0")), HasSubstr("date"));  // NaN
  // The first second of the year 10000, and the last before the year 1.
  EXPECT_THAT(objectRefusal(bytesOf("\x33\x42\x4D\x62\xD2\x3C\x80\0\0")), HasSubstr("date"));
  EXPECT_THAT(objectRefusal(bytesOf("\x33\xC2\x2D\x63\xC3\x7F\x02\0\0")), HasSubstr("date"));
}

// --- XML structure

TEST_F(HostilePropertyListTest, DoctypesWithAnInternalSubsetAreRefused) {
  const Bytes bomb = bytesOf(
      "<?xml version=\"1.0\"?>\n<!DOCTYPE plist [<!ENTITY a \"ha\"><!ENTITY b \"&a;&a;&a;\">]>\n"
      "<plist version=\"1.0\"><string>&b;</string></plist>");
  EXPECT_THAT(refusal(bomb), HasSubstr("DOCTYPE"));
}

TEST_F(HostilePropertyListTest, DoctypesWhoseEndIsInDoubtAreRefused) {
  EXPECT_THAT(refusal(bytesOf("<!DOCTYPE plist SYSTEM \"a>b\"><plist><true/></plist>")),
              HasSubstr("DOCTYPE"));
}

TEST_F(HostilePropertyListTest, EntitiesOfOnesOwnAreRefused) {
  for (const char* entity : {"&ha;", "&", "&;", "&amp", "&#0;", "&#x0;", "&#xD800;", "&#x110000;",
                             "&#;", "&#x;", "&#-1;", "&#99999999999;", "&AMP;"}) {
    EXPECT_THAT(xmlRefusal("<string>" + std::string(entity) + "</string>"), HasSubstr("entity"))
        << entity;
  }
}

TEST_F(HostilePropertyListTest, ProcessingInstructionsAreRefused) {
  EXPECT_NE(refusal(bytesOf("<?php x ?><plist><true/></plist>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<?xml-style x ?><plist><true/></plist>")), "(accepted)");
  EXPECT_NE(xmlRefusal("<array><?x y?></array>"), "(accepted)");
}

TEST_F(HostilePropertyListTest, OtherEncodingsAreRefused) {
  EXPECT_THAT(refusal(bytesOf("<?xml version=\"1.0\" encoding=\"UTF-16\"?><plist><true/></plist>")),
              HasSubstr("encoding"));
  EXPECT_THAT(refusal(bytesOf("<?xml version=\"1.0\" encoding?><plist><true/></plist>")),
              HasSubstr("encoding"));
}

TEST_F(HostilePropertyListTest, TextsThatAreNotInTheirEncodingAreRefused) {
  EXPECT_THAT(refusal(bytesOf("\xFF\xFE<\0p")), HasSubstr("UTF-16"));  // half a character
  EXPECT_THAT(refusal(bytesOf("\xFE\xFF\0<\xD8\x3D\0A")), HasSubstr("UTF-16"));
  EXPECT_THAT(refusal(utf16("<?xml version=\"1.0\" encoding=\"UTF-8\"?><plist><true/></plist>")),
              HasSubstr("encoding"));
  EXPECT_THAT(refusal(bytesOf("\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>"
                              "<plist><true/></plist>")),
              HasSubstr("encoding"));
}

TEST_F(HostilePropertyListTest, TheLimitOfBytesHoldsInUtf8Too) {
  const std::string head = "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><plist><string>";
  const std::string tail = "</string></plist>";
  // Each of these characters is two bytes of UTF-8.
  EXPECT_EQ(refusal(bytesOf(head + std::string(7 * kMebibyte, '\xE9') + tail)), "(accepted)");
  EXPECT_THAT(refusal(bytesOf(head + std::string(9 * kMebibyte, '\xE9') + tail)),
              HasSubstr("16777216 at most"));
}

TEST_F(HostilePropertyListTest, ABareValueStandsAloneBehindItsDeclaration) {
  EXPECT_NE(refusal(bytesOf("<?xml version=\"1.0\"?><true/><true/>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<?xml version=\"1.0\"?><true/></plist>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<?xml version=\"1.0\"?>text")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<?xml version=\"1.0\"?>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<!-- c --><true/>")), "(accepted)");
}

TEST_F(HostilePropertyListTest, XmlThatIsNoUtf8OrHoldsANulIsRefused) {
  EXPECT_THAT(xmlRefusal("<string>\xFF</string>"), HasSubstr("UTF-8"));
  EXPECT_THAT(xmlRefusal(std::string_view("<string>a\0b</string>", 20)), HasSubstr("NUL"));
  EXPECT_THAT(xmlRefusal("<string>\xED\xA0\x80</string>"), HasSubstr("UTF-8"));
}

TEST_F(HostilePropertyListTest, MalformedXmlIsRefused) {
  for (const char* elements : {"",
                               "text",
                               "<array>",
                               "</array>",
                               "<array></dict>",
                               "<array><true></array>",
                               "<true>x</true>",
                               "<true/><true/>",
                               "<array>text</array>",
                               "<array/>text",
                               "<string>a",
                               "<string>a</key>",
                               "<string>a<b/></string>",
                               "<string>a<!-- c --></string>",
                               "<uid/>",
                               "<Array/>",
                               "<>",
                               "< true/>",
                               "<true",
                               "<true/",
                               "<array x=\"y\"/>",
                               "</true/>",
                               "<!-- a -- b --><true/>",
                               "<!--><true/>",
                               "<!--->--><true/>",
                               "<![CDATA[x]]>",
                               "<plist><true/></plist>",
                               "<key>k</key>",
                               "<array><key>k</key></array>"}) {
    EXPECT_NE(xmlRefusal(elements), "(accepted)") << elements;
  }
}

TEST_F(HostilePropertyListTest, ListsWithoutOrAfterThePlistElementAreRefused) {
  EXPECT_NE(refusal(bytesOf("<true/>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<plists><true/></plists>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<plist/>")), "(accepted)");
  EXPECT_NE(refusal(bytesOf("<plist><true/></plist><plist><true/></plist>")), "(accepted)");
}

TEST_F(HostilePropertyListTest, XmlDictionariesMustAlternateTextKeysAndValues) {
  for (const char* elements :
       {"<dict><key>a</key></dict>", "<dict><key>a</key><key>b</key></dict>",
        "<dict><true/></dict>", "<dict><integer>1</integer><true/></dict>",
        "<dict><key>a</key><true/><true/></dict>", "<dict><string>a</string><true/></dict>"}) {
    EXPECT_NE(xmlRefusal(elements), "(accepted)") << elements;
  }
}

TEST_F(HostilePropertyListTest, XmlNumbersThatAreNoneAreRefused) {
  for (const char* content :
       {"", " ", "x", "5x", "- 5", "--5", "1.5", "0x", "0xG", "18446744073709551616",
        "-9223372036854775809", "5 6", "00x5", "1_000", "0018446744073709551616", "\xD9\xA3"}) {
    EXPECT_THAT(xmlRefusal("<integer>" + std::string(content) + "</integer>"), HasSubstr("integer"))
        << content;
  }
  for (const char* content : {"", "x", "1,5", "1.5.2", "+-1", "1e", "1e999", "nan(x)"}) {
    EXPECT_THAT(xmlRefusal("<real>" + std::string(content) + "</real>"), HasSubstr("real"))
        << content;
  }
}

TEST_F(HostilePropertyListTest, XmlDatesThatAreNoneAreRefused) {
  for (const char* content :
       {"", "2012-03-04", "2012-3-4T13:05:09Z", "2012-13-04T13:05:09Z", "2012-02-30T13:05:09Z",
        "2012-03-04T24:05:09Z", "2012-03-04T13:60:09Z", "2012-03-04T13:05:60Z",
        "2012-03-04T13:05:09", "2012-03-04T13:05:09+0100", "999999999-03-04T13:05:09Z",
        "0000-12-31T23:59:59Z", "10000-01-01T00:00:00Z", "1-01-01T00:00:00Z"}) {
    EXPECT_THAT(xmlRefusal("<date>" + std::string(content) + "</date>"), HasSubstr("date"))
        << content;
  }
}

TEST_F(HostilePropertyListTest, XmlDataThatIsNoBase64IsRefused) {
  for (const char* content : {"A", "AB", "ABC", "A===", "AB=C", "AB==AB==", "A*BC", "&amp;"}) {
    EXPECT_THAT(xmlRefusal("<data>" + std::string(content) + "</data>"), HasSubstr("base64"))
        << content;
  }
}

// --- What would take the library too long

TEST_F(HostilePropertyListTest, ATextOfMillionsOfEntitiesIsRead) {
  const Result<Value> value =
      coding->parse(xmlList("<string>" + repeated("&amp;", 3'000'000) + "</string>"));
  ASSERT_TRUE(value) << value.error().message;
  EXPECT_EQ(*value, Value(std::string(3'000'000, '&')));
}

TEST_F(HostilePropertyListTest, EntitiesFarApartInALongTextAreRead) {
  const std::string part = "&lt;" + std::string(8'000, 'x') + "<![CDATA[&]]>";
  const Result<Value> value =
      coding->parse(xmlList("<string>" + repeated(part, 1'000) + "</string>"));
  ASSERT_TRUE(value) << value.error().message;
  EXPECT_EQ(*value, Value(repeated("<" + std::string(8'000, 'x') + "&", 1'000)));
}

TEST_F(HostilePropertyListTest, ThousandsOfEntitiesAreFine) {
  const Result<Value> value =
      coding->parse(xmlList("<string>" + repeated("&lt;", 5'000) + "</string>"));
  ASSERT_TRUE(value);
  EXPECT_EQ(*value, Value(repeated("<", 5'000)));
}

/// Keys of one length that the library cannot tell apart by their hashes: 33 × 'a' + 'Q' is
/// 33 × 'b' + '0'.
std::string collidingKey(std::size_t number) {
  std::string key;
  for (std::size_t bit = 0; bit < 16; ++bit) key += (number >> bit) % 2 == 0 ? "aQ" : "b0";
  return key;
}

TEST_F(HostilePropertyListTest, AnXmlDictionaryOfKeysThatCollideIsRead) {
  constexpr std::size_t kKeys = 50'000;
  std::string xml = "<dict><key/><string>none</string>";
  Dictionary expected{{"", "none"}};
  for (std::size_t i = 0; i < kKeys; ++i) {
    xml += "<key>" + collidingKey(i) + "</key><true/>";
    expected.set(collidingKey(i), Value::boolean(true));
  }
  const Result<Value> value = coding->parse(xmlList(xml + "</dict>"));
  ASSERT_TRUE(value) << value.error().message;
  EXPECT_EQ(*value, Value(expected));
}

TEST_F(HostilePropertyListTest, AKeyThatComesFiftyThousandTimesCountsOnce) {
  const Result<Value> value =
      coding->parse(xmlList("<dict><key>k</key><false/><key>a&amp;</key><true/>" +
                            repeated("<key>k</key><true/>", 50'000) + "</dict>"));
  ASSERT_TRUE(value) << value.error().message;
  EXPECT_EQ(*value, Value(Dictionary{{"k", Value::boolean(true)}, {"a&", Value::boolean(true)}}));
}

}  // namespace
}  // namespace kestro
