#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <utility>

#include "tests/support/C2KHarness.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class C2KDispatchTest : public C2KTest {
 protected:
  static Bytes ofType(std::uint8_t type, Bytes packet) {
    packet[0] = type;
    return packet;
  }
  static Bytes prefixed(const Bytes& packet, std::uint8_t secondByte = 0) {
    Bytes message = {0x81, secondByte};
    message.insert(message.end(), packet.begin(), packet.end());
    return message;
  }
};

// The shortest packets that show something: 23 and 25 bytes.
Bytes fingers() { return PacketBuilder(0x108A, 23).bytes(); }
Bytes pilots() { return PacketBuilder(0x12B6, 25).bytes(); }
constexpr const char* shownFingers = R"~({kFingerC2I: "(none)"})~";

TEST_F(C2KDispatchTest, MessagesOf12BytesOrLessAreIgnoredAndNotCollected) {
  for (std::size_t size = 0; size <= 12; ++size) {
    Bytes message = fingers();
    message.resize(size);
    for (const std::uint8_t type : {0x01, 0x02, 0x81, 0xFF}) {
      if (size > 0) message[0] = type;
      expectRefused(message, "");
    }
  }
  EXPECT_EQ(collected(), "<>");
}

TEST_F(C2KDispatchTest, AMessageOf13BytesWithAnUnknownCodeIsIgnoredAndNotCollected) {
  for (const std::uint32_t code : {0x0000u, 0x108Bu, 0x8A10u, 0x1184u, 0x119Bu, 0x119Eu, 0xFFFFu}) {
    expectRefused(PacketBuilder(code, 13).bytes(), "");
    expectRefused(PacketBuilder(code, 100).bytes(), "");
  }
  EXPECT_EQ(collected(), "<>");
}

TEST_F(C2KDispatchTest, EachOfTheEightCodesHasItsDecoder) {
  const std::pair<std::uint32_t, const char*> refusals[] = {
      {0x1183, "<3>Log code 0x1183 is 13 bytes long but should be 50 bytes."},
      {0x12B6, "<3>Log code 0x12b6 is 13 bytes long but must be at least 25 bytes."},
      {0x108A, "<3>Log code 0x108a is 13 bytes long but must be at least 23 bytes."},
      {0x119C, "<3>Log code 0x119c is 13 bytes long but must be at least 17 bytes."},
      {0x119D, "<3>Log code 0x119d is 13 bytes long but must be at least 17 bytes."},
      {0x134F, "<3>Log code 0x134f is 13 bytes long but must be at least 171 bytes."},
      {0x1192, "<3>Log code 0x1192 is 13 bytes long but must be at least 241 bytes."},
      {0x127E, "<3>Log code 0x127e is 13 bytes long but must be at least 1750 bytes."},
  };
  for (const auto& [code, line] : refusals) expectRefused(PacketBuilder(code, 13).bytes(), line);
  EXPECT_EQ(collected(),
            "<010d0083110000000000000000"
            "010d00b6120000000000000000"
            "010d008a100000000000000000"
            "010d009c110000000000000000"
            "010d009d110000000000000000"
            "010d004f130000000000000000"
            "010d0092110000000000000000"
            "010d007e120000000000000000>");
}

TEST_F(C2KDispatchTest, AWrongLogTypeIsLoggedAndThePacketDecodedAllTheSame) {
  for (unsigned type = 0; type < 256; ++type) {
    if (type == 0x01 || type == 0x81 || type == 0xFF) continue;
    EXPECT_EQ(published(ofType(static_cast<std::uint8_t>(type), fingers())), shownFingers) << type;
    char line[64];
    std::snprintf(line, sizeof line, "<3>Invalid log type: %x. Dropping.", type);
    EXPECT_THAT(log.takeTexts(), ElementsAre(line));
  }
}

TEST_F(C2KDispatchTest, APacketOfAWrongLogTypeIsCollected) {
  published(ofType(0x10, PacketBuilder(0x1183, 13).bytes()));
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Invalid log type: 10. Dropping.",
                                           "<3>Log code 0x1183 is 13 bytes long but should be 50 bytes."));
  EXPECT_EQ(collected(), "<100d0083110000000000000000>");
}

TEST_F(C2KDispatchTest, AWrongLogTypeWithAnUnknownCodeIsLoggedAndNotCollected) {
  expectRefused(ofType(0x02, PacketBuilder(0x1184, 13).bytes()), "<3>Invalid log type: 2. Dropping.");
  EXPECT_EQ(collected(), "<>");
}

TEST_F(C2KDispatchTest, CodesOfLogTypeFFMatchNoDecoder) {
  for (const std::uint32_t code :
       {0xFF1183u, 0xFF12B6u, 0xFF108Au, 0xFF119Cu, 0xFF119Du, 0xFF134Fu, 0xFF1192u, 0xFF127Eu, 0xFF0000u}) {
    expectRefused(PacketBuilder(code, 1750).bytes(), "<3>Invalid log type: ff. Dropping.");
  }
  EXPECT_EQ(collected(), "<>");
}

TEST_F(C2KDispatchTest, ALeading81AndTheByteBehindItAreNoPartOfThePacket) {
  EXPECT_EQ(published(prefixed(fingers(), 0xAB)), shownFingers);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
  EXPECT_EQ(collected(), described(fingers()));
}

TEST_F(C2KDispatchTest, AMessageOf13BytesStarting81LeavesAn11BytePacketThatItsDecoderRefuses) {
  const Bytes message = {0x81, 0x00, 0x01, 0, 0, 0x83, 0x11, 0, 0, 0, 0, 0, 0};
  expectRefused(message, "<3>Log code 0x1183 is 11 bytes long but should be 50 bytes.");
  EXPECT_EQ(collected(), "<0100008311000000000000>");
  const Bytes longer = {0x81, 0x00, 0x01, 0, 0, 0x7E, 0x12, 0, 0, 0, 0, 0, 0, 0};
  expectRefused(longer, "<3>Log code 0x127e is 12 bytes long but must be at least 1750 bytes.");
  EXPECT_EQ(collected(), "<0100007e1200000000000000>");
}

TEST_F(C2KDispatchTest, OnlyOnePrefixIsRemoved) {
  // What follows is a packet of type 0x81 whose code lies at its own offset 3.
  EXPECT_EQ(published(prefixed(ofType(0x81, fingers()))), shownFingers);
  EXPECT_THAT(log.takeTexts(), ElementsAre("<3>Invalid log type: 81. Dropping."));
  EXPECT_EQ(collected(), described(ofType(0x81, fingers())));
}

TEST_F(C2KDispatchTest, APrefixedPacketOfTypeFFMatchesNoDecoder) {
  expectRefused(prefixed(ofType(0xFF, fingers())), "<3>Invalid log type: ff. Dropping.");
  EXPECT_EQ(collected(), "<>");
}

TEST_F(C2KDispatchTest, RecordLengthAndTimestampAreNotRead) {
  Bytes packet = fingers();
  for (const std::size_t offset : {1u, 2u, 5u, 6u, 7u, 8u, 9u, 10u, 11u, 12u}) packet[offset] = 0xFF;
  EXPECT_EQ(published(packet), shownFingers);
  EXPECT_THAT(log.takeTexts(), IsEmpty());
}

TEST_F(C2KDispatchTest, APacketThatIsLeftOutOfTheBinaryLogIsDecodedAllTheSame) {
  Bytes flood = fingers();
  flood.resize(16'777'216);
  published(flood);
  EXPECT_EQ(published(fingers()), shownFingers);
  EXPECT_EQ(generator.messagesLeftOutOfLog(), 1u);
}

TEST_F(C2KDispatchTest, EachKnownPacketIsCollectedWholeWhateverItsDecoderMadeOfIt) {
  published(PacketBuilder(0x108A, 24).u8(23, 0xAA).bytes());  // refused
  published(PacketBuilder(0x1234, 30).bytes());               // unknown
  published(prefixed(pilots()));
  published(PacketBuilder(0x12B6, 26).u8(25, 0xBB).bytes());
  EXPECT_EQ(collected(),
            "<0118008a10000000000000000000000000000000000000aa"
            "011900b61200000000000000000000000000000000000000"
            "00"
            "011a00b61200000000000000000000000000000000000000"
            "00bb>");
}

TEST_F(C2KDispatchTest, EveryCollectionStartsAfresh) {
  published(fingers());
  EXPECT_EQ(collected(), described(fingers()));
  EXPECT_EQ(collected(), "<>");
  published(pilots());
  EXPECT_EQ(collected(), described(pilots()));
}

}  // namespace
}  // namespace varnel
