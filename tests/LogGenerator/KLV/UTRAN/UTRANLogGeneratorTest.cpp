#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>

#include "tests/support/Describe.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class UTRANLogGeneratorTest : public testing::Test {
 protected:
  void make() {
    generator = UTRANLogGenerator::generator(host.services);
    log.take();
  }
  // The name under which a new generator asks for its template; nothing when it does not ask.
  std::vector<std::string> templateName() {
    make();
    generator->updateState_withData(state, {});
    return host.resources.requests();
  }

  RecordingLog log;
  TestServices host;
  std::unique_ptr<LogGenerator> generator;
  Dictionary state;
};

TEST_F(UTRANLogGeneratorTest, TheTemplateIsTheResourceWithUTRANInItsPath) {
  host.resources.add("KLV_GSM", Value::ofDictionary());
  host.resources.add("LTE", Value::ofDictionary());
  host.resources.add("UTRAN", dictionaryOf({{"A", "1"}}));
  EXPECT_THAT(templateName(), ElementsAre("UTRAN"));
  EXPECT_EQ(described(generator->generateLogUsingState(state)), R"({A: "1"})");
}

TEST_F(UTRANLogGeneratorTest, UTRANMayStandAnywhereInThePathInAnyLetterCase) {
  host.resources.add("Rows of uTrAn cells", Value::ofDictionary());
  EXPECT_THAT(templateName(), ElementsAre("Rows of uTrAn cells"));
}

TEST_F(UTRANLogGeneratorTest, UTRANMayStandInTheNameOfAFolder) {
  host.resources.add("Displays/utran/Cells", Value::ofDictionary());
  EXPECT_THAT(templateName(), ElementsAre("Cells"));
}

TEST_F(UTRANLogGeneratorTest, OnlyTheExtensionIsTakenOffTheFileName) {
  host.resources.add("UTRAN.second.edition", Value::ofDictionary());
  EXPECT_THAT(templateName(), ElementsAre("UTRAN.second.edition"));
}

TEST_F(UTRANLogGeneratorTest, OfSeveralTheFirstInNameOrderIsTaken) {
  host.resources.add("b utran", Value::ofDictionary());
  host.resources.add("Z-UTRAN", Value::ofDictionary());
  host.resources.add("E-UTRAN", Value::ofDictionary());
  EXPECT_THAT(templateName(), ElementsAre("E-UTRAN"));
}

class UTRANLogGeneratorWithoutResourceTest : public UTRANLogGeneratorTest {
 protected:
  UTRANLogGeneratorWithoutResourceTest() {
    host.resources.add("LTE", dictionaryOf({{"SIM Info", Value::ofDictionary()}}));
    host.resources.add("UTRA", Value::ofDictionary());
    make();
  }
};

TEST_F(UTRANLogGeneratorWithoutResourceTest, DecodesNothingAndReportsTheMissingTemplate) {
  const Bytes message = serverMessage(0xFF0000, dictionaryOf({{"kSimFile_ICCID", "8949"}}));
  generator->updateState_withData(state, message);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Cannot load template for display"));
  EXPECT_EQ(described(state), "{}");
}

TEST_F(UTRANLogGeneratorWithoutResourceTest, StillReportsAnInvalidType) {
  generator->updateState_withData(state, Bytes(13, 0x02));
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<3>Cannot load template for display", "<3>Invalid log type: 2. Dropping."));
}

TEST_F(UTRANLogGeneratorWithoutResourceTest, StillCollectsTheMessages) {
  generator->updateState_withData(state, Bytes{0x01, 0x02});
  EXPECT_EQ(described(generator->generateLogUsingState(state)), "absent");
  EXPECT_EQ(described(state), "{DisplayState: <0102>, History: [{DisplayState: <0102>}]}");
}

TEST_F(UTRANLogGeneratorWithoutResourceTest, AsksForNoCodes) {
  EXPECT_EQ(described(generator->getStartCommand()),
            R"({SetState: "Streaming", SetKalviLogCodes: [], SetTkExtraCodes: []})");
}

TEST_F(UTRANLogGeneratorWithoutResourceTest, ShowsTheTemplateOfAnEarlierGeneratorWithoutDecoders) {
  state.set("Template", dictionaryOf({{"SIM Info", dictionaryOf({{"EF-ICCID", ""}})}}));
  generator->updateState_withData(state, serverMessage(0xFF0000, dictionaryOf({{"kSimFile_ICCID", "8949"}})));
  char initialized[96];
  std::snprintf(initialized, sizeof initialized, "<4>Initialized class index: 0x0, Self: 0x%" PRIxPTR,
                reinterpret_cast<std::uintptr_t>(generator.get()));
  EXPECT_THAT(log.takeTexts(), ElementsAre(initialized));
  EXPECT_EQ(described(generator->generateLogUsingState(state)), R"({SIM Info: {EF-ICCID: ""}})");
}

TEST_F(UTRANLogGeneratorWithoutResourceTest, AppliesWhenThereIsNoResourceAtAll) {
  TestServices bare;
  const auto idle = UTRANLogGenerator::generator(bare.services);
  log.take();
  idle->updateState_withData(state, Bytes{});
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Cannot load template for display"));
}

}  // namespace
}  // namespace varnel
