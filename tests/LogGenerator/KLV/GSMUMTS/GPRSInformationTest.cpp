#include "LogGenerator/KLV/GSMUMTS/GPRSInformation.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t positionCode = 0x51F4;
constexpr std::uint32_t accessCode = 0x51F5;
constexpr std::uint32_t timersCode = 0x51F6;
constexpr std::uint32_t broadcastCode = 0x51FB;
constexpr std::uint32_t packetSystemCode = 0x51FD;
constexpr std::uint32_t measurementCode = 0x5137;
constexpr std::uint32_t networkCode = 0x7135;
constexpr const char* trace = "<4>GPRSInformation";

class GPRSInformationTest : public RowsDecoderTest<GPRSInformation, accessCode> {
 protected:
  /// The minimum length shows the entries, one byte more as well, one byte less is dropped.
  void expectMinimumLength(std::size_t minimum, std::uint32_t logCode, const std::string& rowsOfZeros) {
    for (const std::size_t size : {minimum, minimum + 1}) {
      *section.dictionary() = {};
      decode(PacketBuilder(logCode, size).bytes(), logCode);
      EXPECT_EQ(shown(), rowsOfZeros) << size << " bytes";
    }
    log.take();
    expectIgnoredBelow(minimum, PacketBuilder(logCode, minimum).bytes(), logCode, {trace});
  }
};

// A text of its own for the value 255, then those of the values from 0 on.
auto tableWith255(std::string_view of255, std::vector<std::string_view> texts) {
  return [of255, texts = std::move(texts)](unsigned value) {
    if (value == 255) return of255;
    return value < texts.size() ? texts[value] : "Unknown";
  };
}

Bytes access() { return PacketBuilder(accessCode, 18).fill(0xEE).u8(13, 1).u8(14, 7).u8(15, 2).bytes(); }
Bytes timers() { return PacketBuilder(timersCode, 24).fill(0xEE).u8(15, 4).u8(16, 60).u8(17, 0).bytes(); }
Bytes packetSystem() {
  return PacketBuilder(packetSystemCode, 35)
      .fill(0xEE)
      .u8(13, 3)
      .u8(14, 4)
      .u8(15, 5)
      .u8(16, 6)
      .u8(33, 0)
      .bytes();
}

TEST_F(GPRSInformationTest, APositionPacketShowsItsEntryAlone) {
  decode(PacketBuilder(positionCode, 15).fill(0xEE).u8(14, 1).bytes(), positionCode);
  EXPECT_EQ(shown(), R"({SI13 Position: "Located on Extended BCCH"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GPRSInformationTest, PositionsHaveTextsFor255And0And1AndAllFrom2OnAreUnknown) {
  expectTextOfEachByte(PacketBuilder(positionCode, 15).fill(0xEE).bytes(), 14, "SI13 Position",
                       tableWith255("Not Available", {"Located on BCCH", "Located on Extended BCCH"}),
                       positionCode);
}

TEST_F(GPRSInformationTest, APositionPacketNeeds15Bytes) {
  expectMinimumLength(15, positionCode, R"({SI13 Position: "Located on BCCH"})");
}

TEST_F(GPRSInformationTest, AnAccessPacketShowsThreeEntriesInThisOrder) {
  decode(access());
  EXPECT_EQ(shown(), R"({Network Control Order: "NC2", PFC Supported: "Supported", )"
                     R"(Priority Access Threshold: "Allowed"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GPRSInformationTest, NetworkControlOrdersHaveTextsFor255And0To2AndAllFrom3OnAreUnknown) {
  expectTextOfEachByte(access(), 15, "Network Control Order",
                       tableWith255("Not Available", {"NC0", "NC1", "NC2"}));
}

TEST_F(GPRSInformationTest, AFlowContextSupportOf255ShowsAvailableAndAllFrom2OnAreUnknown) {
  expectTextOfEachByte(access(), 13, "PFC Supported",
                       tableWith255("Available", {"Not Supported", "Supported"}));
}

TEST_F(GPRSInformationTest, AccessThresholdsHaveTextsFor255And0To7AndAllFrom8OnAreUnknown) {
  expectTextOfEachByte(
      access(), 14, "Priority Access Threshold",
      tableWith255("Not Available", {"Barred (PKT access not allowed in the Cell)", "Barred", "Barred",
                                     "1 Only", "1 to 2", "1 to 3", "1 to 4", "Allowed"}));
}

TEST_F(GPRSInformationTest, EachBitOfAnAccessPacketCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      PacketBuilder(accessCode, 20).bytes(), 13, 20,
      {{"PFC Supported",
        13,
        0,
        "Not Supported",
        {"Supported", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown"}},
       {"Priority Access Threshold",
        14,
        0,
        "Barred (PKT access not allowed in the Cell)",
        {"Barred", "Barred", "1 to 2", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown"}},
       {"Network Control Order",
        15,
        0,
        "NC0",
        {"NC1", "NC2", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown", "Unknown"}}});
}

TEST_F(GPRSInformationTest, AnAccessPacketNeeds18Bytes) {
  expectMinimumLength(18, accessCode,
                      R"({Network Control Order: "NC0", PFC Supported: "Not Supported", )"
                      R"rows(Priority Access Threshold: "Barred (PKT access not allowed in the Cell)"})rows");
}

TEST_F(GPRSInformationTest, ATimersPacketShowsThreeEntriesInThisOrder) {
  decode(timers(), timersCode);
  EXPECT_EQ(shown(), R"({T3192: "80 ms", Access Burst Type: "8-bit format", DRX Timer Max: "60"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GPRSInformationTest, AT3192CodeOf8ShowsTwoQuestionMarks) {
  decode(PacketBuilder(timersCode, 24).u8(15, 8).bytes(), timersCode);
  EXPECT_EQ(shown("T3192"), R"("?? ms")");
}

TEST_F(GPRSInformationTest, EachT3192CodeHasItsTextAndAllFrom8OnHaveQuestionMarks) {
  expectTableOfByte(timers(), 15, "T3192",
                    {"500 ms", "1000 ms", "1500 ms", "0 ms", "80 ms", "120 ms", "160 ms", "200 ms"}, "?? ms",
                    timersCode);
}

TEST_F(GPRSInformationTest, AnyAccessBurstTypeBut0IsOf11Bits) {
  expectTextOfEachByte(
      timers(), 17, "Access Burst Type",
      [](unsigned value) { return value == 0 ? "8-bit format" : "11-bit format"; }, timersCode);
}

TEST_F(GPRSInformationTest, EachBitOfATimersPacketCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      PacketBuilder(timersCode, 26).bytes(), 13, 26,
      {{"T3192",
        15,
        0,
        "500 ms",
        {"1000 ms", "1500 ms", "80 ms", "?? ms", "?? ms", "?? ms", "?? ms", "?? ms"}},
       {"DRX Timer Max", 16, 0, "0", unsignedByteBits},
       {"Access Burst Type", 17, 0, "8-bit format", std::vector<std::string_view>(8, "11-bit format")}},
      timersCode);
}

TEST_F(GPRSInformationTest, ATimersPacketNeeds24Bytes) {
  expectMinimumLength(24, timersCode,
                      R"({T3192: "500 ms", Access Burst Type: "8-bit format", DRX Timer Max: "0"})");
}

TEST_F(GPRSInformationTest, ABroadcastPacketShowsByte13Alone) {
  decode(PacketBuilder(broadcastCode, 34).fill(0xEE).u8(13, 1).bytes(), broadcastCode);
  EXPECT_EQ(shown(), R"({PBCCH Present: "1"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
  expectTextsOfSingleBits(PacketBuilder(broadcastCode, 36).bytes(), 13, 36,
                          {{"PBCCH Present", 13, 0, "0", unsignedByteBits}}, broadcastCode);
}

TEST_F(GPRSInformationTest, ABroadcastPacketNeeds34Bytes) {
  expectMinimumLength(34, broadcastCode, R"({PBCCH Present: "0"})");
}

TEST_F(GPRSInformationTest, APacketSystemPacketShowsFiveEntriesInThisOrder) {
  decode(packetSystem(), packetSystemCode);
  EXPECT_EQ(shown(), R"({Ext Measurement Order: "6", Packet PSI Status: "3", )"
                     R"(Packet SI Status: "Not Supported", Count LR: "4", Count HR: "5"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GPRSInformationTest, AnyPacketSIStatusBut0IsSupported) {
  expectTextOfEachByte(
      packetSystem(), 33, "Packet SI Status",
      [](unsigned value) { return value == 0 ? "Not Supported" : "Supported"; }, packetSystemCode);
}

TEST_F(GPRSInformationTest, EachBitOfAPacketSystemPacketCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      PacketBuilder(packetSystemCode, 37).bytes(), 13, 37,
      {{"Packet PSI Status", 13, 0, "0", unsignedByteBits},
       {"Count LR", 14, 0, "0", unsignedByteBits},
       {"Count HR", 15, 0, "0", unsignedByteBits},
       {"Ext Measurement Order", 16, 0, "0", unsignedByteBits},
       {"Packet SI Status", 33, 0, "Not Supported", std::vector<std::string_view>(8, "Supported")}},
      packetSystemCode);
}

TEST_F(GPRSInformationTest, BytesOf255AreShownUnsigned) {
  decode(PacketBuilder(packetSystemCode, 35).fill(0xFF).bytes(), packetSystemCode);
  EXPECT_EQ(shown(), R"({Ext Measurement Order: "255", Packet PSI Status: "255", )"
                     R"(Packet SI Status: "Supported", Count LR: "255", Count HR: "255"})");
  decode(PacketBuilder(timersCode, 24).fill(0xFF).bytes(), timersCode);
  EXPECT_EQ(shown("DRX Timer Max"), R"("255")");
  decode(PacketBuilder(broadcastCode, 34).fill(0xFF).bytes(), broadcastCode);
  EXPECT_EQ(shown("PBCCH Present"), R"("255")");
}

TEST_F(GPRSInformationTest, APacketSystemPacketNeeds35Bytes) {
  expectMinimumLength(35, packetSystemCode,
                      R"({Ext Measurement Order: "0", Packet PSI Status: "0", )"
                      R"(Packet SI Status: "Not Supported", Count LR: "0", Count HR: "0"})");
}

TEST_F(GPRSInformationTest, AMeasurementPacketShowsTheHysteresisInByte26Alone) {
  expectTextsOfSingleBits(
      PacketBuilder(measurementCode, 45).bytes(), 13, 45,
      {{"Cell Reselect Hysteresis", 26, 0, "Not Applied", std::vector<std::string_view>(8, "Applied")}},
      measurementCode);
  EXPECT_EQ(shown(), R"({Cell Reselect Hysteresis: "Not Applied"})");
}

TEST_F(GPRSInformationTest, AnyHysteresisBut0IsApplied) {
  expectTextOfEachByte(
      PacketBuilder(measurementCode, 29).fill(0xEE).bytes(), 26, "Cell Reselect Hysteresis",
      [](unsigned value) { return value == 0 ? "Not Applied" : "Applied"; }, measurementCode);
}

TEST_F(GPRSInformationTest, AMeasurementPacketNeeds29Bytes) {
  expectMinimumLength(29, measurementCode, R"({Cell Reselect Hysteresis: "Not Applied"})");
}

TEST_F(GPRSInformationTest, ANetworkPacketShowsTheModeInByte13Alone) {
  decode(PacketBuilder(networkCode, 32).fill(0xEE).u8(13, 1).bytes(), networkCode);
  EXPECT_EQ(shown(), R"({Network Operating Mode: "Class 2"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(GPRSInformationTest, EachOperatingModeHasItsTextAndAllFrom3OnAreUnknown) {
  expectTableOfByte(PacketBuilder(networkCode, 32).fill(0xEE).bytes(), 13, "Network Operating Mode",
                    {"Class 1", "Class 2", "Class 3"}, "Unknown", networkCode);
}

TEST_F(GPRSInformationTest, ANetworkPacketNeeds32Bytes) {
  expectMinimumLength(32, networkCode, R"({Network Operating Mode: "Class 1"})");
}

TEST_F(GPRSInformationTest, EachCodeKeepsTheEntriesOfTheOthers) {
  decode(PacketBuilder(measurementCode, 29).bytes(), measurementCode);
  decode(timers(), timersCode);
  decode(PacketBuilder(networkCode, 32).bytes(), networkCode);
  decode(PacketBuilder(measurementCode, 29).u8(26, 1).bytes(), measurementCode);
  EXPECT_EQ(shown(), R"({Cell Reselect Hysteresis: "Applied", T3192: "80 ms", )"
                     R"(Access Burst Type: "8-bit format", DRX Timer Max: "60", )"
                     R"(Network Operating Mode: "Class 1"})");
}

}  // namespace
}  // namespace varnel
