#include "LogGenerator/KLV/GSMUMTS/GSMRRInfo.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t stateCode = 0x512C;
constexpr std::uint32_t measurementCode = 0x5137;
constexpr std::uint32_t transmissionCode = 0x5072;
constexpr std::uint32_t timersCode = 0x51F6;
constexpr const char* trace = "<4>GSMRRInfo";

using GSMRRInfoTest = RowsDecoderTest<GSMRRInfo, stateCode>;

Bytes state(std::uint8_t value, std::size_t size = 17) {
  return PacketBuilder(stateCode, size).fill(0xEE).u8(13, value).u8(14, 2).u8(15, 3).u8(16, 0).bytes();
}
Bytes measurement(std::size_t size = 29) {
  return PacketBuilder(measurementCode, size)
      .fill(0xEE)
      .u8(15, 200)
      .u32(16, 0xFFFFFFF6)
      .u32(20, 66051)
      .bytes();
}
Bytes transmission(std::uint8_t flag, std::size_t size = 20) {
  return PacketBuilder(transmissionCode, size).fill(0xEE).u8(19, flag).bytes();
}
Bytes timers(std::uint8_t seconds, std::size_t size = 24) {
  return PacketBuilder(timersCode, size).fill(0xEE).u8(16, seconds).bytes();
}

constexpr const char* stateRows =
    R"({RR State: "RR_IDLE", RR Sub State: "2", RR Status: "3", RR Mode: "Voice"})";
constexpr const char* measurementRows =
    R"({Serving Rx Level: "200", Rx Quality Full: "-10", Rx Quality Sub: "66051"})";

TEST_F(GSMRRInfoTest, AStatePacketShowsFourEntriesInThisOrder) {
  decode(state(5));
  EXPECT_EQ(shown(), stateRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMRRInfoTest, EachStateHasItsTextAndAllFrom22OnAreUnknown) {
  expectTableOfByte(state(0), 13, "RR State",
                    {"RR_INACTIVE",
                     "RR_GOING_ACTIVE",
                     "RR_GOING_INACTIVE",
                     "RR_CELL_SELECTION",
                     "RR_PLMN_LIST_CONSTRUCTION",
                     "RR_IDLE",
                     "RR_CELL_RESELECTION",
                     "RR_CONNECTION_PENDING",
                     "RR_CHOOSE_CELL",
                     "RR_DATA_TRANSFER",
                     "RR_NO_CHANNELS",
                     "RR_CONNECTION_RELEASE",
                     "RR_EARLY_CAMPED_WAIT_FOR_SI",
                     "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
                     "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
                     "RR_WAIT_FOR_EARLY_PSCAN",
                     "GRR51",
                     "GRR52",
                     "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
                     "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
                     "RR_CELL_REEST",
                     "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS"},
                    "Unknown");
}

TEST_F(GSMRRInfoTest, State16ShowsGRR51AndState22IsUnknown) {
  decode(state(16));
  EXPECT_EQ(shown("RR State"), R"("GRR51")");
  decode(state(22));
  EXPECT_EQ(shown("RR State"), R"("Unknown")");
}

TEST_F(GSMRRInfoTest, AnyModeBut0IsData) {
  expectTextOfEachByte(state(0), 16, "RR Mode", [](unsigned mode) { return mode == 0 ? "Voice" : "Data"; });
}

TEST_F(GSMRRInfoTest, EachBitOfAStatePacketCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(stateCode, 19).bytes(), 13, 19,
                          {{"RR State",
                            13,
                            0,
                            "RR_INACTIVE",
                            {"RR_GOING_ACTIVE", "RR_GOING_INACTIVE", "RR_PLMN_LIST_CONSTRUCTION",
                             "RR_CHOOSE_CELL", "GRR51", "Unknown", "Unknown", "Unknown"}},
                           {"RR Sub State", 14, 0, "0", unsignedByteBits},
                           {"RR Status", 15, 0, "0", unsignedByteBits},
                           {"RR Mode", 16, 0, "Voice", std::vector<std::string_view>(8, "Data")}});
}

TEST_F(GSMRRInfoTest, AStatePacketOfAllOnesIsUnsigned) {
  decode(PacketBuilder(stateCode, 17).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({RR State: "Unknown", RR Sub State: "255", RR Status: "255", RR Mode: "Data"})");
}

TEST_F(GSMRRInfoTest, AStatePacketOf18BytesShowsTheSameAsOneOf17) {
  decode(state(5, 18));
  EXPECT_EQ(shown(), stateRows);
}

TEST_F(GSMRRInfoTest, AMeasurementPacketShowsThreeEntriesInThisOrder) {
  decode(measurement(), measurementCode);
  EXPECT_EQ(shown(), measurementRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GSMRRInfoTest, AFullQualityOfMinus10ShowsMinus10) {
  decode(PacketBuilder(measurementCode, 29).u32(16, 0xFFFFFFF6).bytes(), measurementCode);
  EXPECT_EQ(shown("Rx Quality Full"), R"("-10")");
  EXPECT_EQ(shown("Rx Quality Sub"), R"("0")");
}

TEST_F(GSMRRInfoTest, EachBitOfAMeasurementCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(PacketBuilder(measurementCode, 45).bytes(), 13, 45,
                          {{"Serving Rx Level", 15, 0, "0", unsignedByteBits},
                           {"Rx Quality Full", 16, 0, "0", signedLongBits},
                           {"Rx Quality Sub", 20, 0, "0", signedLongBits}},
                          measurementCode);
}

TEST_F(GSMRRInfoTest, AMeasurementPacketOf30BytesShowsTheSameAsOneOf29) {
  decode(measurement(30), measurementCode);
  EXPECT_EQ(shown(), measurementRows);
}

TEST_F(GSMRRInfoTest, DtxIsOnForAnyFlagBut0) {
  expectTextOfEachByte(
      transmission(0), 19, "DTX Used", [](unsigned flag) { return flag == 0 ? "OFF" : "ON"; },
      transmissionCode);
  EXPECT_EQ(shown(), R"({DTX Used: "ON"})");
}

TEST_F(GSMRRInfoTest, NoByteBut19OfATransmissionPacketCounts) {
  expectTextsOfSingleBits(PacketBuilder(transmissionCode, 22).bytes(), 13, 22,
                          {{"DTX Used", 19, 0, "OFF", std::vector<std::string_view>(8, "ON")}},
                          transmissionCode);
}

TEST_F(GSMRRInfoTest, TransmissionPacketsOf20And21BytesAreDecoded) {
  for (const std::size_t size : {20u, 21u}) {
    putOldContent();
    decode(transmission(1, size), transmissionCode);
    EXPECT_EQ(shown(), R"({Old: "row", DTX Used: "ON"})") << size;
  }
}

TEST_F(GSMRRInfoTest, ATimersPacketShowsByte16InSecondsAlone) {
  decode(timers(60), timersCode);
  EXPECT_EQ(shown(), R"({DRX Used: "60 sec"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  expectTextsOfSingleBits(PacketBuilder(timersCode, 26).bytes(), 13, 26,
                          {{"DRX Used",
                            16,
                            0,
                            "0 sec",
                            {"1 sec", "2 sec", "4 sec", "8 sec", "16 sec", "32 sec", "64 sec", "128 sec"}}},
                          timersCode);
}

TEST_F(GSMRRInfoTest, TimersPacketsOf24And25BytesAreDecoded) {
  for (const std::size_t size : {24u, 25u}) {
    putOldContent();
    decode(timers(255, size), timersCode);
    EXPECT_EQ(shown(), R"({Old: "row", DRX Used: "255 sec"})") << size;
  }
}

TEST_F(GSMRRInfoTest, EachCodeKeepsTheEntriesOfTheOthers) {
  decode(timers(1), timersCode);
  decode(measurement(), measurementCode);
  decode(transmission(0), transmissionCode);
  decode(state(5));
  decode(timers(2), timersCode);
  EXPECT_EQ(shown(), R"({DRX Used: "2 sec", Serving Rx Level: "200", Rx Quality Full: "-10", )"
                     R"(Rx Quality Sub: "66051", DTX Used: "OFF", RR State: "RR_IDLE", RR Sub State: "2", )"
                     R"(RR Status: "3", RR Mode: "Voice"})");
}

}  // namespace
}  // namespace varnel
