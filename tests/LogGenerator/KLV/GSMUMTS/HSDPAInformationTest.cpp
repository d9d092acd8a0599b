#include "LogGenerator/KLV/GSMUMTS/HSDPAInformation.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t processesCode = 0x4221;
constexpr const char* trace = "<4>HSDPA Info";

class HSDPAInformationTest : public RowsDecoderTest<HSDPAInformation, processesCode> {
 protected:
  const Array& primary() const { return *section.dictionary()->get("Primary HARQ Process").array(); }
  const Array& secondary() const { return *section.dictionary()->get("Secondary HARQ Process").array(); }
};

// A packet of zeros with a count of primary and secondary processes.
PacketBuilder counted(std::uint8_t primary, std::uint8_t secondary, std::size_t size) {
  PacketBuilder packet(processesCode, size);
  packet.u8(16, primary).u8(17, secondary);
  return packet;
}

void putProcess(PacketBuilder& packet, std::size_t offset, std::uint8_t identity, std::uint32_t bits,
                std::uint16_t transmissions, std::uint16_t errors) {
  packet.u8(offset, identity).u32(offset + 1, bits).u16(offset + 5, transmissions).u16(offset + 7, errors);
}

// Two primary processes and, 324 bytes behind the start of the first, a secondary one, in a sea of bytes that
// no entry may show.
Bytes threeProcesses() {
  PacketBuilder packet(processesCode, 351);
  packet.fill(0xEE).u8(13, 2).u16(14, 0xF9F4).u8(16, 2).u8(17, 1);
  putProcess(packet, 18, 1, 66051, 300, 7);
  putProcess(packet, 27, 2, 8, 9, 513);
  putProcess(packet, 342, 3, 10, 11, 12);
  return packet.bytes();
}

std::string row(const char* identity, const char* bits, const char* transmissions, const char* errors) {
  return std::string("{Process ID: \"") + identity + "\", No Rx Bits: \"" + bits + "\", New Tx: \"" +
         transmissions + "\", Block Errors: \"" + errors + "\"}";
}

const std::string first = row("1", "66051", "300", "7");
const std::string second = row("2", "8", "9", "513");
const std::string third = row("3", "10", "11", "12");
const std::string heading = R"(Version: "2", Sub Frames: "500", Carrier Info: "Dual Carrier")";

TEST_F(HSDPAInformationTest, ThreeEntriesAndTwoListsAreShownInThisOrder) {
  decode(threeProcesses());
  EXPECT_EQ(shown(), R"({Version: "2", Sub Frames: "500", Carrier Info: "Dual Carrier", )"
                     R"(Primary HARQ Process: [)"
                     R"({Process ID: "1", No Rx Bits: "66051", New Tx: "300", Block Errors: "7"}, )"
                     R"({Process ID: "2", No Rx Bits: "8", New Tx: "9", Block Errors: "513"}], )"
                     R"(Secondary HARQ Process: [)"
                     R"({Process ID: "3", No Rx Bits: "10", New Tx: "11", Block Errors: "12"}]})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(HSDPAInformationTest, EachCarrierConfigurationHasItsTextAnd3IsReserved) {
  const auto carrier = [&](std::uint8_t byte15) {
    decode(counted(0, 0, 18).u8(15, byte15).bytes());
    return shown("Carrier Info");
  };
  EXPECT_EQ(carrier(0x00), R"("Single Carrier")");
  EXPECT_EQ(carrier(0x04), R"("MIMO")");
  EXPECT_EQ(carrier(0x08), R"("Dual Carrier")");
  EXPECT_EQ(carrier(0x0C), R"("Reserved")");
  EXPECT_EQ(carrier(0xF3), R"("Single Carrier")");
}

TEST_F(HSDPAInformationTest, EachBitOfTheHeadingCountsInItsOwnEntryAlone) {
  expectTextsOfSingleBits(
      counted(0, 0, 20).bytes(), 13, 16,
      {{"Version", 13, 0, "0", unsignedByteBits},
       {"Sub Frames", 14, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128", "256", "512"}},
       {"Carrier Info", 15, 2, "Single Carrier", {"MIMO", "Dual Carrier"}}});
  EXPECT_EQ(shown("Version"), R"("0")");
}

TEST_F(HSDPAInformationTest, AHeadingOfAllOnesIsUnsigned) {
  decode(counted(0, 0, 18).fill(0xFF).u8(16, 0).u8(17, 0).bytes());
  EXPECT_EQ(shown(), R"({Version: "255", Sub Frames: "1023", Carrier Info: "Reserved"})");
}

TEST_F(HSDPAInformationTest, EachBitOfAProcessCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> unsignedLongBits = [] {
    std::vector<std::string_view> texts = signedLongBits;
    texts.back() = "2147483648";
    return texts;
  }();
  const auto textOf = [](std::size_t bit, std::size_t runStart, const std::vector<std::string_view>& texts) {
    const bool isItsOwn = bit >= runStart && bit - runStart < texts.size();
    return quoted(isItsOwn ? texts[bit - runStart] : "0");
  };
  const auto expectProcess = [&](const Array& list, std::size_t offset, std::size_t bit) {
    const Dictionary& process = *list.front().dictionary();
    EXPECT_EQ(described(process.get("Process ID")), textOf(bit, 8 * offset, unsignedByteBits)) << bit;
    EXPECT_EQ(described(process.get("No Rx Bits")), textOf(bit, 8 * (offset + 1), unsignedLongBits)) << bit;
    EXPECT_EQ(described(process.get("New Tx")), textOf(bit, 8 * (offset + 5), unsignedWordBits)) << bit;
    EXPECT_EQ(described(process.get("Block Errors")), textOf(bit, 8 * (offset + 7), unsignedWordBits)) << bit;
  };
  const Bytes packet = counted(1, 1, 191).bytes();
  for (std::size_t bit = 8 * 18; bit < 8 * 191; ++bit) {
    Bytes changed = packet;
    changed[bit / 8] = static_cast<std::uint8_t>(1u << bit % 8);
    decode(changed);
    expectProcess(primary(), 18, bit);
    expectProcess(secondary(), 180, bit);
  }
}

TEST_F(HSDPAInformationTest, AProcessOfAllOnesIsUnsigned) {
  decode(counted(1, 0, 27).fill(0xFF).u8(16, 1).u8(17, 0).bytes());
  EXPECT_EQ(described(primary().front()), row("255", "4294967295", "65535", "65535"));
}

TEST_F(HSDPAInformationTest, WithoutPrimaryProcessesTheSecondaryOnesBeginAtByte18) {
  PacketBuilder packet = counted(0, 2, 36);
  putProcess(packet, 18, 1, 2, 3, 4);
  putProcess(packet, 27, 5, 6, 7, 8);
  decode(packet.bytes());
  EXPECT_EQ(shown(), R"({Version: "0", Sub Frames: "0", Carrier Info: "Single Carrier", )"
                     R"(Secondary HARQ Process: [)" +
                         row("1", "2", "3", "4") + ", " + row("5", "6", "7", "8") + "]}");
}

TEST_F(HSDPAInformationTest, CountsOf0ChangeTheThreeEntriesOnly) {
  decode(threeProcesses());
  decode(counted(0, 0, 351).u8(13, 9).bytes());
  EXPECT_EQ(shown(), R"({Version: "9", Sub Frames: "0", Carrier Info: "Single Carrier", )"
                     R"(Primary HARQ Process: [)" +
                         first + ", " + second + "], Secondary HARQ Process: [" + third + "]}");
}

TEST_F(HSDPAInformationTest, CountsOf0MakeNoLists) {
  decode(counted(0, 0, 351).bytes());
  EXPECT_EQ(shown(), R"({Version: "0", Sub Frames: "0", Carrier Info: "Single Carrier"})");
}

TEST_F(HSDPAInformationTest, EachListIsReplacedByItself) {
  decode(threeProcesses());
  decode(counted(1, 0, 27).bytes());
  EXPECT_EQ(described(section.dictionary()->get("Primary HARQ Process")),
            "[" + row("0", "0", "0", "0") + "]");
  EXPECT_EQ(described(section.dictionary()->get("Secondary HARQ Process")), "[" + third + "]");
  decode(counted(0, 1, 27).bytes());
  EXPECT_EQ(described(section.dictionary()->get("Secondary HARQ Process")),
            "[" + row("0", "0", "0", "0") + "]");
}

TEST_F(HSDPAInformationTest, TwoHundredFiftyFiveProcessesOfEachKindAreAllShown) {
  PacketBuilder packet = counted(255, 255, 43623);
  packet.u8(18, 1).u8(2304, 2).u8(41328, 3).u8(43614, 4);
  decode(packet.bytes());
  ASSERT_EQ(primary().size(), 255u);
  ASSERT_EQ(secondary().size(), 255u);
  EXPECT_EQ(described(primary().front()), row("1", "0", "0", "0"));
  EXPECT_EQ(described(primary().back()), row("2", "0", "0", "0"));
  EXPECT_EQ(described(secondary().front()), row("3", "0", "0", "0"));
  EXPECT_EQ(described(secondary().back()), row("4", "0", "0", "0"));
}

TEST_F(HSDPAInformationTest, CountsWithoutAProcessThatFitsStoreEmptyLists) {
  decode(threeProcesses());
  log.take();
  decode(counted(255, 255, 26).bytes());
  EXPECT_EQ(shown(), R"({Version: "0", Sub Frames: "0", Carrier Info: "Single Carrier", )"
                     R"(Primary HARQ Process: [], Secondary HARQ Process: []})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(HSDPAInformationTest, EveryTruncatedPacketKeepsItsWholeProcesses) {
  forEachTruncation(threeProcesses(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string primaryProcesses = first + ", " + second;
    if (size < 36) primaryProcesses = first;
    if (size < 27) primaryProcesses = "";
    EXPECT_EQ(shown(), size < 18 ? oldContent()
                                 : "{Old: \"row\", " + heading + ", Primary HARQ Process: [" +
                                       primaryProcesses + "], Secondary HARQ Process: []}");
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(HSDPAInformationTest, EveryTruncatedSecondaryListKeepsItsWholeProcesses) {
  PacketBuilder packet = counted(0, 2, 36);
  putProcess(packet, 18, 1, 2, 3, 4);
  putProcess(packet, 27, 5, 6, 7, 8);
  forEachTruncation(packet.bytes(), [&](std::size_t size, const std::vector<std::string>&) {
    if (size < 18) return;
    EXPECT_EQ(described(section.dictionary()->get("Secondary HARQ Process")),
              size < 27 ? "[]" : "[" + row("1", "2", "3", "4") + "]");
  });
}

TEST_F(HSDPAInformationTest, PacketsOf18And19BytesAreDecoded) {
  for (const std::size_t size : {18u, 19u}) {
    putOldContent();
    decode(counted(0, 0, size).bytes());
    EXPECT_EQ(shown(), R"({Old: "row", Version: "0", Sub Frames: "0", Carrier Info: "Single Carrier"})")
        << size;
  }
}

}  // namespace
}  // namespace varnel
