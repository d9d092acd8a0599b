#include "LogGenerator/KLV/GSMUMTS/EquivalentPLMNList.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t networksCode = 0x7150;
constexpr const char* trace = "<4>Equivalent PLMN List";

using EquivalentPLMNListTest = ListDecoderTest<EquivalentPLMNList, networksCode>;

// A packet of zeros with a count of networks.
PacketBuilder counted(std::uint8_t networks, std::size_t size) {
  PacketBuilder packet(networksCode, size);
  packet.u8(16, networks);
  return packet;
}

std::string row(int mcc, int mnc) {
  return R"({Mobile Country Code: ")" + std::to_string(mcc) + R"(", Mobile Network Code: ")" +
         std::to_string(mnc) + "\"}";
}

// Two networks: 3 1 4 and 1 2 5 from bytes 17 to 22, then 2 5 7 and 4 6 8 from bytes 20 to 25.
Bytes twoNetworks() {
  PacketBuilder packet(networksCode, 26);
  packet.fill(0xEE).u8(16, 2);
  std::size_t offset = 17;
  for (const std::uint8_t digit : {3, 1, 1, 2, 4, 5, 6, 7, 8}) packet.u8(offset++, digit);
  return packet.bytes();
}

TEST_F(EquivalentPLMNListTest, EachNetworkHasTwoEntriesInThisOrder) {
  decode(PacketBuilder(networksCode, 23).u8(16, 1).u8(17, 2).u8(19, 6).u8(21, 2).u8(22, 1).bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "262", Mobile Network Code: "1"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(EquivalentPLMNListTest, SixBytesAreReadOfEachNetworkThoughTheNextBegins3BytesOn) {
  decode(twoNetworks());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "314", Mobile Network Code: "125"}, )"
                     R"({Mobile Country Code: "257", Mobile Network Code: "468"}])");
}

TEST_F(EquivalentPLMNListTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> hundreds = {"100",  "200",  "400",  "800",
                                                  "1600", "3200", "6400", "12800"};
  const std::vector<std::string_view> tens = {"10", "20", "40", "80", "160", "320", "640", "1280"};
  const auto rowOf = [](const char* label, std::size_t byte, const std::vector<std::string_view>& texts) {
    return std::vector<BitTexts>{{label, byte, 0, "0", texts}};
  };
  const Bytes zeros = counted(1, 26).bytes();
  expectTextsOfSingleBits(zeros, 17, 18, rowOf("Mobile Country Code", 17, hundreds));
  expectTextsOfSingleBits(zeros, 18, 19, rowOf("Mobile Network Code", 18, hundreds));
  expectTextsOfSingleBits(zeros, 19, 20, rowOf("Mobile Country Code", 19, tens));
  expectTextsOfSingleBits(zeros, 20, 21, rowOf("Mobile Network Code", 20, tens));
  expectTextsOfSingleBits(zeros, 21, 22, rowOf("Mobile Country Code", 21, unsignedByteBits));
  expectTextsOfSingleBits(zeros, 22, 23, rowOf("Mobile Network Code", 22, unsignedByteBits));
  expectTextsOfSingleBits(zeros, 18, 19, rowOf("Mobile Country Code", 17, {}));
  expectTextsOfSingleBits(zeros, 17, 18, rowOf("Mobile Network Code", 18, {}));
  expectTextsOfSingleBits(zeros, 13, 16, rowOf("Mobile Country Code", 17, {}));
  expectTextsOfSingleBits(zeros, 23, 26, rowOf("Mobile Network Code", 18, {}));
}

TEST_F(EquivalentPLMNListTest, BytesOf255CountWholeInEachPlace) {
  decode(counted(1, 23).fill(0xFF).u8(16, 1).bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "28305", Mobile Network Code: "28305"}])");
}

TEST_F(EquivalentPLMNListTest, EachPacketReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(twoNetworks());
  EXPECT_EQ(rowCount(), 2u);
  decode(counted(1, 23).u8(21, 7).bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "7", Mobile Network Code: "0"}])");
}

TEST_F(EquivalentPLMNListTest, ACountOf0EmptiesTheListSilently) {
  putOldContent();
  decode(counted(0, 26).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(EquivalentPLMNListTest, APacketOf17BytesWithCount0IsLongEnoughToEmptyTheList) {
  putOldContent();
  decode(counted(0, 17).bytes());
  EXPECT_EQ(shown(), "[]");
}

TEST_F(EquivalentPLMNListTest, APacketOf18BytesShowsItsSingleDigit) {
  decode(counted(1, 18).u8(17, 2).bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "200", Mobile Network Code: "0"}])");
}

TEST_F(EquivalentPLMNListTest, TwoHundredFiftyFiveNetworksAreAllShown) {
  decode(counted(255, 785).u8(17, 1).u8(784, 9).bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), row(100, 0));
  EXPECT_EQ(described(section.array()->back()), row(0, 9));
}

TEST_F(EquivalentPLMNListTest, NetworksBeyondThePacketShowZeros) {
  putOldContent();
  decode(counted(255, 17).bytes());
  ASSERT_EQ(rowCount(), 255u);
  for (const Value& network : *section.array()) EXPECT_EQ(described(network), row(0, 0));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(EquivalentPLMNListTest, EveryTruncatedPacketShowsBothNetworksWithZerosForTheDigitsThatAreCutOff) {
  const std::string expected[] = {
      "[" + row(0, 0) + ", " + row(0, 0) + "]",         "[" + row(300, 0) + ", " + row(0, 0) + "]",
      "[" + row(300, 100) + ", " + row(0, 0) + "]",     "[" + row(310, 100) + ", " + row(0, 0) + "]",
      "[" + row(310, 120) + ", " + row(200, 0) + "]",   "[" + row(314, 120) + ", " + row(200, 400) + "]",
      "[" + row(314, 125) + ", " + row(250, 400) + "]", "[" + row(314, 125) + ", " + row(250, 460) + "]",
      "[" + row(314, 125) + ", " + row(257, 460) + "]"};
  forEachTruncation(twoNetworks(), [&](std::size_t size, const std::vector<std::string>& lines) {
    EXPECT_EQ(shown(), size < 17 ? oldContent() : expected[size - 17]);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

}  // namespace
}  // namespace varnel
