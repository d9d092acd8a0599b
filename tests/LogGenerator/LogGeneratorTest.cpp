#include "LogGenerator/LogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <sstream>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"
#include "LogGenerator/KLV/LTE/LTEClassIndex.h"
#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"
#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// A generator that does nothing but keep a history.
class IdleGenerator final : public LogGenerator {
 public:
  using LogGenerator::LogGenerator;
  using LogGenerator::updateHistoryInState;

  void updateState_withData(Dictionary&, ByteView) override {}
  Value generateLogUsingState(Dictionary&) override { return {}; }
  Value getStartCommand() const override { return {}; }
  Value getSaveContentsFromState(const Dictionary&) const override { return {}; }
};

class LogGeneratorTest : public testing::Test {
 protected:
  std::unique_ptr<LogGenerator> generatorFor(const Value& technology) {
    return LogGenerator::generatorFromTechnology(technology, host.services);
  }

  RecordingLog log;
  TestServices host;
};

TEST_F(LogGeneratorTest, ConstructionLogsItsAddress) {
  const IdleGenerator generator(host.services);
  char line[64];
  std::snprintf(line, sizeof line, "<4>Creating Log object: 0x%" PRIxPTR,
                reinterpret_cast<std::uintptr_t>(&generator));
  EXPECT_THAT(log.takeTexts(), ElementsAre(line));
}

TEST_F(LogGeneratorTest, EachTechnologyHasItsGenerator) {
  EXPECT_NE(dynamic_cast<GSMLogGenerator*>(generatorFor("ifx-gsm").get()), nullptr);
  EXPECT_NE(dynamic_cast<KLV_GSMLogGenerator*>(generatorFor("kalvi-gsm-umts").get()), nullptr);
  EXPECT_NE(dynamic_cast<C2KLogGenerator*>(generatorFor("kalvi-cdma").get()), nullptr);
  EXPECT_NE(dynamic_cast<LTELogGenerator*>(generatorFor("kalvi-lte").get()), nullptr);
  EXPECT_NE(dynamic_cast<UTRANLogGenerator*>(generatorFor("kalvi-utran-2").get()), nullptr);
}

TEST_F(LogGeneratorTest, EachCallMakesAnotherGenerator) {
  const auto first = generatorFor("kalvi-lte");
  const auto second = generatorFor("kalvi-lte");
  EXPECT_NE(first, second);
}

TEST_F(LogGeneratorTest, ATechnologyWithoutGeneratorYieldsNothingSilently) {
  const Value technologies[] = {"kalvi-cdma-2",
                                "ifx",
                                "kalvi-utran",
                                "kalvi-utran-22",
                                "Kalvi-LTE",
                                "kalvi-lte ",
                                "",
                                Value(),
                                Value::ofInteger(4),
                                Value::ofArray({"kalvi-lte"}),
                                dictionaryOf({{"kalvi-lte", "kalvi-lte"}})};
  for (const Value& technology : technologies) {
    EXPECT_EQ(generatorFor(technology), nullptr) << described(technology);
  }
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

struct TemplateOfTechnology {
  const char* technology;
  const char* resource;
};

TEST_F(LogGeneratorTest, EachTechnologyHasItsTemplate) {
  constexpr TemplateOfTechnology templates[] = {{"kalvi-gsm-umts", "KLV_GSM"},
                                                {"kalvi-cdma", "C2KTemplate"},
                                                {"kalvi-lte", "LTE"},
                                                {"kalvi-utran-2", "UTRAN"}};
  for (const auto& [technology, resource] : templates) {
    TestServices own;
    own.resources.add("KLV_GSM", Value::ofDictionary());
    own.resources.add("C2KTemplate", Value::ofDictionary());
    own.resources.add("LTE", Value::ofDictionary());
    own.resources.add("UTRAN", Value::ofDictionary());
    Dictionary state;
    LogGenerator::generatorFromTechnology(technology, own.services)->updateState_withData(state, {});
    EXPECT_THAT(own.resources.requests(), ElementsAre(resource)) << technology;
  }
}

// The codes that a start command asks for as a class index has them: those of the modem, then the others.
std::vector<std::string> askedFor(const Value& startCommand) {
  std::vector<std::string> codes;
  for (const Value& code : *startCommand.dictionary()->get("SetKalviLogCodes").array())
    codes.push_back(std::to_string(code.integer().value()));
  for (const Value& code : *startCommand.dictionary()->get("SetTkExtraCodes").array())
    codes.push_back(std::to_string(0xFF0000 + code.integer().value()));
  return codes;
}

template <class Index>
std::vector<std::string> codesOf() {
  std::ostringstream standardOutput;
  std::vector<std::string> codes = Index(standardOutput).getAllLogCodes();
  std::stable_partition(codes.begin(), codes.end(),
                        [](const std::string& code) { return std::stol(code) < 0xFF0000; });
  return codes;
}

TEST_F(LogGeneratorTest, TheStartCommandAsksForTheCodesOfTheTechnologysDecoders) {
  host.resources.add("UTRAN", Value::ofDictionary());
  EXPECT_EQ(askedFor(generatorFor("kalvi-lte")->getStartCommand()), codesOf<LTEClassIndex>());
  EXPECT_EQ(askedFor(generatorFor("kalvi-gsm-umts")->getStartCommand()), codesOf<KLV_GSMClassIndex>());
  EXPECT_EQ(askedFor(generatorFor("kalvi-utran-2")->getStartCommand()), codesOf<UTRANClassIndex>());
}

TEST_F(LogGeneratorTest, EveryTruncatedMessageOfEachTechnologyIsSurvived) {
  const Bytes messages[] = {
      PacketBuilder(0xB0C2, 38).bytes(),
      PacketBuilder(0xB0C1, 22).bytes(),
      PacketBuilder(0x1183, 50).bytes(),
      serverMessage(0xFF0001, Value::ofArray({dictionaryOf({{"CellType", "Serving"}})})),
      serverMessage(0xFF0002, Value::ofArray({"context"})),
  };
  host.resources.add("KLV_GSM", Value::ofDictionary());
  host.resources.add("C2KTemplate", Value::ofDictionary());
  host.resources.add("LTE", Value::ofDictionary());
  host.resources.add("UTRAN", Value::ofDictionary());
  for (const char* technology : {"kalvi-gsm-umts", "kalvi-cdma", "kalvi-lte", "kalvi-utran-2"}) {
    const auto generator = generatorFor(technology);
    Dictionary state;
    for (Bytes message : messages) {
      while (!message.empty()) {
        generator->updateState_withData(state, message);
        message.pop_back();
      }
    }
    EXPECT_EQ(described(generator->generateLogUsingState(state)), "{}") << technology;
  }
}

class HistoryTest : public LogGeneratorTest {
 protected:
  HistoryTest() { host.clock.set({1709301909, 999999999}); }  // 2024-03-01 14:05:09 UTC and nearly a second

  std::string history() const { return described(state.get("History")); }

  IdleGenerator generator{host.services};
  Dictionary state;
};

TEST_F(HistoryTest, ARecordHoldsFiveEntriesInThisOrder) {
  state.set("ExtraInfo", Value::ofDictionary());
  state.set("Display", dictionaryOf({{"RRC Info", dictionaryOf({{"State", "Idle"}})}}));
  state.set("DisplayState", Value::ofData({0x01, 0x02}));
  state.set("Template", Value::ofDictionary());
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(),
            R"([{DisplayState: <0102>, Display: {RRC Info: {State: "Idle"}}, ExtraInfo: {}, )"
            R"~(Date: "2024-03-01 14:05:09 +0000", Description: "Snapshot (2024-03-01 14:05:09 +0000)"}])~");
}

TEST_F(HistoryTest, TheDateIsInUTCWhateverTheLocalZone) {
  host.clock.setZone({-12600, true});
  host.clock.set({0, 0});
  state.set("DisplayState", Value::ofData({}));
  state.set("Display", Value::ofDictionary());
  state.set("ExtraInfo", Value::ofDictionary());
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(), R"([{DisplayState: <>, Display: {}, ExtraInfo: {}, )"
                       R"(Date: "1970-01-01 00:00:00 +0000", )"
                       R"~(Description: "Snapshot (1970-01-01 00:00:00 +0000)"}])~");
}

TEST_F(HistoryTest, ARecordWithoutDisplayStateIsEmptyYetAppendedAndCounted) {
  state.set("Display", Value::ofDictionary());
  state.set("ExtraInfo", Value::ofDictionary());
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(), "[{}]");
  for (int i = 0; i < 5; ++i) generator.updateHistoryInState(state);
  EXPECT_EQ(history(), "[{}, {}, {}, {}, {}]");
}

TEST_F(HistoryTest, ARecordWithoutDisplayHoldsTheDisplayStateOnly) {
  state.set("DisplayState", Value::ofData({0xAA}));
  state.set("ExtraInfo", Value::ofDictionary());
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(), "[{DisplayState: <aa>}]");
}

TEST_F(HistoryTest, ARecordWithoutExtraInfoHoldsDisplayStateAndDisplayOnly) {
  state.set("DisplayState", Value::ofData({0xAA}));
  state.set("Display", dictionaryOf({{"A", "1"}}));
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(), R"([{DisplayState: <aa>, Display: {A: "1"}}])");
}

TEST_F(HistoryTest, TheTopLevelContainersAreCopiedAndTheSectionsShared) {
  const Value section = dictionaryOf({{"State", "Idle"}});
  const Value display = dictionaryOf({{"RRC Info", section}});
  const Value extraInfo = Value::ofDictionary();
  const Value displayState = dictionaryOf({{"Object", "1"}});
  state.set("DisplayState", displayState);
  state.set("Display", display);
  state.set("ExtraInfo", extraInfo);
  generator.updateHistoryInState(state);
  section.dictionary()->set("State", "Connected");
  display.dictionary()->set("New Section", "unseen");
  extraInfo.dictionary()->set("New", "unseen");
  displayState.dictionary()->set("Object", "unseen");
  EXPECT_EQ(history(),
            R"([{DisplayState: {Object: "1"}, Display: {RRC Info: {State: "Connected"}}, ExtraInfo: {}, )"
            R"~(Date: "2024-03-01 14:05:09 +0000", Description: "Snapshot (2024-03-01 14:05:09 +0000)"}])~");
}

TEST_F(HistoryTest, OfSixUpdatesTheLastFiveRemain) {
  for (std::uint8_t call = 1; call <= 6; ++call) {
    state.set("DisplayState", Value::ofData({call}));
    generator.updateHistoryInState(state);
    if (call == 5) {
      EXPECT_EQ(history(),
                "[{DisplayState: <01>}, {DisplayState: <02>}, {DisplayState: <03>}, "
                "{DisplayState: <04>}, {DisplayState: <05>}]");
    }
  }
  EXPECT_EQ(history(),
            "[{DisplayState: <02>}, {DisplayState: <03>}, {DisplayState: <04>}, "
            "{DisplayState: <05>}, {DisplayState: <06>}]");
}

TEST_F(HistoryTest, ALongerHistoryIsCutToTheNewestFour) {
  state.set("History", Value::ofArray({"1", "2", "3", "4", "5", "6", "7", "8"}));
  generator.updateHistoryInState(state);
  EXPECT_EQ(history(), R"(["5", "6", "7", "8", {}])");
}

TEST_F(HistoryTest, TheHistoryStaysTheSameArray) {
  generator.updateHistoryInState(state);
  const Array* array = state.get("History").array();
  for (int i = 0; i < 7; ++i) generator.updateHistoryInState(state);
  EXPECT_EQ(state.get("History").array(), array);
}

TEST_F(HistoryTest, NothingElseInTheStateChangesAndNothingIsLogged) {
  state.set("DisplayState", Value::ofData({0xAA}));
  log.take();
  generator.updateHistoryInState(state);
  EXPECT_EQ(described(state), "{DisplayState: <aa>, History: [{DisplayState: <aa>}]}");
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

}  // namespace
}  // namespace varnel
