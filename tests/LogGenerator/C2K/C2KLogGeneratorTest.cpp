#include "LogGenerator/C2K/C2KLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>
#include <optional>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class C2KLogGeneratorTest : public testing::Test {
 protected:
  C2KLogGeneratorTest() {
    host.clock.set({1709301909, 0});  // 2024-03-01 14:05:09 UTC
    host.resources.add("C2KTemplate", dictionaryOf({{"EV-DO", dictionaryOf({{"Fingers", "kFingerC2I"}})}}));
  }

  RecordingLog log;
  TestServices host;
  Dictionary state;
};

Bytes withoutFingers() { return PacketBuilder(0x108A, 23).bytes(); }

TEST_F(C2KLogGeneratorTest, TheRegistryMakesItForKalviCDMA) {
  const auto generator = LogGenerator::generatorFromTechnology("kalvi-cdma", host.services);
  EXPECT_NE(dynamic_cast<C2KLogGenerator*>(generator.get()), nullptr);
  EXPECT_NE(LogGenerator::generatorFromTechnology("kalvi-cdma", host.services), generator);
}

TEST_F(C2KLogGeneratorTest, ItsOnlyLifeLineIsThatOfItsCreation) {
  {
    const auto generator = C2KLogGenerator::generator(host.services);
    char line[64];
    std::snprintf(line, sizeof line, "<4>Creating Log object: 0x%" PRIxPTR,
                  reinterpret_cast<std::uintptr_t>(generator.get()));
    EXPECT_THAT(log.takeTexts(), ElementsAre(line));
  }
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(host.standardOutput.str(), "");
  EXPECT_THAT(host.resources.requests(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, TheLinesOfAFirstGenerationAreThoseOfItsTemplate) {
  const auto generator = C2KLogGenerator::generator(host.services);
  log.take();
  generator->generateLogUsingState(state);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>Processing the template", "<4>Processing the template"));
  generator->generateLogUsingState(state);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(host.standardOutput.str(), "");
}

TEST_F(C2KLogGeneratorTest, TheStartCommandAsksForEightLogCodesInThisOrder) {
  const C2KLogGenerator generator(host.services);
  EXPECT_EQ(described(generator.getStartCommand()),
            R"({SetState: "Streaming", )"
            R"(SetKalviLogCodes: [4234, 4483, 4498, 4790, 4508, 4509, 4734, 4943]})");
  EXPECT_THAT(host.resources.requests(), IsEmpty());
}

TEST_F(C2KLogGeneratorTest, AGenerationReturnsTheDisplayItself) {
  C2KLogGenerator generator(host.services);
  const Value display = generator.generateLogUsingState(state);
  EXPECT_EQ(described(display), R"({EV-DO: {Fingers: ""}})");
  EXPECT_EQ(display.dictionary(), state.get("Display").dictionary());
  generator.updateState_withData(state, withoutFingers());
  EXPECT_EQ(generator.generateLogUsingState(state).dictionary(), display.dictionary());
  EXPECT_EQ(described(display), R"~({EV-DO: {Fingers: "(none)"}})~");
}

TEST_F(C2KLogGeneratorTest, TwoGenerationsWithoutAPacketBetweenStoreNoBytesTheSecondTime) {
  C2KLogGenerator generator(host.services);
  generator.updateState_withData(state, withoutFingers());
  generator.generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), described(withoutFingers()));
  generator.generateLogUsingState(state);
  EXPECT_EQ(described(state.get("DisplayState")), "<>");
}

TEST_F(C2KLogGeneratorTest, EachGenerationIsRecordedWithThePacketsSinceTheLast) {
  C2KLogGenerator generator(host.services);
  generator.updateState_withData(state, withoutFingers());
  generator.generateLogUsingState(state);
  EXPECT_EQ(described(state.get("History")),
            R"([{DisplayState: <0117008a10000000000000000000000000000000000000>, )"
            R"~(Display: {EV-DO: {Fingers: "(none)"}}, ExtraInfo: {}, )~"
            R"~(Date: "2024-03-01 14:05:09 +0000", )~"
            R"~(Description: "Snapshot (2024-03-01 14:05:09 +0000)"}])~");
  for (int i = 0; i < 7; ++i) generator.generateLogUsingState(state);
  EXPECT_EQ(state.get("History").array()->size(), 5u);
}

TEST_F(C2KLogGeneratorTest, AMessageMakesTheDisplayButNoRecord) {
  C2KLogGenerator generator(host.services);
  generator.updateState_withData(state, withoutFingers());
  EXPECT_TRUE(state.has("Display"));
  EXPECT_FALSE(state.has("History"));
  EXPECT_FALSE(state.has("DisplayState"));
}

TEST_F(C2KLogGeneratorTest, AnotherGeneratorFindsTheStateAndContinues) {
  {
    C2KLogGenerator first(host.services);
    first.updateState_withData(state, PacketBuilder(0x1192, 241).u32(13, 7).u32(17, 8).bytes());
    first.updateState_withData(state, withoutFingers());
  }
  C2KLogGenerator second(host.services);
  EXPECT_EQ(described(second.generateLogUsingState(state)), R"~({EV-DO: {Fingers: "(none)"}})~");
  EXPECT_EQ(described(state.get("DisplayState")), "<>");
  second.updateState_withData(state, PacketBuilder(0x1192, 241).u32(13, 8).u32(17, 16).bytes());
  EXPECT_EQ(described(state.get("ExtraInfo")),
            "{FLDataSeqNum1: 8, FLDataSent1: 2048, FLDataSeqNum2: 7, FLDataSent2: 1024}");
}

TEST_F(C2KLogGeneratorTest, TheSaveContentsAreTheHistoryAndTheBinaryLog) {
  C2KLogGenerator generator(host.services);
  generator.updateState_withData(state, withoutFingers());
  generator.updateState_withData(state, Bytes{0x81, 0x00, 0x01, 0x0D, 0x00, 0x83, 0x11, 0, 0, 0, 0, 0, 0, 0,
                                              0});  // refused, yet collected without its prefix
  generator.generateLogUsingState(state);
  generator.generateLogUsingState(state);
  generator.updateState_withData(state, withoutFingers());  // of the interval that has not ended
  const Value contents = generator.getSaveContentsFromState(state);
  const Array* items = contents.array();
  ASSERT_TRUE(items);
  ASSERT_EQ(items->size(), 3u);
  EXPECT_EQ((*items)[0].dictionary(), state.get("History").array()->front().dictionary());
  const Dictionary* binaryLog = (*items)[2].dictionary();
  ASSERT_TRUE(binaryLog);
  EXPECT_EQ(described(binaryLog->get("Description")), R"~("DLF binary (196 bytes)")~");
  const Bytes* dlf = binaryLog->get("DLF").data();
  ASSERT_TRUE(dlf);
  EXPECT_EQ(described(ByteView(*dlf).first(4)), "<a100fd1f>");
  // The first packet lacks its log type; the second one keeps it.
  EXPECT_EQ(described(ByteView(*dlf).subspan(161)),
            "<17008a10000000000000000000000000000000000000"
            "010d0083110000000000000000>");
}

TEST_F(C2KLogGeneratorTest, WithoutHistoryTheSaveContentsAreTheVersionReportAlone) {
  const C2KLogGenerator generator(host.services);
  const Value contents = generator.getSaveContentsFromState(state);
  ASSERT_EQ(contents.array()->size(), 1u);
  EXPECT_EQ(described(contents.array()->front().dictionary()->get("Description")),
            R"~("DLF binary (161 bytes)")~");
}

}  // namespace
}  // namespace varnel
