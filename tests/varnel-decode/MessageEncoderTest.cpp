#include "programs/varnel-decode/MessageEncoder.h"

#include <gtest/gtest.h>

#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

// A packet of version 26 with an RRCConnectionRelease of two bytes.
Bytes release() {
  return PacketBuilder(0xB0C0, 36)
      .u8(13, 26)
      .u16(19, 289)
      .u32(21, 5230)
      .u8(27, 9)
      .u16(32, 2)
      .u8(34, 0x28)
      .u8(35, 0x02)
      .bytes();
}

Bytes copyOf(ByteView bytes) { return {bytes.begin(), bytes.end()}; }

Bytes encoded(MessageEncoder& encoder, const Bytes& message) {
  return copyOf(encoder.encode({.time = {2, 0}, .message = message}));
}

std::uint32_t u32(const Bytes& bytes, std::size_t offset) {
  std::uint32_t number = 0;
  for (std::size_t i = 4; i-- > 0;) number = number << 8 | bytes.at(offset + i);
  return number;
}

TEST(MessageEncoder, OnlyTheFirstPacketOfASubscriptionComesWithAnInterface) {
  MessageEncoder encoder(MessageForm::UpperPdu);
  EXPECT_EQ(copyOf(encoder.beginning()).size(), 28u);
  const Bytes first = encoded(encoder, release());
  EXPECT_EQ(u32(first, 0), 1u) << "an interface";
  EXPECT_EQ(first.at(8), 252);
  const Bytes second = encoded(encoder, release());
  EXPECT_EQ(u32(second, 0), 6u) << "a packet";
  EXPECT_EQ(u32(second, 8), 0u);
  Bytes ofTwo = release();
  ofTwo.insert(ofTwo.begin(), {0x81, 2});
  const Bytes third = copyOf(encoder.encode({.time = {2, 0}, .message = ofTwo, .subscription = 2}));
  EXPECT_EQ(u32(third, 0), 1u);
  EXPECT_EQ(u32(third, u32(third, 4) + 8), 1u) << "the packet's interface";
}

TEST(MessageEncoder, ACutOffPacketIsLeftOut) {
  for (std::size_t size = 0; size < release().size(); ++size) {
    MessageEncoder encoder(MessageForm::UpperPdu);
    Bytes cut = release();
    cut.resize(size);
    EXPECT_EQ(encoded(encoder, cut), Bytes()) << size;
    EXPECT_EQ(encoder.leftOut(), size < 13 ? 0u : 1u) << size << ": without a log code it may be anything";
  }
}

TEST(MessageEncoder, OtherRecordsAreNotLeftOut) {
  MessageEncoder encoder(MessageForm::Gsmtap);
  EXPECT_EQ(encoded(encoder, PacketBuilder(0xB193, 60).bytes()), Bytes());
  Bytes ofServer = release();
  ofServer[0] = 0xFF;
  EXPECT_EQ(encoded(encoder, ofServer), Bytes()) << "the server's packets have log codes of their own";
  EXPECT_EQ(encoder.leftOut(), 0u);
  EXPECT_EQ(encoder.remark("walk.bin", "out"), "walk.bin has no RRC or NAS messages, so out is empty");
}

TEST(MessageEncoder, AWholeFileHasNoRemark) {
  MessageEncoder encoder(MessageForm::UpperPdu);
  encoded(encoder, release());
  EXPECT_EQ(encoder.remark("walk.bin", "out"), std::nullopt);
}

TEST(MessageEncoder, OneMessageThatIsLeftOutIsOne) {
  MessageEncoder encoder(MessageForm::UpperPdu);
  Bytes later = release();
  later[13] = 99;
  encoded(encoder, later);
  EXPECT_EQ(encoder.remark("walk.bin", "out"),
            "1 message of walk.bin is not in out: 1 of versions that are not known");
}

TEST(MessageEncoder, TheReasonNamesWhatTheMessageIs) {
  MessageEncoder encoder(MessageForm::UpperPdu);
  // Of the BCCH, with nothing behind the pseudo length; of the RACH.
  encoded(encoder, PacketBuilder(0x512F, 17).u8(13, 0x81).u8(14, 0x1B).u8(15, 1).u8(16, 0x01).bytes());
  encoded(encoder, PacketBuilder(0x512F, 17).u8(13, 0x02).u8(15, 1).u8(16, 0x01).bytes());
  EXPECT_EQ(encoder.remark("walk.bin", "out"),
            "2 messages of walk.bin are not in out: 1 of GSM RR RACH, which no dissector reads, 1 of GSM RR "
            "without contents");
}

}  // namespace
}  // namespace varnel
