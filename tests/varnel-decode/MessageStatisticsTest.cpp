#include "programs/varnel-decode/MessageStatistics.h"

#include <gmock/gmock.h>

namespace varnel {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;
using enum MessageFate::Outcome;

MessageStatistics someOfEverything() {
  MessageStatistics statistics;
  statistics.add({Decoded, 0xB17F});
  statistics.add({TooShort, 0xB17F});
  statistics.add({Decoded, 0xB17F});
  statistics.add({Decoded, 0xFF0001});
  statistics.add({Unknown, 0x0020});
  statistics.add({TooLong, 0x1183});
  statistics.add({Unknown});
  statistics.add({TooShort});
  statistics.add({TooShort});
  return statistics;
}

TEST(MessageStatistics, TheTableHasLogCodesInOrderThenMessagesWithoutOneThenTheSums) {
  EXPECT_EQ(
      someOfEverything().asTable(),
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "0x0020                 1            0            0            0            1                0\n"
      "0x1183                 1            0            0            1            0                0\n"
      "0xB17F                 3            2            1            0            0                0\n"
      "0xFF0001               1            1            0            0            0                0\n"
      "no header              2            0            2            0            0                0\n"
      "no log type            1            0            0            0            1                0\n"
      "Total                  9            3            3            1            2                0\n");
}

TEST(MessageStatistics, WithoutMessagesThereAreOnlyTheSums) {
  EXPECT_EQ(
      MessageStatistics().asTable(),
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "Total                  0            0            0            0            0                0\n");
  EXPECT_EQ(
      MessageStatistics().asJson({}),
      "{\"Messages\":[],\"Frames\":{\"Received\":0,\"Records\":0,\"Bad checksum\":0,\"Torn\":0,\"Other "
      "commands\":0,\"Encrypted\":0,\"Broken\":0,\"Too long\":0},\"Noise Bytes\":0,\"SIM\":[],\"Total\":"
      "{\"Received\":0,\"Decoded\":0,\"Too Short\":0,\"Too Long\":0,\"Unknown\":0,\"Unknown Version\":0}}\n");
}

TEST(MessageStatistics, JsonHasTheSameNumbersAndTheCaptureWhenItIsNamed) {
  MessageStatistics statistics;
  statistics.add({Decoded, 0xB17F});
  statistics.add({TooShort});
  LeftOut leftOut;
  leftOut.torn = 2;
  leftOut.encrypted = 3;
  leftOut.noiseBytes = 70;
  statistics.setCapture({{std::nullopt, 1}, {std::uint8_t{1}, 4}}, leftOut);
  EXPECT_EQ(
      statistics.asJson("a \"b\".pcap"),
      R"({"Capture":"a \"b\".pcap","Messages":[)"
      R"({"Name":"0xB17F","Log Code":45439,)"
      R"("Received":1,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":0,"Unknown Versions":[]},)"
      R"({"Name":"no header","Log Code":null,)"
      R"("Received":1,"Decoded":0,"Too Short":1,"Too Long":0,"Unknown":0,"Unknown Version":0,)"
      R"("Unknown Versions":[]}],)"
      R"("Frames":{"Received":10,"Records":5,"Bad checksum":0,"Torn":2,"Other commands":0,)"
      R"("Encrypted":3,"Broken":0,"Too long":0},"Noise Bytes":70,)"
      R"("SIM":[{"Number":null,"Records":1},{"Number":1,"Records":4}],)"
      R"("Total":{"Received":2,"Decoded":1,"Too Short":1,"Too Long":0,"Unknown":0,"Unknown Version":0}})"
      "\n");
}

MessageStatistics someUnknownVersions() {
  MessageStatistics statistics;
  statistics.add({Decoded, 0xB193});
  statistics.add({UnknownVersion, 0xB193, PacketVersion{1, 25, 99}});
  statistics.add({UnknownVersion, 0xB0C1, PacketVersion{37}});
  statistics.add({UnknownVersion, 0xB193, PacketVersion{1, 25, 8}});
  statistics.add({UnknownVersion, 0xB193, PacketVersion{1, 25, 99}});
  statistics.add({UnknownVersion, 0xB823, PacketVersion{0xFFFFFFFF}});
  return statistics;
}

TEST(MessageStatistics, EachUnknownVersionHasALineBelowItsLogCode) {
  EXPECT_EQ(
      someUnknownVersions().asTable(),
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "0xB0C1                 1            0            0            0            0                1\n"
      "0xB0C1 v37                                                                                  1\n"
      "0xB193                 4            1            0            0            0                3\n"
      "0xB193 v25.8                                                                                1\n"
      "0xB193 v25.99                                                                               2\n"
      "0xB823                 1            0            0            0            0                1\n"
      "0xB823 v65535.65535                                                                         1\n"
      "Total                  6            1            0            0            0                5\n");
}

TEST(MessageStatistics, JsonHasTheUnknownVersionsOfEachLogCode) {
  EXPECT_THAT(
      someUnknownVersions().asJson({}),
      HasSubstr(R"("Received":4,"Decoded":1,"Too Short":0,"Too Long":0,"Unknown":0,"Unknown Version":3,)"
                R"("Unknown Versions":[{"Version":"25.8","Messages":1},{"Version":"25.99","Messages":2}]})"));
}

TEST(MessageStatistics, ALogCodeNames32VersionsAndSumsUpTheOthers) {
  MessageStatistics statistics;
  for (std::uint32_t version = 0; version < 35; ++version)
    statistics.add({UnknownVersion, 0xB823, PacketVersion{version}});
  statistics.add({UnknownVersion, 0xB823, PacketVersion{31}});
  const std::string table = statistics.asTable();
  EXPECT_THAT(table,
              HasSubstr("\n0xB823 v31                                                                       "
                        "           2\n0xB823 other versions                                            "
                        "                           3\nTotal "));
  EXPECT_THAT(table, Not(HasSubstr("v32")));
  EXPECT_THAT(statistics.asJson({}),
              HasSubstr(R"({"Version":"31","Messages":2},{"Version":null,"Messages":3}]})"));
}

TEST(MessageStatistics, FramesAreTheRecordsAndWhatWasLeftOut) {
  MessageStatistics statistics;
  LeftOut leftOut;
  leftOut.badChecksum = 1;
  leftOut.otherCommands = 20;
  leftOut.noiseBytes = 70;
  statistics.setCapture({{std::nullopt, 1}, {std::uint8_t{1}, 4}, {std::uint8_t{2}, 3}}, leftOut);
  EXPECT_EQ(statistics.asTable(),
            "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
            "Total                  0            0            0            0            0                0\n"
            "\n"
            "Frames                29\n"
            "Records                8\n"
            "Bad checksum           1\n"
            "Other commands        20\n"
            "Noise bytes           70\n"
            "\n"
            "No SIM                 1\n"
            "SIM 1                  4\n"
            "SIM 2                  3\n");
}

TEST(MessageStatistics, ObjectsAreCountedAsSuch) {
  MessageStatistics statistics;
  statistics.add({Decoded});
  EXPECT_EQ(
      statistics.asTable(),
      "Log code        Received      Decoded    Too short     Too long      Unknown  Unknown version\n"
      "objects                1            1            0            0            0                0\n"
      "Total                  1            1            0            0            0                0\n");
}

}  // namespace
}  // namespace varnel
