#include "LogGenerator/KLV/GSMUMTS/ProcessCO.h"

#include "tests/LogGenerator/KLV/GSMUMTS/MobilityTexts.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t mobilityCode = 0x7131;
constexpr std::uint32_t registrationCode = 0x7132;
// The text of its sibling.
constexpr const char* trace = "<4>ProcessCS";

using ProcessCOTest = RowsDecoderTest<ProcessCO, mobilityCode>;

Bytes mobility(std::uint8_t state, std::size_t size = 16) {
  return PacketBuilder(mobilityCode, size).fill(0xEE).u8(13, state).bytes();
}
Bytes registration(std::uint8_t state, std::size_t size = 16) {
  return PacketBuilder(registrationCode, size).fill(0xEE).u8(13, state).bytes();
}

TEST_F(ProcessCOTest, AMobilityPacketShowsItsStateAlone) {
  decode(mobility(19));
  EXPECT_EQ(shown(), R"({MM State: "MM_IDLE"})");
}

TEST_F(ProcessCOTest, ARegistrationPacketShowsItsStateAlone) {
  decode(registration(2), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_REGISTERING"})");
}

TEST_F(ProcessCOTest, TheTraceLineOfProcessCSIsWrittenForEachPacket) {
  decode(mobility(19));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  decode(registration(2), registrationCode);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ProcessCOTest, EachCodeKeepsTheEntryOfTheOther) {
  decode(registration(1), registrationCode);
  decode(mobility(6));
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_IDLE", MM State: "MM_CONNECTION_ACTIVE"})");
  decode(registration(6), registrationCode);
  EXPECT_EQ(shown(), R"({MM Service State: "REG_STATE_OFFLINE", MM State: "MM_CONNECTION_ACTIVE"})");
}

TEST_F(ProcessCOTest, EachMobilityStateHasItsTextAndAllFrom26OnAreUnknown) {
  expectTableOfByte(mobility(0), 13, "MM State", mobilityStates, "Unknown");
}

TEST_F(ProcessCOTest, MobilityStates1And2And4And11And12And16And24AreUnknownWithinTheTable) {
  for (const std::uint8_t state : {1, 2, 4, 11, 12, 16, 24}) {
    decode(mobility(state));
    EXPECT_EQ(shown("MM State"), R"("Unknown")") << int{state};
  }
}

TEST_F(ProcessCOTest, MobilityState25IsTheLastAnd26IsUnknown) {
  decode(mobility(25));
  EXPECT_EQ(shown("MM State"), R"("MM_RR_CONNECTION_RELEASE_NOT_ALLOWED")");
  decode(mobility(26));
  EXPECT_EQ(shown("MM State"), R"("Unknown")");
}

TEST_F(ProcessCOTest, MobilityStates20And21HaveABlankBehindTheirLastUnderscore) {
  decode(mobility(20));
  EXPECT_EQ(shown("MM State"), R"("MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION")");
  decode(mobility(21));
  EXPECT_EQ(shown("MM State"), R"("MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT")");
}

TEST_F(ProcessCOTest, EachRegistrationStateHasItsTextAndAllFrom7OnAreUnknown) {
  expectTableOfByte(registration(0), 13, "MM Service State", registrationStates, "Unknown", registrationCode);
}

TEST_F(ProcessCOTest, PacketsOf16And17BytesAreDecoded) {
  for (const std::size_t size : {16u, 17u}) {
    putOldContent();
    decode(mobility(0, size));
    decode(registration(0, size), registrationCode);
    EXPECT_EQ(shown(), R"({Old: "row", MM State: "MM_NULL", MM Service State: "REG_STATE_INACTIVE"})")
        << size;
  }
}

}  // namespace
}  // namespace varnel
