#include "LogGenerator/KLV/GSMUMTS/ProcessPS.h"

#include "tests/LogGenerator/KLV/GSMUMTS/MobilityTexts.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t mobilityCode = 0x7130;
constexpr std::uint32_t registrationCode = 0x7132;
constexpr const char* trace = "<4>ProcessPS";

using ProcessPSTest = RowsDecoderTest<ProcessPS, mobilityCode>;

Bytes mobility(std::uint8_t state, std::uint8_t subState, std::uint8_t update, std::size_t size = 16) {
  return PacketBuilder(mobilityCode, size).fill(0xEE).u8(13, state).u8(14, subState).u8(15, update).bytes();
}
Bytes registration(std::uint8_t state, std::size_t size = 16) {
  return PacketBuilder(registrationCode, size).fill(0xEE).u8(13, state).bytes();
}

TEST_F(ProcessPSTest, AMobilityPacketShowsThreeEntriesInThisOrder) {
  decode(mobility(3, 0, 0));
  EXPECT_EQ(shown(), R"({MM State: "GMM_REGISTERED", MM Sub State: "GMM_NORMAL_SERVICE", )"
                     R"(Attach Reject Cause: "GMM_GU1_UPDATED"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ProcessPSTest, ARegistrationPacketShowsItsStateAlone) {
  decode(registration(4), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_MANUAL_SEARCH"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ProcessPSTest, EachCodeKeepsTheEntriesOfTheOther) {
  decode(registration(1), registrationCode);
  decode(mobility(0, 12, 1));
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_IDLE", MM State: "GMM_NULL", )"
                     R"(MM Sub State: "GMM_NULL_SUBSTATE", Attach Reject Cause: "GMM_GU2_NOT_UPDATED"})");
  decode(registration(3), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_DEREGISTERING", MM State: "GMM_NULL", )"
                     R"(MM Sub State: "GMM_NULL_SUBSTATE", Attach Reject Cause: "GMM_GU2_NOT_UPDATED"})");
}

TEST_F(ProcessPSTest, EachBitCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(mobilityCode, 18).bytes(), 13, 18,
                          {{"MM State",
                            13,
                            0,
                            "GMM_NULL",
                            {"GMM_DEREGISTERED", "GMM_REGISTERED_INITIATED", "GMM_DEREGISTERED_INITIATED",
                             "Unknown", "Unknown", "Unknown", "Unknown", "Unknown"}},
                           {"MM Sub State",
                            14,
                            0,
                            "GMM_NORMAL_SERVICE",
                            {"GMM_LIMITED_SERVICE", "GMM_ATTACH_NEEDED", "GMM_NO_IMSI", "GMM_UPDATE_NEEDED",
                             "Unknown", "Unknown", "Unknown", "Unknown"}},
                           {"Attach Reject Cause",
                            15,
                            0,
                            "GMM_GU1_UPDATED",
                            {"GMM_GU2_NOT_UPDATED", "GMM_GU3_PLMN_NOT_ALLOWED", "Unknown", "Unknown",
                             "Unknown", "Unknown", "Unknown", "Unknown"}}});
}

TEST_F(ProcessPSTest, EachStateHasItsTextAndAllFrom7OnAreUnknown) {
  expectTableOfByte(
      mobility(0, 0, 0), 13, "MM State",
      {"GMM_NULL", "GMM_DEREGISTERED", "GMM_REGISTERED_INITIATED", "GMM_REGISTERED",
       "GMM_DEREGISTERED_INITIATED", "GMM_ROUTING_AREA_UPDATE_INITIATED", "GMM_SERVICE_REQUEST_INITIATED"},
      "Unknown");
}

TEST_F(ProcessPSTest, EachSubStateHasItsTextAndAllFrom13OnAreUnknown) {
  expectTableOfByte(mobility(0, 0, 0), 14, "MM Sub State",
                    {"GMM_NORMAL_SERVICE", "GMM_LIMITED_SERVICE", "GMM_ATTACH_NEEDED",
                     "GMM_ATTEMPTING_TO_ATTACH", "GMM_NO_IMSI", "GMM_NO_CELL_AVAILABLE", "GMM_PLMN_SEARCH",
                     "GMM_SUSPENDED", "GMM_UPDATE_NEEDED", "GMM_ATTEMPING_TO_UPDATE",
                     "GMM_ATTEMPTING_TO_UPDATE_MM", "GMM_IMSI_DETACH_INITIATED", "GMM_NULL_SUBSTATE"},
                    "Unknown");
}

TEST_F(ProcessPSTest, EachUpdateStatusHasItsTextAndAllFrom4OnAreUnknown) {
  expectTableOfByte(mobility(0, 0, 0), 15, "Attach Reject Cause",
                    {"GMM_GU1_UPDATED", "GMM_GU2_NOT_UPDATED", "GMM_GU3_PLMN_NOT_ALLOWED",
                     "GMM_GU3_ROUTING_AREA_NOT_ALLOWED"},
                    "Unknown");
}

TEST_F(ProcessPSTest, EachRegistrationStateHasItsTextAndAllFrom7OnAreUnknown) {
  expectTableOfByte(registration(0), 13, "MM Service State", registrationStates, "Unknown", registrationCode);
}

TEST_F(ProcessPSTest, PacketsOf16And17BytesAreDecoded) {
  for (const std::size_t size : {16u, 17u}) {
    putOldContent();
    decode(mobility(1, 6, 3, size));
    decode(registration(0, size), registrationCode);
    EXPECT_EQ(shown(), R"({Old: "row", MM State: "GMM_DEREGISTERED", MM Sub State: "GMM_PLMN_SEARCH", )"
                       R"(Attach Reject Cause: "GMM_GU3_ROUTING_AREA_NOT_ALLOWED", )"
                       R"(MM Service State: "REG_STATE_INACTIVE"})")
        << size;
  }
}

}  // namespace
}  // namespace varnel
