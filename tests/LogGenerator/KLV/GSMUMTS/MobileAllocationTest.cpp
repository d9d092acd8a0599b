#include "LogGenerator/KLV/GSMUMTS/MobileAllocation.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t allocationCode = 0x51F8;
constexpr const char* trace = "<4>MobileAllocation";

class MobileAllocationTest : public RowsDecoderTest<MobileAllocation, allocationCode> {
 protected:
  const Array& arfcns() const { return *section.dictionary()->get("ARFCNs").array(); }
};

Bytes allocation(std::uint8_t hoppingSequence, const std::vector<std::uint16_t>& arfcns) {
  PacketBuilder packet(allocationCode, 15 + 2 * arfcns.size());
  packet.u8(13, hoppingSequence).u8(14, static_cast<std::uint8_t>(arfcns.size()));
  for (std::size_t i = 0; i < arfcns.size(); ++i) packet.u16(15 + 2 * i, arfcns[i]);
  return packet.bytes();
}

TEST_F(MobileAllocationTest, TheSequenceNumberStandsBeforeTheFrequenciesInTheirOrder) {
  decode(allocation(63, {975, 62, 975}));
  EXPECT_EQ(shown(), R"({HSN: "63", ARFCNs: ["975", "62", "975"]})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MobileAllocationTest, ACountOf0ShowsAnEmptyListOfFrequencies) {
  decode(allocation(63, {975}));
  decode(allocation(5, {}));
  EXPECT_EQ(shown(), R"({HSN: "5", ARFCNs: []})");
}

TEST_F(MobileAllocationTest, EachPacketSetsANewListAndLeavesTheOldOneAsItWas) {
  decode(allocation(63, {975, 62}));
  const Value before = section.dictionary()->get("ARFCNs");
  decode(allocation(63, {7}));
  EXPECT_EQ(shown(), R"({HSN: "63", ARFCNs: ["7"]})");
  EXPECT_EQ(described(before), R"(["975", "62"])");
}

TEST_F(MobileAllocationTest, OtherEntriesOfTheSectionStayAsTheyAre) {
  putOldContent();
  decode(allocation(1, {2}));
  EXPECT_EQ(shown(), R"({Old: "row", HSN: "1", ARFCNs: ["2"]})");
}

TEST_F(MobileAllocationTest, EachBitOfTheSequenceNumberCountsAndNoOther) {
  expectTextsOfSingleBits(PacketBuilder(allocationCode, 20).bytes(), 13, 20,
                          {{"HSN", 13, 0, "0", unsignedByteBits}});
}

TEST_F(MobileAllocationTest, EachBitOfAFrequencyCountsUnsigned) {
  for (unsigned bit = 0; bit < 16; ++bit) {
    decode(allocation(0, {static_cast<std::uint16_t>(1u << bit)}));
    EXPECT_EQ(described(arfcns().front()), quoted(unsignedWordBits[bit])) << bit;
  }
  decode(allocation(255, {0xFFFF}));
  EXPECT_EQ(shown(), R"({HSN: "255", ARFCNs: ["65535"]})");
}

TEST_F(MobileAllocationTest, FrequenciesBehindTheLastOneThatIsCountedAreNotShown) {
  Bytes packet = allocation(63, {975, 62});
  packet[14] = 1;
  decode(packet);
  EXPECT_EQ(shown(), R"({HSN: "63", ARFCNs: ["975"]})");
}

TEST_F(MobileAllocationTest, TwoHundredFiftyFiveFrequenciesAreAllShown) {
  std::vector<std::uint16_t> list(255, 0);
  list.front() = 1;
  list.back() = 255;
  decode(allocation(0, list));
  ASSERT_EQ(arfcns().size(), 255u);
  EXPECT_EQ(described(arfcns().front()), R"("1")");
  EXPECT_EQ(described(arfcns().back()), R"("255")");
}

TEST_F(MobileAllocationTest, FrequenciesBeyondThePacketShow0) {
  decode(PacketBuilder(allocationCode, 15).u8(14, 255).bytes());
  ASSERT_EQ(arfcns().size(), 255u);
  for (const Value& arfcn : arfcns()) EXPECT_EQ(described(arfcn), R"("0")");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(MobileAllocationTest, PacketsOf15And16BytesAreDecoded) {
  for (const std::size_t size : {15u, 16u}) {
    *section.dictionary() = {};
    decode(PacketBuilder(allocationCode, size).bytes());
    EXPECT_EQ(shown(), R"({HSN: "0", ARFCNs: []})") << size;
  }
}

TEST_F(MobileAllocationTest, EveryTruncatedPacketShowsAllFrequenciesWithZerosForWhatIsCutOff) {
  // 975 is 0x03CF, 300 is 0x012C.
  const char* const expected[] = {R"(["0", "0"])", R"(["207", "0"])", R"(["975", "0"])", R"(["975", "44"])"};
  forEachTruncation(allocation(63, {975, 300}), [&](std::size_t size, const std::vector<std::string>& lines) {
    EXPECT_EQ(shown(), size < 15
                           ? oldContent()
                           : R"({Old: "row", HSN: "63", ARFCNs: )" + std::string(expected[size - 15]) + "}");
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

}  // namespace
}  // namespace varnel
