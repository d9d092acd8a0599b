#include "LogGenerator/KLV/GSMUMTS/ProcessCS.h"

#include "tests/LogGenerator/KLV/GSMUMTS/MobilityTexts.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t mobilityCode = 0x7131;
constexpr std::uint32_t registrationCode = 0x7132;
constexpr const char* trace = "<4>ProcessCS";

using ProcessCSTest = RowsDecoderTest<ProcessCS, mobilityCode>;

Bytes mobility(std::uint8_t state, std::uint8_t subState, std::uint8_t update, std::size_t size = 16) {
  return PacketBuilder(mobilityCode, size).fill(0xEE).u8(13, state).u8(14, subState).u8(15, update).bytes();
}
Bytes registration(std::uint8_t state, std::size_t size = 16) {
  return PacketBuilder(registrationCode, size).fill(0xEE).u8(13, state).bytes();
}

TEST_F(ProcessCSTest, AMobilityPacketShowsThreeEntriesInThisOrder) {
  decode(mobility(19, 8, 0));
  EXPECT_EQ(shown(),
            R"({MM State: "MM_IDLE", MM Sub State: "MM_NORMAL_SERVICE", LU Reject Cause: "UPDATED"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ProcessCSTest, ARegistrationPacketShowsItsStateAlone) {
  decode(registration(5), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_AUTOMATIC_SEARCH"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ProcessCSTest, EachCodeKeepsTheEntriesOfTheOther) {
  decode(registration(1), registrationCode);
  decode(mobility(0, 0, 1));
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_IDLE", MM State: "MM_NULL", )"
                     R"(MM Sub State: "MM_NULL_SUBSTATE", LU Reject Cause: "NOT_UPDATED"})");
  decode(registration(6), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_OFFLINE", MM State: "MM_NULL", )"
                     R"(MM Sub State: "MM_NULL_SUBSTATE", LU Reject Cause: "NOT_UPDATED"})");
}

TEST_F(ProcessCSTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(mobilityCode, 18).bytes(), 13, 18,
                          {{"MM State",
                            13,
                            0,
                            "MM_NULL",
                            {"Unknown", "Unknown", "Unknown", "MM_PROCESS_CM_SERVICE_PROMPT", "Unknown",
                             "Unknown", "Unknown", "Unknown"}},
                           {"MM Sub State",
                            14,
                            0,
                            "MM_NULL_SUBSTATE",
                            {"MM_NO_IMSI", "MM_PLMN_SEARCH", "MM_ATTEMPTING_TO_UPDATE", "MM_NORMAL_SERVICE",
                             "Unknown", "Unknown", "Unknown", "Unknown"}},
                           {"LU Reject Cause",
                            15,
                            0,
                            "UPDATED",
                            {"NOT_UPDATED", "ROAMING_NOT_ALLOWED", "Unknown", "Unknown", "Unknown", "Unknown",
                             "Unknown", "Unknown"}}});
}

TEST_F(ProcessCSTest, EachMobilityStateHasItsTextAndAllFrom26OnAreUnknown) {
  expectTableOfByte(mobility(0, 0, 0), 13, "MM State", mobilityStates, "Unknown");
}

TEST_F(ProcessCSTest, MobilityStates1And2And4And11And12And16And24AreUnknownWithinTheTable) {
  for (const std::uint8_t state : {1, 2, 4, 11, 12, 16, 24}) {
    decode(mobility(state, 0, 0));
    EXPECT_EQ(shown("MM State"), R"("Unknown")") << int{state};
  }
}

TEST_F(ProcessCSTest, EachSubStateHasItsTextAndAllFrom9OnAreUnknown) {
  expectTableOfByte(mobility(0, 0, 0), 14, "MM Sub State",
                    {"MM_NULL_SUBSTATE", "MM_NO_IMSI", "MM_PLMN_SEARCH", "MM_LIMITED_SERVICE",
                     "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED", "MM_NO_CELL_AVAILABLE",
                     "MM_PLMN_SEARCH_NORMAL_SERVICE", "MM_NORMAL_SERVICE"},
                    "Unknown");
}

TEST_F(ProcessCSTest, EachLocationUpdateStatusHasItsTextAndAllFrom4OnAreUnknown) {
  expectTableOfByte(mobility(0, 0, 0), 15, "LU Reject Cause",
                    {"UPDATED", "NOT_UPDATED", "ROAMING_NOT_ALLOWED", "LOCATION_AREA_NOT_ALLOWED"},
                    "Unknown");
}

TEST_F(ProcessCSTest, EachRegistrationStateHasItsTextAndAllFrom7OnAreUnknown) {
  expectTableOfByte(registration(0), 13, "MM Service State", registrationStates, "Unknown", registrationCode);
}

TEST_F(ProcessCSTest, PacketsOf16And17BytesAreDecoded) {
  for (const std::size_t size : {16u, 17u}) {
    putOldContent();
    decode(mobility(0, 0, 3, size));
    decode(registration(0, size), registrationCode);
    EXPECT_EQ(shown(), R"({Old: "row", MM State: "MM_NULL", MM Sub State: "MM_NULL_SUBSTATE", )"
                       R"(LU Reject Cause: "LOCATION_AREA_NOT_ALLOWED", )"
                       R"(MM Service State: "REG_STATE_INACTIVE"})")
        << size;
  }
}

}  // namespace
}  // namespace varnel
