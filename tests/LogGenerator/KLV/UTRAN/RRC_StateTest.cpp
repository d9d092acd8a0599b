#include "LogGenerator/KLV/UTRAN/RRC_State.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t stateCode = 0xD0E0;
constexpr const char* trace = "<4>RRC Info";
constexpr const char* unknownState =
    "<4>Display Dict = {State = \"Unknown RRC Mode\"; }, rrc mode = 255 Unknown RRC Mode";

using RRC_StateTest = RowsDecoderTest<RRC_State, stateCode>;

Bytes state(std::uint8_t version, std::uint8_t mode, std::size_t size = 15) {
  return PacketBuilder(stateCode, size).fill(0xEE).u8(13, version).u8(14, mode).bytes();
}

TEST_F(RRC_StateTest, AStateIsShownThenTheWholeSectionIsLogged) {
  decode(state(1, 3));
  EXPECT_EQ(shown(), R"({State: "Cell DCH"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<4>Display Dict = {State = \"Cell DCH\"; }, rrc mode = 3 Cell DCH"));
}

TEST_F(RRC_StateTest, TheSectionIsLoggedWithEveryEntryInItsOrder) {
  section.dictionary()->set("First", "a");
  section.dictionary()->set("State", "");
  section.dictionary()->set("Last", "b");
  decode(state(1, 2));
  EXPECT_EQ(shown(), R"({First: "a", State: "Cell Fach", Last: "b"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace,
                          "<4>Display Dict = {First = \"a\"; State = \"Cell Fach\"; Last = \"b\"; }, "
                          "rrc mode = 2 Cell Fach"));
}

TEST_F(RRC_StateTest, EachModeHasItsTextAndAllOthersAreUnknown) {
  for (unsigned mode = 0; mode < 256; ++mode) {
    std::string text = "Unknown RRC Mode";
    if (mode == 0) text = "Disconnected";
    if (mode == 1) text = "Connecting";
    if (mode == 2) text = "Cell Fach";
    if (mode == 3) text = "Cell DCH";
    if (mode == 4) text = "Cell PCH";
    if (mode == 5) text = "Cell URA PCH";
    decode(state(1, static_cast<std::uint8_t>(mode)));
    EXPECT_EQ(shown(), "{State: \"" + text + "\"}") << mode;
    EXPECT_THAT(log.takeTexts(),
                ElementsAre(trace, "<4>Display Dict = {State = \"" + text +
                                       "\"; }, rrc mode = " + std::to_string(mode) + " " + text));
  }
}

TEST_F(RRC_StateTest, Version1AndMode5ShowCellUraPchAndMode6IsUnknown) {
  decode(state(1, 5));
  EXPECT_EQ(shown("State"), R"("Cell URA PCH")");
  decode(state(1, 6));
  EXPECT_EQ(shown("State"), R"("Unknown RRC Mode")");
}

TEST_F(RRC_StateTest, Version2AndMode3ShowAnUnknownMode) {
  decode(state(2, 3));
  EXPECT_EQ(shown(), R"({State: "Unknown RRC Mode"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace, unknownState));
}

TEST_F(RRC_StateTest, EveryVersionBut1HasMode255) {
  for (unsigned version = 0; version < 256; ++version) {
    if (version == 1) continue;
    decode(state(static_cast<std::uint8_t>(version), 3));
    EXPECT_THAT(log.takeTexts(), ElementsAre(trace, unknownState)) << version;
  }
}

TEST_F(RRC_StateTest, AStateOf16BytesIsTakenLikeOneOf15) {
  decode(state(1, 4, 16));
  EXPECT_EQ(shown(), R"({State: "Cell PCH"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<4>Display Dict = {State = \"Cell PCH\"; }, rrc mode = 4 Cell PCH"));
}

TEST_F(RRC_StateTest, AStateOf14BytesIsWarnedAboutAndTakenWithMode255) {
  Bytes packet = state(1, 0);
  packet.pop_back();
  decode(packet);
  EXPECT_EQ(shown(), R"({State: "Unknown RRC Mode"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre(trace, "<4>LogCode_0xD0E0 is length is 14 expected size 15", unknownState));
}

TEST_F(RRC_StateTest, EveryTruncatedStateIsWarnedAboutAndTakenWithMode255) {
  forEachTruncation(state(1, 3), [&](std::size_t size, const std::vector<std::string>& lines) {
    EXPECT_EQ(shown(), R"({Old: "row", State: "Unknown RRC Mode"})");
    EXPECT_THAT(
        lines,
        ElementsAre(trace, "<4>LogCode_0xD0E0 is length is " + std::to_string(size) + " expected size 15",
                    "<4>Display Dict = {Old = \"row\"; State = \"Unknown RRC Mode\"; }, "
                    "rrc mode = 255 Unknown RRC Mode"));
  });
}

TEST_F(RRC_StateTest, AMissingSectionIsLoggedAsNull) {
  EXPECT_THAT(linesWithoutSection(state(1, 3)),
              ElementsAre(trace, "<4>Display Dict = (null), rrc mode = 3 Cell DCH"));
  EXPECT_THAT(linesWithoutSection({}),
              ElementsAre(trace, "<4>LogCode_0xD0E0 is length is 0 expected size 15",
                          "<4>Display Dict = (null), rrc mode = 255 Unknown RRC Mode"));
  EXPECT_THAT(linesWithoutSection(state(1, 3), 0xD0E2), ElementsAre(trace));
}

}  // namespace
}  // namespace varnel
