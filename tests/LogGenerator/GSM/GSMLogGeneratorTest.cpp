#include "LogGenerator/GSM/GSMLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>
#include <exception>
#include <optional>

#include "base/Assertion.h"
#include "base/PropertyList.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

Bytes bytesOf(std::string_view text) { return Bytes(text.begin(), text.end()); }
Bytes xmlList(const std::string& content) {
  return bytesOf("<plist version=\"1.0\">" + content + "</plist>");
}

class GSMLogGeneratorTest : public testing::Test {
 protected:
  void receive(const Value& object) {
    generator->updateState_withData(state, writeBinaryPropertyList(object).value());
  }
  std::string entry(std::string_view key) const { return described(state.get(key)); }
  std::string display() const { return entry("Display"); }
  // What a message of the object alone shows.
  std::string displayOf(const Value& object) {
    receive(object);
    return display();
  }

  // What the assertion failure says that a message brings about; nothing when there is none.
  std::optional<std::string> failureOf(const Bytes& message) {
    try {
      generator->updateState_withData(state, message);
    } catch (const AssertionFailure& failure) {
      return failure.what();
    }
    return std::nullopt;
  }
  std::optional<std::string> failureOf(const Value& object) {
    return failureOf(writeBinaryPropertyList(object).value());
  }
  void expectUnknownObject(const Value& object, const std::string& name) {
    const auto failure = failureOf(object);
    ASSERT_TRUE(failure) << described(object);
    EXPECT_THAT(*failure, HasSubstr("Unknown object of type " + name + " encountered")) << described(object);
    EXPECT_THAT(*failure, HasSubstr("LogGenerator/GSM/GSMLogGenerator:78: "));
  }
  void expectUnreadable(const Bytes& message) {
    const auto failure = failureOf(message);
    ASSERT_TRUE(failure) << described(message);
    EXPECT_THAT(*failure, HasSubstr("Could not deserialize the object")) << described(message);
    EXPECT_THAT(*failure, HasSubstr("LogGenerator/GSM/GSMLogGenerator:90: "));
  }

  RecordingLog log;
  TestServices host;
  std::unique_ptr<LogGenerator> generator = GSMLogGenerator::generator(host.services);
  Dictionary state;
};

// Creation and commands

TEST_F(GSMLogGeneratorTest, ConstructionLogsItsAddressAndNothingElse) {
  log.take();
  const auto another = GSMLogGenerator::generator(host.services);
  char line[64];
  std::snprintf(line, sizeof line, "<4>Creating Log object: 0x%" PRIxPTR,
                reinterpret_cast<std::uintptr_t>(another.get()));
  EXPECT_THAT(log.takeTexts(), ElementsAre(line));
}

TEST_F(GSMLogGeneratorTest, DestructionIsSilent) {
  log.take();
  generator.reset();
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(GSMLogGeneratorTest, EachCallMakesAnotherGenerator) {
  const auto another = GSMLogGenerator::generator(host.services);
  EXPECT_NE(another, nullptr);
  EXPECT_NE(another, generator);
}

TEST_F(GSMLogGeneratorTest, ItIsTheGeneratorOfItsTechnology) {
  const auto registered = LogGenerator::generatorFromTechnology("ifx-gsm", host.services);
  EXPECT_NE(dynamic_cast<GSMLogGenerator*>(registered.get()), nullptr);
}

TEST_F(GSMLogGeneratorTest, TheStartCommandHasOneEntry) {
  EXPECT_EQ(described(generator->getStartCommand()), R"({SetState: "Streaming"})");
}

// What a message leaves in the state

TEST_F(GSMLogGeneratorTest, AMessageLeavesItsObjectTheDisplayAndNoExtraInformation) {
  receive(dictionaryOf(
      {{"Cells", Value::ofArray({"header", "first"})}, {"Serving", dictionaryOf({{"Channel", "62"}})}}));
  EXPECT_EQ(entry("DisplayState"), R"({Cells: ["header", "first"], Serving: {Channel: "62"}})");
  EXPECT_EQ(entry("Display"), R"({Cells: ["first"], Serving: "62"})");
  EXPECT_EQ(entry("ExtraInfo"), "{}");
  EXPECT_EQ(state.size(), 3u);
}

TEST_F(GSMLogGeneratorTest, AMessageMayBeAnXmlOrABinaryPropertyList) {
  generator->updateState_withData(state, xmlList("<dict><key>RSSI</key><string>-71</string></dict>"));
  EXPECT_EQ(display(), R"({RSSI: "-71"})");
  const Bytes xml = writeXmlPropertyList(dictionaryOf({{"RSSI", "-72"}})).value();
  generator->updateState_withData(state, xml);
  EXPECT_EQ(display(), R"({RSSI: "-72"})");
  const Bytes binary = writeBinaryPropertyList(dictionaryOf({{"RSSI", "-73"}})).value();
  generator->updateState_withData(state, binary);
  EXPECT_EQ(display(), R"({RSSI: "-73"})");
}

TEST_F(GSMLogGeneratorTest, EachMessageReplacesTheDisplayWholly) {
  receive(dictionaryOf({{"A", "1"}, {"B", "2"}}));
  receive(dictionaryOf({{"C", "3"}}));
  EXPECT_EQ(entry("DisplayState"), R"({C: "3"})");
  EXPECT_EQ(entry("Display"), R"({C: "3"})");
}

TEST_F(GSMLogGeneratorTest, EachMessageDropsTheExtraInformationBeforeIt) {
  const Value old = dictionaryOf({{"Note", "old"}});
  state.set("ExtraInfo", old);
  receive("text");
  EXPECT_EQ(entry("ExtraInfo"), "{}");
  EXPECT_EQ(described(old), R"({Note: "old"})");
  const Dictionary* first = state.get("ExtraInfo").dictionary();
  state.get("ExtraInfo").dictionary()->set("Note", "newer");
  receive("text");
  EXPECT_EQ(entry("ExtraInfo"), "{}");
  EXPECT_NE(state.get("ExtraInfo").dictionary(), first);
}

TEST_F(GSMLogGeneratorTest, OtherEntriesOfTheStateStay) {
  state.set("Template", dictionaryOf({{"Section", ""}}));
  state.set("Lookup", Value::ofDictionary());
  state.set("History", Value::ofArray({"record"}));
  receive(dictionaryOf({{"A", "1"}}));
  EXPECT_EQ(described(state), R"({Template: {Section: ""}, Lookup: {}, History: ["record"], )"
                              R"(DisplayState: {A: "1"}, Display: {A: "1"}, ExtraInfo: {}})");
}

TEST_F(GSMLogGeneratorTest, TheDisplaySharesNoContainerWithTheReceivedObject) {
  receive(
      dictionaryOf({{"Cell", dictionaryOf({{"A", "1"}, {"B", "2"}})}, {"List", Value::ofArray({"h", "a"})}}));
  const Dictionary& shown = *state.get("Display").dictionary();
  shown.get("Cell").dictionary()->set("A", "changed");
  shown.get("List").array()->push_back("added");
  EXPECT_EQ(entry("DisplayState"), R"({Cell: {A: "1", B: "2"}, List: ["h", "a"]})");
}

TEST_F(GSMLogGeneratorTest, MessagesAreSilent) {
  log.take();
  receive(dictionaryOf({{"A", dictionaryOf({{"B", "x"}})}, {"List", Value::ofArray({"h", "a"})}}));
  generator->generateLogUsingState(state);
  generator->getSaveContentsFromState(state);
  generator->getStartCommand();
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(host.standardOutput.str(), "");
  EXPECT_THAT(host.resources.requests(), IsEmpty());
}

// Strings and dictionaries

TEST_F(GSMLogGeneratorTest, ARootStringIsTheDisplay) {
  EXPECT_EQ(displayOf("No service"), R"("No service")");
  EXPECT_EQ(entry("DisplayState"), R"("No service")");
  EXPECT_EQ(displayOf(""), R"("")");
}

TEST_F(GSMLogGeneratorTest, StringsStayAsTheyAre) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", " two  blanks \n"}, {"B", "_sorted"}, {"C", "é × 64"}})),
            "{A: \" two  blanks \n\", B: \"_sorted\", C: \"é × 64\"}");
}

TEST_F(GSMLogGeneratorTest, KeysKeepTheirOrder) {
  EXPECT_EQ(displayOf(dictionaryOf({{"b", "1"}, {"10;a", "2"}, {"_sorted", "_sorted"}, {"a", "3"}})),
            R"({b: "1", 10;a: "2", _sorted: "_sorted", a: "3"})");
}

TEST_F(GSMLogGeneratorTest, AnEmptyDictionaryStays) {
  EXPECT_EQ(displayOf(Value::ofDictionary()), "{}");
  EXPECT_EQ(displayOf(dictionaryOf({{"A", Value::ofDictionary()}})), "{A: {}}");
}

TEST_F(GSMLogGeneratorTest, AChildOfOneEntryBecomesTheValueOfThatEntry) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", "x"}})}})), R"({A: "x"})");
}

TEST_F(GSMLogGeneratorTest, ChainsOfOneEntryShrinkToTheirEnd) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", dictionaryOf({{"C", "y"}})}})}})),
            R"({A: "y"})");
  EXPECT_EQ(
      displayOf(dictionaryOf(
          {{"A", dictionaryOf({{"B", dictionaryOf({{"C", dictionaryOf({{"D", "z"}})}})}})}, {"E", "e"}})),
      R"({A: "z", E: "e"})");
}

TEST_F(GSMLogGeneratorTest, AChildOfTwoEntriesStays) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", "x"}, {"C", "y"}})}})),
            R"({A: {B: "x", C: "y"}})");
}

TEST_F(GSMLogGeneratorTest, AMarkCountsAsAnEntry) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"_sorted", "_sorted"}, {"1;B", "x"}})}})),
            R"({A: {_sorted: "_sorted", 1;B: "x"}})");
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"_sorted", "_sorted"}})}})), R"({A: "_sorted"})");
}

TEST_F(GSMLogGeneratorTest, AChainEndsAtADictionaryOfTwoOrOfNone) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", dictionaryOf({{"C", "1"}, {"D", "2"}})}})}})),
            R"({A: {C: "1", D: "2"}})");
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", Value::ofDictionary()}})}})), "{A: {}}");
}

TEST_F(GSMLogGeneratorTest, EntriesWithinADictionaryOfTwoCollapseEachForItself) {
  EXPECT_EQ(
      displayOf(dictionaryOf(
          {{"A", dictionaryOf({{"B", dictionaryOf({{"C", "1"}})}, {"D", dictionaryOf({{"E", "2"}})}})}})),
      R"({A: {B: "1", D: "2"}})");
}

TEST_F(GSMLogGeneratorTest, ARootOfOneEntryIsNotCollapsed) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", "x"}})), R"({A: "x"})");
  EXPECT_EQ(displayOf(dictionaryOf({{"A", Value::ofArray({"h", "a"})}})), R"({A: ["a"]})");
}

// Arrays

TEST_F(GSMLogGeneratorTest, AnArrayLosesItsFirstElement) {
  EXPECT_EQ(displayOf(Value::ofArray({"h", "a", "b"})), R"(["a", "b"])");
  EXPECT_EQ(entry("DisplayState"), R"(["h", "a", "b"])");
}

TEST_F(GSMLogGeneratorTest, AnArrayOfOneElementShowsAnEmptyOne) {
  EXPECT_EQ(displayOf(Value::ofArray({"h"})), "[]");
  EXPECT_EQ(displayOf(dictionaryOf({{"List", Value::ofArray({"h"})}})), "{List: []}");
}

TEST_F(GSMLogGeneratorTest, AnEmptyArrayStaysEmpty) {
  EXPECT_EQ(displayOf(Value::ofArray()), "[]");
  EXPECT_EQ(displayOf(dictionaryOf({{"List", Value::ofArray()}})), "{List: []}");
}

TEST_F(GSMLogGeneratorTest, EqualElementsAreLeftOutByPlaceOnly) {
  EXPECT_EQ(displayOf(Value::ofArray({"a", "a", "b", "a"})), R"(["a", "b", "a"])");
}

TEST_F(GSMLogGeneratorTest, ArraysWithinArraysLoseTheirFirstElementsToo) {
  EXPECT_EQ(displayOf(Value::ofArray(
                {Value::ofArray({"lost", "lost"}), Value::ofArray({"h", "a", "b"}), Value::ofArray({"h"})})),
            R"([["a", "b"], []])");
}

TEST_F(GSMLogGeneratorTest, ElementsOfOneEntryCollapse) {
  EXPECT_EQ(displayOf(Value::ofArray({"h", dictionaryOf({{"A", "1"}}), dictionaryOf({{"A", "2"}, {"B", "3"}}),
                                      dictionaryOf({{"A", dictionaryOf({{"B", "4"}})}})})),
            R"(["1", {A: "2", B: "3"}, "4"])");
}

TEST_F(GSMLogGeneratorTest, AnArrayOfOneElementIsNoDictionaryAndDoesNotCollapse) {
  EXPECT_EQ(displayOf(dictionaryOf({{"List", Value::ofArray({"h", "a"})}})), R"({List: ["a"]})");
  EXPECT_EQ(displayOf(Value::ofArray({"h", Value::ofArray({"h", "a"})})), R"([["a"]])");
}

TEST_F(GSMLogGeneratorTest, AChildOfOneEntryThatIsAnArrayBecomesThatArray) {
  EXPECT_EQ(displayOf(dictionaryOf({{"A", dictionaryOf({{"B", Value::ofArray({"h", "a", "b"})}})}})),
            R"({A: ["a", "b"]})");
}

TEST_F(GSMLogGeneratorTest, ACollapsedArrayLosesOneElementOnly) {
  EXPECT_EQ(displayOf(dictionaryOf(
                {{"A", dictionaryOf({{"B", dictionaryOf({{"C", Value::ofArray({"1", "2", "3"})}})}})}})),
            R"({A: ["2", "3"]})");
}

TEST_F(GSMLogGeneratorTest, TheFirstElementOfAnArrayIsLeftOutUnseenWhateverItIs) {
  EXPECT_EQ(displayOf(Value::ofArray({Value::ofInteger(1), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(Value::ofArray({Value::ofReal(1.5), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(Value::ofArray({Value::ofBoolean(true), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(Value::ofArray({Value::ofDate({1, 0}), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(Value::ofArray({Value::ofData({1}), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(Value::ofArray({dictionaryOf({{"Count", Value::ofInteger(2)}}), "a"})), R"(["a"])");
  EXPECT_EQ(displayOf(dictionaryOf({{"List", Value::ofArray({Value::ofInteger(1)})}})), "{List: []}");
}

// Collapsing by itself

TEST_F(GSMLogGeneratorTest, OnlyADictionaryOfOneEntryCanCollapse) {
  GSMLogGenerator own(host.services);
  EXPECT_EQ(described(own.canCollapse(dictionaryOf({{"A", "x"}}))), R"("x")");
  EXPECT_EQ(described(own.canCollapse(dictionaryOf({{"A", dictionaryOf({{"B", "x"}})}}))), R"({B: "x"})");
  EXPECT_EQ(described(own.canCollapse(dictionaryOf({{"A", "x"}, {"B", "y"}}))), "absent");
  EXPECT_EQ(described(own.canCollapse(Value::ofDictionary())), "absent");
  EXPECT_EQ(described(own.canCollapse(Value::ofArray({"x"}))), "absent");
  EXPECT_EQ(described(own.canCollapse("x")), "absent");
  EXPECT_EQ(described(own.canCollapse(Value())), "absent");
}

TEST_F(GSMLogGeneratorTest, ProcessingAnObjectLeavesTheObjectAlone) {
  const Value object =
      dictionaryOf({{"A", dictionaryOf({{"B", "x"}})}, {"List", Value::ofArray({"h", "a"})}});
  EXPECT_EQ(described(GSMLogGenerator::processObject(object)), R"({A: "x", List: ["a"]})");
  EXPECT_EQ(described(object), R"({A: {B: "x"}, List: ["h", "a"]})");
}

// Failures

TEST_F(GSMLogGeneratorTest, ObjectsOfOtherKindsFailUnderTheirNames) {
  expectUnknownObject(Value::ofInteger(5), "integer");
  expectUnknownObject(Value::ofInteger(-1), "integer");
  expectUnknownObject(Value::ofReal(2.5), "real");
  expectUnknownObject(Value::ofBoolean(true), "boolean");
  expectUnknownObject(Value::ofBoolean(false), "boolean");
  expectUnknownObject(Value::ofDate({0, 0}), "date");
  expectUnknownObject(Value::ofData({}), "data");
  expectUnknownObject(Value::ofData({1, 2, 3}), "data");
}

TEST_F(GSMLogGeneratorTest, ObjectsOfOtherKindsFailWhereverTheyAreSeen) {
  const Value number = Value::ofInteger(5);
  expectUnknownObject(dictionaryOf({{"A", number}}), "integer");
  expectUnknownObject(dictionaryOf({{"A", "x"}, {"B", dictionaryOf({{"C", number}})}}), "integer");
  expectUnknownObject(Value::ofArray({"h", number}), "integer");
  expectUnknownObject(Value::ofArray({"h", "a", Value::ofArray({"h", number})}), "integer");
  expectUnknownObject(dictionaryOf({{"List", Value::ofArray({"h", dictionaryOf({{"A", number}})})}}),
                      "integer");
}

TEST_F(GSMLogGeneratorTest, TheFirstUnknownObjectIsTheOneThatIsNamed) {
  expectUnknownObject(dictionaryOf({{"A", "x"}, {"B", Value::ofReal(1.0)}, {"C", Value::ofInteger(1)}}),
                      "real");
  expectUnknownObject(Value::ofArray({Value::ofData({}), Value::ofBoolean(true), Value::ofReal(1.0)}),
                      "boolean");
}

TEST_F(GSMLogGeneratorTest, WhatIsNoPropertyListFails) {
  expectUnreadable({});
  expectUnreadable({0});
  expectUnreadable(bytesOf("bplist00"));
  expectUnreadable(bytesOf("RSSI -71"));
  expectUnreadable(bytesOf("<plist version=\"1.0\"><dict><key>A</key>"));
  expectUnreadable({1, 38, 0, 0xC2, 0xB0, 0, 0, 0, 0, 0, 0, 0, 0, 7});
}

TEST_F(GSMLogGeneratorTest, EveryTruncatedBinaryMessageFails) {
  Bytes message = writeBinaryPropertyList(dictionaryOf({{"A", Value::ofArray({"h", "a"})}})).value();
  while (!message.empty()) {
    message.pop_back();
    expectUnreadable(message);
  }
}

TEST_F(GSMLogGeneratorTest, AFailureLeavesTheStateAsItWasAndLogsNothing) {
  receive(dictionaryOf({{"A", "x"}}));
  state.get("ExtraInfo").dictionary()->set("Note", "kept");
  log.take();
  const char* before = R"({DisplayState: {A: "x"}, Display: {A: "x"}, ExtraInfo: {Note: "kept"}})";
  EXPECT_TRUE(failureOf(bytesOf("?")));
  EXPECT_EQ(described(state), before);
  EXPECT_TRUE(failureOf(dictionaryOf({{"A", "y"}, {"B", Value::ofInteger(1)}})));
  EXPECT_EQ(described(state), before);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(GSMLogGeneratorTest, AnAssertionFailureIsAStandardException) {
  EXPECT_THROW(receive(Value::ofInteger(1)), std::exception);
}

// Displays and what is saved

TEST_F(GSMLogGeneratorTest, WithoutAMessageThereIsNoDisplayAndTheSnapshotIsEmpty) {
  EXPECT_TRUE(generator->generateLogUsingState(state).isAbsent());
  EXPECT_EQ(described(state), "{History: [{}]}");
}

TEST_F(GSMLogGeneratorTest, TheDisplayIsThatOfTheState) {
  receive(dictionaryOf({{"A", dictionaryOf({{"B", "x"}})}}));
  const Value shown = generator->generateLogUsingState(state);
  EXPECT_EQ(described(shown), R"({A: "x"})");
  EXPECT_EQ(shown.dictionary(), state.get("Display").dictionary());
}

TEST_F(GSMLogGeneratorTest, ADisplayIsGeneratedOfWhatAnotherGeneratorLeft) {
  state.set("Display", dictionaryOf({{"Left", "over"}}));
  EXPECT_EQ(described(generator->generateLogUsingState(state)), R"({Left: "over"})");
}

TEST_F(GSMLogGeneratorTest, EachDisplayRecordsASnapshotWithTheReceivedObject) {
  host.clock.set({1709301909, 0});
  receive(dictionaryOf({{"List", Value::ofArray({"h", "a"})}}));
  generator->generateLogUsingState(state);
  EXPECT_EQ(entry("History"),
            R"([{DisplayState: {List: ["h", "a"]}, Display: {List: ["a"]}, ExtraInfo: {}, )"
            R"~(Date: "2024-03-01 14:05:09 +0000", Description: "Snapshot (2024-03-01 14:05:09 +0000)"}])~");
}

TEST_F(GSMLogGeneratorTest, ASnapshotOfARootStringHoldsTheString) {
  host.clock.set({0, 0});
  receive("No service");
  generator->generateLogUsingState(state);
  EXPECT_EQ(entry("History"),
            R"([{DisplayState: "No service", Display: "No service", ExtraInfo: {}, )"
            R"~(Date: "1970-01-01 00:00:00 +0000", Description: "Snapshot (1970-01-01 00:00:00 +0000)"}])~");
}

TEST_F(GSMLogGeneratorTest, LaterMessagesLeaveSnapshotsAsTheyWere) {
  host.clock.set({0, 0});
  receive(dictionaryOf({{"A", "1"}}));
  generator->generateLogUsingState(state);
  const std::string recorded = entry("History");
  receive(dictionaryOf({{"A", "2"}}));
  EXPECT_EQ(entry("History"), recorded);
}

TEST_F(GSMLogGeneratorTest, TheHistoryKeepsTheNewestFive) {
  for (const char* text : {"1", "2", "3", "4", "5", "6"}) {
    receive(text);
    generator->generateLogUsingState(state);
  }
  const Array& history = *state.get("History").array();
  ASSERT_EQ(history.size(), 5u);
  EXPECT_EQ(described(history.front().dictionary()->get("Display")), R"("2")");
  EXPECT_EQ(described(history.back().dictionary()->get("Display")), R"("6")");
}

TEST_F(GSMLogGeneratorTest, WhatIsSavedIsTheHistoryWithoutABinaryLog) {
  state.set("History", Value::ofArray({dictionaryOf({{"Description", "first"}}), "second"}));
  const Value saved = generator->getSaveContentsFromState(state);
  EXPECT_EQ(described(saved), R"([{Description: "first"}, "second"])");
}

TEST_F(GSMLogGeneratorTest, WhatIsSavedIsAnArrayOfItsOwn) {
  state.set("History", Value::ofArray({"first"}));
  const Value saved = generator->getSaveContentsFromState(state);
  saved.array()->push_back("added");
  EXPECT_EQ(entry("History"), R"(["first"])");
}

TEST_F(GSMLogGeneratorTest, WithoutAHistoryNothingIsSaved) {
  EXPECT_EQ(described(generator->getSaveContentsFromState(state)), "[]");
}

TEST_F(GSMLogGeneratorTest, SavingChangesNothing) {
  receive(dictionaryOf({{"A", "1"}}));
  const std::string before = described(state);
  generator->getSaveContentsFromState(state);
  EXPECT_EQ(described(state), before);
}

}  // namespace
}  // namespace varnel
