#include "LogGenerator/KLV/GSMUMTS/BLER.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t blocksCode = 0x4116;
constexpr const char* trace = "<4>BLER";

class BLERTest : public RowsDecoderTest<BLER, blocksCode> {
 protected:
  const Array& channels() const { return *section.dictionary()->get("Transport Channels").array(); }
  /// An entry of the first channel.
  std::string shownOfChannel(std::string_view label) const {
    return described(channels().front().dictionary()->get(label));
  }
};

// A packet of zeros with a count of channels.
PacketBuilder counted(std::uint8_t channels, std::size_t size) {
  PacketBuilder packet(blocksCode, size);
  packet.u8(13, channels);
  return packet;
}

// Two channels whose fields all differ.
Bytes twoChannels() {
  return counted(2, 34)
      .u16(14, 300)
      .u8(16, 5)
      .u32(17, 66051)
      .u32(21, 513)
      .u8(25, 254)
      .u32(26, 7)
      .u32(30, 258)
      .bytes();
}

std::string row(const char* identity, const char* received, const char* inError) {
  return std::string("{Transport Channel ID: \"") + identity + "\", CRC Received: \"" + received +
         "\", CRC Received in Error: \"" + inError + "\"}";
}

TEST_F(BLERTest, TheWindowStandsBeforeTheChannelsAndEachChannelHasThreeEntriesInThisOrder) {
  decode(twoChannels());
  EXPECT_EQ(shown(), R"({Window Size: "300", Transport Channels: [)"
                     R"({Transport Channel ID: "5", CRC Received: "66051", CRC Received in Error: "513"}, )"
                     R"({Transport Channel ID: "254", CRC Received: "7", CRC Received in Error: "258"}]})");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(BLERTest, ACountOf0ShowsTheWindowAndAnEmptyListOfChannels) {
  decode(twoChannels());
  decode(counted(0, 34).u16(14, 7).bytes());
  EXPECT_EQ(shown(), R"({Window Size: "7", Transport Channels: []})");
}

TEST_F(BLERTest, EachPacketSetsANewListAndLeavesTheOldOneAsItWas) {
  decode(twoChannels());
  const Value before = section.dictionary()->get("Transport Channels");
  decode(counted(1, 25).u8(16, 9).bytes());
  EXPECT_EQ(shown(), R"({Window Size: "0", Transport Channels: [)" + row("9", "0", "0") + "]}");
  EXPECT_EQ(described(before), "[" + row("5", "66051", "513") + ", " + row("254", "7", "258") + "]");
}

TEST_F(BLERTest, OtherEntriesOfTheSectionStayAsTheyAre) {
  putOldContent();
  decode(counted(0, 16).bytes());
  EXPECT_EQ(shown(), R"({Old: "row", Window Size: "0", Transport Channels: []})");
}

TEST_F(BLERTest, TheWindowIsUnsignedAndHas16Bits) {
  expectTextsOfSingleBits(counted(0, 25).bytes(), 14, 25, {{"Window Size", 14, 0, "0", unsignedWordBits}});
  decode(counted(0, 16).u16(14, 0xFFFF).bytes());
  EXPECT_EQ(shown("Window Size"), R"("65535")");
}

TEST_F(BLERTest, EachBitOfAChannelCountsInItsOwnEntryAlone) {
  const Bytes packet = counted(1, 34).bytes();
  const auto textsOf = [&](std::size_t bit, std::size_t runStart,
                           const std::vector<std::string_view>& texts) {
    const bool isItsOwn = bit >= runStart && bit - runStart < texts.size();
    return quoted(isItsOwn ? texts[bit - runStart] : "0");
  };
  for (std::size_t bit = 8 * 14; bit < 8 * 34; ++bit) {
    Bytes changed = packet;
    changed[bit / 8] = static_cast<std::uint8_t>(1u << bit % 8);
    decode(changed);
    EXPECT_EQ(shownOfChannel("Transport Channel ID"), textsOf(bit, 8 * 16, unsignedByteBits)) << bit;
    EXPECT_EQ(shownOfChannel("CRC Received"), textsOf(bit, 8 * 17, signedLongBits)) << bit;
    EXPECT_EQ(shownOfChannel("CRC Received in Error"), textsOf(bit, 8 * 21, signedLongBits)) << bit;
  }
}

TEST_F(BLERTest, CountsOfAllOnesShowMinus1AndTheIdentity255) {
  decode(counted(0, 25).fill(0xFF).u8(13, 1).bytes());
  EXPECT_EQ(shown(), R"({Window Size: "65535", Transport Channels: [)" + row("255", "-1", "-1") + "]}");
}

TEST_F(BLERTest, TwoHundredFiftyFiveChannelsAreAllShown) {
  decode(counted(255, 2311).u8(16, 1).u8(2302, 255).bytes());
  ASSERT_EQ(channels().size(), 255u);
  EXPECT_EQ(described(channels().front()), row("1", "0", "0"));
  EXPECT_EQ(described(channels().back()), row("255", "0", "0"));
}

TEST_F(BLERTest, ChannelsBeyondThePacketShowZeros) {
  decode(counted(255, 16).bytes());
  ASSERT_EQ(channels().size(), 255u);
  for (const Value& channel : channels()) EXPECT_EQ(described(channel), row("0", "0", "0"));
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(BLERTest, PacketsOf16And17BytesAreDecoded) {
  for (const std::size_t size : {16u, 17u}) {
    *section.dictionary() = {};
    decode(counted(0, size).bytes());
    EXPECT_EQ(shown(), R"({Window Size: "0", Transport Channels: []})") << size;
  }
}

TEST_F(BLERTest, EveryTruncatedPacketShowsBothChannelsWithZerosForWhatIsCutOff) {
  // 66051 is 0x00010203, 513 is 0x0201, 258 is 0x0102.
  forEachTruncation(twoChannels(), [&](std::size_t size, const std::vector<std::string>& lines) {
    const char* firstReceived = size >= 20 ? "66051" : size == 19 ? "515" : size == 18 ? "3" : "0";
    const char* firstInError = size >= 23 ? "513" : size == 22 ? "1" : "0";
    const char* secondInError = size >= 32 ? "258" : size == 31 ? "2" : "0";
    const std::string expected = R"({Old: "row", Window Size: "300", Transport Channels: [)" +
                                 row(size >= 17 ? "5" : "0", firstReceived, firstInError) + ", " +
                                 row(size >= 26 ? "254" : "0", size >= 27 ? "7" : "0", secondInError) + "]}";
    EXPECT_EQ(shown(), size < 16 ? oldContent() : expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

}  // namespace
}  // namespace varnel
