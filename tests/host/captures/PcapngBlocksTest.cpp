#include "host/captures/PcapngBlocks.h"

#include <gtest/gtest.h>

#include <string>

namespace varnel::pcapng {
namespace {

TEST(PcapngBlocks, ASectionIsLittleEndianAndOfUnknownLength) {
  Bytes file;
  appendSection(file);
  EXPECT_EQ(file, (Bytes{0x0A, 0x0D, 0x0D, 0x0A, 28,   0,    0,    0,    0x4D, 0x3C, 0x2B, 0x1A, 1, 0,
                         0,    0,    0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 28,   0,    0, 0}));
}

TEST(PcapngBlocks, AnInterfaceHasItsNameAndNanoseconds) {
  Bytes file;
  appendInterface(file, {.linkType = 252, .name = "SIM 1"});
  EXPECT_EQ(file, (Bytes{1,   0, 0, 0, 44,  0,   0,   0,                  //
                         252, 0, 0, 0, 0,   0,   0,   0,                  //
                         2,   0, 5, 0, 'S', 'I', 'M', ' ', '1', 0, 0, 0,  // the name, filled up to 4 bytes
                         9,   0, 1, 0, 9,   0,   0,   0,                  //
                         0,   0, 0, 0, 44,  0,   0,   0}));
}

TEST(PcapngBlocks, APacketHasItsCommentAndDirection) {
  Bytes file;
  // 2 s and 5 ns: 0x77359405.
  appendPacket(file, {.interface = 1,
                      .time = {2, 5},
                      .bytes = Bytes{0xAA, 0xBB, 0xCC, 0xDD, 0xEE},
                      .comment = "cell",
                      .direction = Direction::Outbound});
  EXPECT_EQ(file, (Bytes{6,    0,    0,    0,    60,   0,    0,    0,    1, 0, 0, 0,  //
                         0,    0,    0,    0,    0x05, 0x94, 0x35, 0x77,              //
                         5,    0,    0,    0,    5,    0,    0,    0,                 //
                         0xAA, 0xBB, 0xCC, 0xDD, 0xEE, 0,    0,    0,                 //
                         1,    0,    4,    0,    'c',  'e',  'l',  'l',               //
                         2,    0,    4,    0,    2,    0,    0,    0,                 //
                         0,    0,    0,    0,    60,   0,    0,    0}));
}

TEST(PcapngBlocks, APacketWithoutCommentAndDirectionHasNoOptions) {
  Bytes file;
  appendPacket(file, {.interface = 0, .time = {0, 1}, .bytes = Bytes{0xAA}});
  EXPECT_EQ(file, (Bytes{6,    0, 0, 0, 36, 0, 0, 0, 0, 0, 0, 0,  //
                         0,    0, 0, 0, 1,  0, 0, 0,              //
                         1,    0, 0, 0, 1,  0, 0, 0,              //
                         0xAA, 0, 0, 0, 36, 0, 0, 0}));
}

TEST(PcapngBlocks, AnInboundPacketHasDirection1) {
  Bytes file;
  appendPacket(file, {.interface = 0, .time = {0, 1}, .bytes = {}, .direction = Direction::Inbound});
  EXPECT_EQ(file, (Bytes{6, 0, 0, 0, 44, 0, 0, 0, 0, 0, 0, 0,  //
                         0, 0, 0, 0, 1,  0, 0, 0,              //
                         0, 0, 0, 0, 0,  0, 0, 0,              //
                         2, 0, 4, 0, 1,  0, 0, 0,              //
                         0, 0, 0, 0, 44, 0, 0, 0}));
}

TEST(PcapngBlocks, ATextLosesWhatIsBeyond1024Bytes) {
  Bytes file;
  appendInterface(file, {.linkType = 252, .description = std::string(2000, 'x')});
  // 16 bytes up to the options, 4 + 1024 of the text, 8 of the resolution, 8 of the end.
  EXPECT_EQ(file.size(), 1060u);
}

}  // namespace
}  // namespace varnel::pcapng
