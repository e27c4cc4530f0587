// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/IFX/GSMLogGenerator.h"
#include "LogGenerator/InternalConsistencyFailure.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Virtual/VirtualPlatform.h"

namespace kestro {
namespace {

using ::testing::ElementsAre;

class GSMLogGeneratorTest : public ::testing::Test {
 protected:
  void receive(const Value& message) {
    generator->updateStateWithData(state, *coding->binary(message));
  }

  void receiveText(std::string_view text) {
    generator->updateStateWithData(
        state, ByteView(reinterpret_cast<const std::uint8_t*>(text.data()), text.size()));
  }

  std::string failureOf(const Value& message) {
    try {
      receive(message);
    } catch (const InternalConsistencyFailure& failure) {
      EXPECT_EQ(failure.source(), "LogGenerator/GSM/GSMLogGenerator");
      EXPECT_EQ(failure.line(), 78);
      return failure.message();
    }
    return "no failure";
  }

  static Value processed(const Value& object) { return GSMLogGenerator::processObject(object); }

  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
  VirtualPlatform platform{*coding};
  std::unique_ptr<GSMLogGenerator> generator =
      GSMLogGenerator::generator(generatorServices(platform));
  Dictionary state;
};

TEST_F(GSMLogGeneratorTest, AsksForStreaming) {
  EXPECT_EQ(Value(generator->getStartCommand()), Value(Dictionary{{"SetState", "Streaming"}}));
}

TEST_F(GSMLogGeneratorTest, HasNoPacketsToExplainOrToList) {
  int visits = 0;
  const Bytes message = *coding->binary(Dictionary{{"A", "x"}});
  generator->explainMessage(message, [&](const ExplainedValue&) { ++visits; });
  generator->catalogue([&](const CatalogueEntry&) { ++visits; });
  EXPECT_EQ(visits, 0);
}

TEST_F(GSMLogGeneratorTest, CollapsesAOneEntryDictionary) {
  EXPECT_EQ(processed(Dictionary{{"A", Dictionary{{"B", "x"}}}}), Value(Dictionary{{"A", "x"}}));
}

TEST_F(GSMLogGeneratorTest, CollapsesEachLevelOnItsOwn) {
  EXPECT_EQ(processed(Dictionary{{"A", Dictionary{{"B", Dictionary{{"C", "x"}}}}}}),
            Value(Dictionary{{"A", "x"}}));
}

TEST_F(GSMLogGeneratorTest, CollapsesToAContainer) {
  EXPECT_EQ(processed(Dictionary{{"A", Dictionary{{"B", Array{"header", "a"}}}}}),
            Value(Dictionary{{"A", Array{"a"}}}));
}

TEST_F(GSMLogGeneratorTest, KeepsDictionariesOfSeveralEntries) {
  const Value object = Dictionary{{"A", Dictionary{{"B", "x"}, {"C", "y"}}}, {"D", Dictionary()}};
  EXPECT_EQ(processed(object), object);
}

TEST_F(GSMLogGeneratorTest, DropsTheFirstElementOfEveryArray) {
  EXPECT_EQ(processed(Array{"header", "a", "b"}), Value(Array{"a", "b"}));
  EXPECT_EQ(processed(Array{"header"}), Value(Array{}));
  EXPECT_EQ(processed(Array{}), Value(Array{}));
  EXPECT_EQ(processed(Array{"header", Array{"header", "a"}}), Value(Array{Array{"a"}}));
}

TEST_F(GSMLogGeneratorTest, DropsTheFirstElementUnseenWhateverItsType) {
  EXPECT_EQ(processed(Array{Value::integer(3), "a"}), Value(Array{"a"}));
}

TEST_F(GSMLogGeneratorTest, CollapsesArrayElements) {
  EXPECT_EQ(processed(Array{"header", Dictionary{{"k", "v"}}}), Value(Array{"v"}));
}

TEST_F(GSMLogGeneratorTest, NeverCollapsesTheTopLevel) {
  EXPECT_EQ(processed(Dictionary{{"Only", "x"}}), Value(Dictionary{{"Only", "x"}}));
}

TEST_F(GSMLogGeneratorTest, LeavesTheProcessedObjectAlone) {
  const Dictionary object{{"A", Dictionary{{"B", "x"}}}};
  static_cast<void>(processed(object));
  EXPECT_EQ(Value(object), Value(Dictionary{{"A", Dictionary{{"B", "x"}}}}));
}

TEST_F(GSMLogGeneratorTest, StoresTheMessageAsReceivedAndAsShown) {
  const Value message = Dictionary{{"Cell", Dictionary{{"ID", "7"}}}};
  receive(message);
  EXPECT_EQ(state["DisplayState"], message);
  EXPECT_EQ(state["Display"], Value(Dictionary{{"Cell", "7"}}));
  EXPECT_EQ(state["ExtraInfo"], Value(Dictionary()));
}

TEST_F(GSMLogGeneratorTest, GivesEachMessageExtraInformationOfItsOwn) {
  receive(Dictionary{{"A", "1"}});
  Dictionary first = state["ExtraInfo"].dictionary();
  first.set("left", "behind");
  receive(Dictionary{{"A", "2"}});
  EXPECT_EQ(state["ExtraInfo"], Value(Dictionary()));
}

TEST_F(GSMLogGeneratorTest, ParsesXmlMessages) {
  receiveText("<plist version=\"1.0\"><dict><key>A</key><string>1</string></dict></plist>");
  EXPECT_EQ(state["Display"], Value(Dictionary{{"A", "1"}}));
}

TEST_F(GSMLogGeneratorTest, RaisesAFailureForAMessageThatDoesNotParse) {
  receive(Dictionary{{"A", "1"}});
  try {
    receiveText("not a property list");
    FAIL() << "nothing was raised";
  } catch (const InternalConsistencyFailure& failure) {
    EXPECT_EQ(failure.message(), "Could not deserialize the object");
    EXPECT_EQ(failure.source(), "LogGenerator/GSM/GSMLogGenerator");
    EXPECT_EQ(failure.line(), 90);
    EXPECT_STREQ(failure.what(),
                 "Could not deserialize the object (LogGenerator/GSM/GSMLogGenerator, line 90)");
  }
  EXPECT_EQ(state["Display"], Value(Dictionary{{"A", "1"}}));
}

TEST_F(GSMLogGeneratorTest, RaisesAFailureNamingTheTypeOfAnUnknownObject) {
  EXPECT_EQ(failureOf(Dictionary{{"A", Value::integer(1)}}),
            "Unknown object of type number encountered");
  EXPECT_EQ(failureOf(Dictionary{{"A", Value::real(0.5)}}),
            "Unknown object of type number encountered");
  EXPECT_EQ(failureOf(Array{"header", Value::boolean(true)}),
            "Unknown object of type boolean encountered");
  EXPECT_EQ(failureOf(Dictionary{{"A", Value::date(Moment())}}),
            "Unknown object of type date encountered");
  EXPECT_EQ(failureOf(Value::data({1, 2})), "Unknown object of type data encountered");
  EXPECT_TRUE(state.empty());
}

TEST_F(GSMLogGeneratorTest, ADateOfAnyYearIsAnUnknownObjectAndNoUnparsableMessage) {
  using namespace std::chrono;
  for (const year each : {1y, 1932y, 2070y, 9999y}) {
    EXPECT_EQ(failureOf(Dictionary{{"A", Value::date(sys_days(each / January / 1))}}),
              "Unknown object of type date encountered");
  }
}

TEST_F(GSMLogGeneratorTest, ADroppedFirstElementMayBeADateOfAnyYear) {
  using namespace std::chrono;
  receive(Array{Value::date(sys_days(1900y / January / 1)), "shown"});
  EXPECT_EQ(state["Display"], Value(Array{"shown"}));
}

TEST_F(GSMLogGeneratorTest, RecordsTheHistoryWithEachDisplay) {
  receive(Dictionary{{"A", "1"}});
  EXPECT_EQ(generator->generateLogUsingState(state), Value(Dictionary{{"A", "1"}}));
  receive(Dictionary{{"A", "2"}});
  static_cast<void>(generator->generateLogUsingState(state));

  const Array saved = generator->getSaveContentsFromState(state);
  ASSERT_EQ(saved.size(), 2U);
  EXPECT_EQ(saved[0].dictionary()["Display"], Value(Dictionary{{"A", "1"}}));
}

TEST_F(GSMLogGeneratorTest, HasNoDisplayBeforeTheFirstMessage) {
  EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
}

TEST_F(GSMLogGeneratorTest, SavesAnArrayOfItsOwn) {
  EXPECT_TRUE(generator->getSaveContentsFromState(state).empty());
  receive(Dictionary{{"A", "1"}});
  static_cast<void>(generator->generateLogUsingState(state));
  Array saved = generator->getSaveContentsFromState(state);
  saved.clear();
  EXPECT_EQ(generator->getSaveContentsFromState(state).size(), 1U);
}

TEST_F(GSMLogGeneratorTest, AnEntryKeepsSixteenMebibytesOfTexts) {
  // The key and the text stand in the message and in the display.
  receive(Dictionary{{"A", std::string(kMaximumEntryBytes / 2 - 1, 'x')}});
  static_cast<void>(generator->generateLogUsingState(state));
  EXPECT_FALSE(state["History"].array()[0].dictionary().empty());
}

TEST_F(GSMLogGeneratorTest, OfMoreTextAnEntryKeepsNothingAndSaysSo) {
  receive(Dictionary{{"A", "1"}});
  static_cast<void>(generator->generateLogUsingState(state));
  static_cast<void>(platform.systemLog().take());
  const Value large = Dictionary{{"A", Array{"", std::string(kMaximumEntryBytes / 2, 'x')}}};
  receive(large);
  EXPECT_EQ(generator->generateLogUsingState(state), state["Display"]);
  receive(Dictionary{{"A", "2"}});
  static_cast<void>(generator->generateLogUsingState(state));

  const Array history = state["History"].array();
  ASSERT_EQ(history.size(), 3U);
  EXPECT_EQ(history[0].dictionary()["Display"], Value(Dictionary{{"A", "1"}}));
  EXPECT_TRUE(history[1].dictionary().empty());
  EXPECT_EQ(history[2].dictionary()["Display"], Value(Dictionary{{"A", "2"}}));
  EXPECT_THAT(platform.systemLog().take(),
              ElementsAre(RecordingSystemLog::Line{
                  LogPriority::Error,
                  "History: an entry beyond 16 MiB of text is not kept (16777218 bytes)"}));
}

}  // namespace
}  // namespace kestro
