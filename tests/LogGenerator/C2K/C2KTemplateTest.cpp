#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* processing = "<4>Processing the template";
constexpr const char* cannotLoad = "<3>Cannot load C2K template for display";

// Packets that publish one variable.
Bytes withoutFingers() { return PacketBuilder(0x108A, 23).bytes(); }  // kFingerC2I: "(none)"
Bytes withoutPilots() { return PacketBuilder(0x12B6, 25).bytes(); }   // kActiveSetPilots: "(none)"
Bytes firstRate() { return PacketBuilder(0x1192, 241).u32(13, 7).u32(17, 8).bytes(); }

class C2KTemplateTest : public testing::Test {
 protected:
  C2KTemplateTest() { log.take(); }

  void use(const Value& displayTemplate) { host.resources.add("C2KTemplate", displayTemplate); }
  // Makes display and lookup and hands over nothing.
  void start() { generator.updateState_withData(state, {}); }
  void receive(const Bytes& message) { generator.updateState_withData(state, message); }
  std::string displayed() const { return described(state.get("Display")); }
  std::string lookedUp() const { return described(state.get("Lookup")); }

  RecordingLog log;
  TestServices host;
  C2KLogGenerator generator{host.services};
  Dictionary state;
};

// Display and lookup.

TEST_F(C2KTemplateTest, TheFirstMessageMakesDisplayLookupAndExtraInfo) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  start();
  EXPECT_EQ(described(state),
            R"({Template: {Fingers: "kFingerC2I"}, Display: {Fingers: ""}, )"
            R"(Lookup: {kFingerC2I: [{key: "Fingers", dict: {Fingers: ""}}]}, ExtraInfo: {}})");
  EXPECT_THAT(host.resources.requests(), ElementsAre("C2KTemplate"));
  EXPECT_THAT(log.takeTexts(), ElementsAre(processing));
}

TEST_F(C2KTemplateTest, TheFirstGenerationMakesThemJustAsWell) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  EXPECT_EQ(described(generator.generateLogUsingState(state)), R"({Fingers: ""})");
  EXPECT_EQ(lookedUp(), R"({kFingerC2I: [{key: "Fingers", dict: {Fingers: ""}}]})");
  EXPECT_EQ(described(state.get("ExtraInfo")), "{}");
}

TEST_F(C2KTemplateTest, SectionsMayLieWithinSectionsToAnyDepth) {
  use(dictionaryOf(
      {{"1x", dictionaryOf({{"State", "k1xDeviceState"},
                            {"Radio", dictionaryOf({{"Chain 0", dictionaryOf({{"AGC", "k1xRxAGC0"}})}})}})},
       {"Empty", Value::ofDictionary()}}));
  start();
  EXPECT_EQ(displayed(), R"({1x: {State: "", Radio: {Chain 0: {AGC: ""}}}, Empty: {}})");
  EXPECT_EQ(lookedUp(),
            R"({k1xDeviceState: [{key: "State", dict: {State: "", Radio: {Chain 0: {AGC: ""}}}}], )"
            R"(k1xRxAGC0: [{key: "AGC", dict: {AGC: ""}}]})");
}

TEST_F(C2KTemplateTest, EveryLevelLogsThatItIsProcessedEvenAnEmptyOne) {
  use(dictionaryOf({{"A", dictionaryOf({{"B", Value::ofDictionary()}})}, {"C", Value::ofDictionary()}}));
  start();
  EXPECT_THAT(log.takeTexts(), ElementsAre(processing, processing, processing, processing));
  start();
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(C2KTemplateTest, AnEmptyTemplateIsATemplate) {
  use(Value::ofDictionary());
  EXPECT_EQ(described(generator.generateLogUsingState(state)), "{}");
  EXPECT_EQ(lookedUp(), "{}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(processing));
}

TEST_F(C2KTemplateTest, TheSortedMarkerStaysAsItIsUnderAnyKey) {
  use(dictionaryOf({{"_sorted", "_sorted"}, {"Other", "_sorted"}, {"Fingers", "kFingerC2I"}}));
  start();
  EXPECT_EQ(displayed(), R"({_sorted: "_sorted", Other: "_sorted", Fingers: ""})");
  EXPECT_EQ(lookedUp(), R"({kFingerC2I: [{key: "Fingers", )"
                        R"(dict: {_sorted: "_sorted", Other: "_sorted", Fingers: ""}}]})");
}

TEST_F(C2KTemplateTest, TheMarkersKeyMayHoldAVariable) {
  use(dictionaryOf({{"_sorted", "kFingerC2I"}}));
  start();
  receive(withoutFingers());
  EXPECT_EQ(displayed(), R"~({_sorted: "(none)"})~");
}

TEST_F(C2KTemplateTest, ValuesThatAreNeitherTextNorDictionaryAreLeftOutSilently) {
  use(dictionaryOf({{"Integer", Value::ofInteger(1)},
                    {"Real", Value::ofReal(1.5)},
                    {"Boolean", Value::ofBoolean(true)},
                    {"Date", Value::ofDate({})},
                    {"Data", Value::ofData({1})},
                    {"Array", Value::ofArray({"kFingerC2I", dictionaryOf({{"A", "kFingerC2I"}})})},
                    {"Fingers", "kFingerC2I"}}));
  start();
  EXPECT_EQ(displayed(), R"({Fingers: ""})");
  EXPECT_EQ(lookedUp(), R"({kFingerC2I: [{key: "Fingers", dict: {Fingers: ""}}]})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(processing));
}

TEST_F(C2KTemplateTest, AnyOtherTextIsAVariableKnownOrNot) {
  use(dictionaryOf({{"Unknown", "kUnheardOf"}, {"Empty", ""}, {"Close", "_Sorted"}}));
  start();
  EXPECT_EQ(displayed(), R"({Unknown: "", Empty: "", Close: ""})");
  const Dictionary* lookup = state.get("Lookup").dictionary();
  ASSERT_TRUE(lookup);
  EXPECT_EQ(lookup->size(), 3u);
  for (const char* variable : {"kUnheardOf", "", "_Sorted"}) {
    const Array* placements = lookup->get(variable).array();
    ASSERT_TRUE(placements) << variable;
    EXPECT_EQ(placements->size(), 1u) << variable;
  }
}

TEST_F(C2KTemplateTest, APlacementRefersToTheDictionaryOfTheDisplayItself) {
  use(dictionaryOf({{"1x", dictionaryOf({{"Fingers", "kFingerC2I"}})}}));
  start();
  const Value placement = state.get("Lookup").dictionary()->get("kFingerC2I").array()->front();
  EXPECT_EQ(placement.dictionary()->get("dict").dictionary(),
            state.get("Display").dictionary()->get("1x").dictionary());
}

TEST_F(C2KTemplateTest, TheTemplateItselfIsNotWrittenInto) {
  const Value displayTemplate = dictionaryOf({{"1x", dictionaryOf({{"Fingers", "kFingerC2I"}})}});
  use(displayTemplate);
  receive(withoutFingers());
  EXPECT_EQ(described(displayTemplate), R"({1x: {Fingers: "kFingerC2I"}})");
  EXPECT_EQ(described(state.get("Template")), R"({1x: {Fingers: "kFingerC2I"}})");
  EXPECT_EQ(displayed(), R"~({1x: {Fingers: "(none)"}})~");
}

TEST_F(C2KTemplateTest, ATemplateOfEmptySectionsMakesALookupWithoutEntries) {
  use(dictionaryOf({{"1x", Value::ofDictionary()}, {"EV-DO", dictionaryOf({{"A", Value::ofDictionary()}})}}));
  receive(withoutFingers());
  EXPECT_EQ(lookedUp(), "{}");
  EXPECT_EQ(displayed(), "{1x: {}, EV-DO: {A: {}}}");
}

// When they are made.

TEST_F(C2KTemplateTest, TheTemplateIsLoadedOnce) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  start();
  receive(withoutFingers());
  generator.generateLogUsingState(state);
  EXPECT_THAT(host.resources.requests(), ElementsAre("C2KTemplate"));
}

TEST_F(C2KTemplateTest, ATemplateInTheStateIsTakenInPlaceOfTheResource) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  state.set("Template", dictionaryOf({{"Pilots", "kActiveSetPilots"}}));
  start();
  EXPECT_EQ(displayed(), R"({Pilots: ""})");
  EXPECT_THAT(host.resources.requests(), IsEmpty());
}

TEST_F(C2KTemplateTest, ADisplayInTheStateIsReturnedAsItIsEvenWithoutALookup) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  state.set("Display", dictionaryOf({{"Old", "x"}, {"Fingers", "y"}}));
  receive(withoutFingers());
  const Value display = generator.generateLogUsingState(state);
  EXPECT_EQ(described(display), R"({Old: "x", Fingers: "y"})");
  EXPECT_EQ(display.dictionary(), state.get("Display").dictionary());
  EXPECT_FALSE(state.has("Lookup"));
  EXPECT_FALSE(state.has("Template"));
  EXPECT_THAT(host.resources.requests(), IsEmpty());
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(C2KTemplateTest, ADisplayOfAnotherKindIsReturnedToo) {
  state.set("Display", "the whole picture");
  receive(withoutFingers());
  EXPECT_EQ(described(generator.generateLogUsingState(state)), R"("the whole picture")");
}

TEST_F(C2KTemplateTest, WithoutExtraInfoTheRatesAreRememberedAllTheSame) {
  state.set("Display", Value::ofDictionary());
  receive(firstRate());
  receive(firstRate());
  EXPECT_EQ(described(state), "{Display: {}, FLDataSeqNum: 7, FLDataSent: 1024}");
}

TEST_F(C2KTemplateTest, ADiscardedDisplayIsRebuiltEmptyFromTheKeptTemplate) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  receive(withoutFingers());
  receive(firstRate());
  EXPECT_EQ(described(state.get("ExtraInfo")), "{FLDataSeqNum1: 7, FLDataSent1: 1024}");
  state.remove("Display");
  log.take();
  EXPECT_EQ(described(generator.generateLogUsingState(state)), R"({Fingers: ""})");
  EXPECT_EQ(lookedUp(), R"({kFingerC2I: [{key: "Fingers", dict: {Fingers: ""}}]})");
  EXPECT_EQ(described(state.get("ExtraInfo")), "{}");
  EXPECT_EQ(state.get("FLDataSeqNum").integer(), 7);
  EXPECT_THAT(log.takeTexts(), ElementsAre(processing));
  EXPECT_THAT(host.resources.requests(), ElementsAre("C2KTemplate"));
  receive(withoutFingers());
  EXPECT_EQ(described(state.get("Display")), R"~({Fingers: "(none)"})~");
}

// A missing template.

TEST_F(C2KTemplateTest, WithoutATemplateEveryCallSaysSoAndNothingIsKept) {
  start();
  EXPECT_EQ(described(state), "{}");
  start();
  EXPECT_THAT(log.takeTexts(), ElementsAre(cannotLoad, cannotLoad));
  EXPECT_THAT(host.resources.requests(), ElementsAre("C2KTemplate", "C2KTemplate"));
}

TEST_F(C2KTemplateTest, AResourceThatIsNoDictionaryIsNoTemplate) {
  for (const Value& resource : {Value("kFingerC2I"), Value::ofArray({"kFingerC2I"}), Value::ofInteger(1)}) {
    use(resource);
    start();
    EXPECT_EQ(described(state), "{}");
    EXPECT_THAT(log.takeTexts(), ElementsAre(cannotLoad));
  }
}

TEST_F(C2KTemplateTest, WithoutATemplatePacketsAreDecodedIntoNothingAndCollected) {
  receive(firstRate());
  receive(withoutFingers());
  EXPECT_EQ(described(state), "{FLDataSeqNum: 7, FLDataSent: 1024}");
  EXPECT_THAT(log.takeTexts(), ElementsAre(cannotLoad, cannotLoad));
  EXPECT_TRUE(generator.generateLogUsingState(state).isAbsent());
  ASSERT_TRUE(state.get("DisplayState").data());
  EXPECT_EQ(state.get("DisplayState").data()->size(), 241u + 23u);
}

TEST_F(C2KTemplateTest, WithoutATemplateAGenerationStillMovesThePacketsIntoTheHistory) {
  receive(withoutFingers());
  log.take();
  EXPECT_TRUE(generator.generateLogUsingState(state).isAbsent());
  EXPECT_THAT(log.takeTexts(), ElementsAre(cannotLoad));
  EXPECT_EQ(described(state.get("History")),
            "[{DisplayState: <0117008a10000000000000000000000000000000000000>}]");
}

TEST_F(C2KTemplateTest, ATemplateThatTurnsUpLaterIsUsed) {
  receive(withoutFingers());
  use(dictionaryOf({{"Fingers", "kFingerC2I"}}));
  receive(withoutFingers());
  EXPECT_EQ(displayed(), R"~({Fingers: "(none)"})~");
}

// Publication.

TEST_F(C2KTemplateTest, AVariableAtTwoPlacesIsWrittenAtBoth) {
  use(dictionaryOf({{"Short", dictionaryOf({{"Fingers", "kFingerC2I"}})},
                    {"Long", dictionaryOf({{"All Fingers", "kFingerC2I"}, {"Again", "kFingerC2I"}})}}));
  receive(withoutFingers());
  EXPECT_EQ(displayed(), R"~({Short: {Fingers: "(none)"}, Long: {All Fingers: "(none)", Again: "(none)"}})~");
}

TEST_F(C2KTemplateTest, AVariableThatTheTemplateDoesNotNameIsSilentlyNotShown) {
  use(dictionaryOf({{"Pilots", "kActiveSetPilots"}}));
  start();
  log.take();
  receive(withoutFingers());
  EXPECT_EQ(displayed(), R"({Pilots: ""})");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(C2KTemplateTest, AValueStaysUntilItsVariableIsPublishedAgain) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}, {"Pilots", "kActiveSetPilots"}}));
  receive(withoutFingers());
  receive(withoutPilots());
  generator.generateLogUsingState(state);
  EXPECT_EQ(displayed(), R"~({Fingers: "(none)", Pilots: "(none)"})~");
}

TEST_F(C2KTemplateTest, AListTakesThePlaceOfATextAndATextThatOfAList) {
  use(dictionaryOf({{"Fingers", "kFingerC2I"}, {"Pilots", "kActiveSetPilots"}}));
  const Bytes oneFinger = PacketBuilder(0x108A, 37).u8(22, 1).u16(23, 420).u16(29, 512).bytes();
  receive(withoutFingers());
  receive(oneFinger);
  EXPECT_EQ(displayed(), R"({Fingers: {_sorted: "_sorted", 0;420: "+0.00 dB"}, Pilots: ""})");
  receive(withoutFingers());
  EXPECT_EQ(displayed(), R"~({Fingers: "(none)", Pilots: ""})~");
}

TEST_F(C2KTemplateTest, ALookupEntryThatIsNoArrayPublishesNothing) {
  const Value section = Value::ofDictionary();
  for (const Value& entry : {dictionaryOf({{"key", "Fingers"}, {"dict", section}}), Value("Fingers")}) {
    state.set("Display", section);
    state.set("Lookup", dictionaryOf({{"kFingerC2I", entry}}));
    receive(withoutFingers());
    EXPECT_EQ(described(section), "{}") << described(entry);
  }
}

TEST_F(C2KTemplateTest, ALookupThatIsNoDictionaryPublishesNothing) {
  state.set("Display", Value::ofDictionary());
  state.set("Lookup", Value::ofArray({"kFingerC2I"}));
  receive(withoutFingers());
  EXPECT_EQ(displayed(), "{}");
}

TEST_F(C2KTemplateTest, ABrokenPlacementEndsThePublication) {
  const Value broken[] = {
      dictionaryOf({{"key", "Broken"}}),
      dictionaryOf({{"key", "Broken"}, {"dict", "no dictionary"}}),
      dictionaryOf({{"key", "Broken"}, {"dict", Value::ofArray()}}),
      dictionaryOf({{"dict", Value::ofDictionary()}}),
      dictionaryOf({{"key", Value::ofInteger(1)}, {"dict", Value::ofDictionary()}}),
      Value::ofDictionary(),
      Value("no placement"),
  };
  for (const Value& placement : broken) {
    const Value before = Value::ofDictionary(), after = Value::ofDictionary();
    state.set("Display", before);
    state.set("Lookup",
              dictionaryOf({{"kFingerC2I",
                             Value::ofArray({dictionaryOf({{"key", "Fingers"}, {"dict", before}}), placement,
                                             dictionaryOf({{"key", "Fingers"}, {"dict", after}})})}}));
    receive(withoutFingers());
    EXPECT_EQ(described(before), R"~({Fingers: "(none)"})~") << described(placement);
    EXPECT_EQ(described(after), "{}") << described(placement);
  }
}

}  // namespace
}  // namespace varnel
