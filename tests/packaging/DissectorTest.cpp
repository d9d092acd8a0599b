#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <fstream>
#include <iterator>
#include <random>
#include <sstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Bytes.h"
#include "tests/support/Process.h"
#include "tests/support/Tool.h"

// What tshark shows of captures with the dissector of this build.

namespace varnel {
namespace {

using testing::AllOf;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;

void append(Bytes& bytes, const Bytes& more) { bytes.insert(bytes.end(), more.begin(), more.end()); }

void appendU32(Bytes& bytes, std::size_t number) {
  for (int shift = 0; shift < 32; shift += 8) bytes.push_back(static_cast<std::uint8_t>(number >> shift));
}

// A message in a capture, which may hold only a part of it.
struct Captured {
  Captured(Bytes message) : bytes(std::move(message)), size(bytes.size()) {}
  Captured(Bytes beginning, std::size_t wholeSize) : bytes(std::move(beginning)), size(wholeSize) {}

  Bytes bytes;
  std::size_t size;
};

// A pcap file of link type 147. Its records are dated 2 s after the start of 1970.
Bytes pcap(const std::vector<Captured>& messages) {
  Bytes file = {0xD4, 0xC3, 0xB2, 0xA1, 2, 0, 4, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0xFF, 0xFF, 0, 0, 147, 0, 0, 0};
  for (const Captured& message : messages) {
    append(file, {2, 0, 0, 0, 0, 0, 0, 0});
    appendU32(file, message.bytes.size());
    appendU32(file, message.size);
    append(file, message.bytes);
  }
  return file;
}

// A pcapng file with a section header, an interface of link type 147, and one packet of 16 bytes.
Bytes pcapng(const Bytes& message) {
  Bytes file = {0x0A, 0x0D, 0x0D, 0x0A, 28,   0,    0,    0,    0x4D, 0x3C, 0x2B, 0x1A, 1, 0,
                0,    0,    0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 28,   0,    0, 0,  //
                1,    0,    0,    0,    20,   0,    0,    0,    147,  0,    0,    0,           //
                0,    0,    0,    0,    20,   0,    0,    0,                                   //
                6,    0,    0,    0,    48,   0,    0,    0,    0,    0,    0,    0,    0, 0,
                0,    0,    0,    0,    0,    0,    16,   0,    0,    0,    16,   0,    0, 0};
  append(file, message);
  append(file, {48, 0, 0, 0});
  return file;
}

// A packet of this log type and code with the right length and without a time.
Bytes packet(std::uint8_t logType, std::uint16_t logCode, const Bytes& payload = {}) {
  const auto length = static_cast<std::uint8_t>(12 + payload.size());
  Bytes bytes = {logType, length, 0, static_cast<std::uint8_t>(logCode),
                 static_cast<std::uint8_t>(logCode >> 8)};
  append(bytes, Bytes(8));
  append(bytes, payload);
  return bytes;
}

Bytes bytesOf(std::string_view text) { return Bytes(text.begin(), text.end()); }

class Dissector : public testing::Test {
 protected:
  // One line per message: the fields in the given order, with tabs between them.
  std::vector<std::string> shown(const std::vector<Captured>& messages,
                                 const std::vector<std::string>& fields) {
    return shownOfFile(pcap(messages), fields);
  }

  std::vector<std::string> shownOfFile(const Bytes& file, const std::vector<std::string>& fields,
                                       const std::string& filter = {}) {
    std::vector<std::string> arguments = {"-T", "fields", "-E", "separator=/t", "-E", "aggregator=|"};
    for (const std::string& field : fields) {
      arguments.push_back("-e");
      arguments.push_back(field);
    }
    if (!filter.empty()) {
      arguments.push_back("-Y");
      arguments.push_back(filter);
    }
    std::istringstream output(run(file, arguments));
    std::vector<std::string> lines;
    for (std::string line; std::getline(output, line);) lines.push_back(line);
    return lines;
  }

  // What tshark prints, without a user's settings.
  std::string run(const Bytes& file, const std::vector<std::string>& arguments) {
    const std::string path = _folder.file("capture");
    std::ofstream(path, std::ios::binary)
        .write(reinterpret_cast<const char*>(file.data()), static_cast<std::streamsize>(file.size()));
    std::vector<std::string> all = {"-n", "-r", path, "-X", "lua_script:" VARNEL_DISSECTOR};
    all.insert(all.end(), arguments.begin(), arguments.end());
    Process tshark(tool("tshark"), all, {"WIRESHARK_CONFIG_DIR=" + _folder.file(""), "LC_ALL=C.UTF-8"});
    EXPECT_TRUE(tshark.waitForEnd(std::chrono::seconds(100)));
    EXPECT_EQ(tshark.exitStatus(), 0) << tshark.error();
    EXPECT_THAT(tshark.error(), AllOf(Not(HasSubstr("Lua")), Not(HasSubstr("lua"))))
        << "a fault of the script";
    return tshark.output();
  }

 private:
  TemporaryFolder _folder;
};

const std::vector<std::string> header = {"varnel.subscription", "varnel.log_type", "varnel.length",
                                         "varnel.log_code",     "varnel.time",     "varnel.payload",
                                         "_ws.expert.message"};

// 0x00FDAE6F47A83000 is 71404962074603520: 1089553254312 units of 1.25 ms since 1980 and 12288 parts.
const Bytes servingCell = {1, 14, 0, 0x7F, 0xB1, 0, 0x30, 0xA8, 0x47, 0x6F, 0xAE, 0xFD, 0, 0xAA, 0xBB};

TEST_F(Dissector, APacketOfTheModemShowsItsHeaderAndItsPayload) {
  EXPECT_THAT(shown({servingCell}, header), ElementsAre("\t0x01\t14\t0x00b17f\t71404962074603520\taabb\t"));
}

TEST_F(Dissector, AModemsTimeShowsItsDateInUTC) {
  // 712 units of a second are 890 ms, and 12288/49152 of 1.25 ms are 312500 ns.
  EXPECT_THAT(shown({servingCell}, {"varnel.time.date", "varnel.time.since_start"}),
              ElementsAre("Mar  4, 2023 05:06:07.890312500 UTC\t"));
}

TEST_F(Dissector, ATimeBefore1990ShowsNoDate) {
  // 1990-01-01 is 252149760000 units after the start, 0x3AB54C0000.
  Bytes last = packet(1, 0xB17F), first = last;
  const Bytes lastTime = {0xFF, 0xBF, 0xFF, 0xFF, 0x4B, 0xB5, 0x3A, 0},
              firstTime = {0, 0, 0, 0, 0x4C, 0xB5, 0x3A, 0};
  std::copy(lastTime.begin(), lastTime.end(), last.begin() + 5);
  std::copy(firstTime.begin(), firstTime.end(), first.begin() + 5);
  EXPECT_THAT(shown({last, first, packet(1, 0xB17F)}, {"varnel.time.date"}),
              ElementsAre("", "Jan  1, 1990 00:00:00.000000000 UTC", ""));
}

TEST_F(Dissector, TheByteBehind0x81IsTheSubscription) {
  Bytes message = {0x81, 2};
  append(message, servingCell);
  EXPECT_THAT(shown({message}, header), ElementsAre("2\t0x01\t14\t0x00b17f\t71404962074603520\taabb\t"));
}

TEST_F(Dissector, AMessageOfTheServerHasItsPseudoCodeItsMillisecondsAndItsPropertyList) {
  Bytes message = packet(0xFF, 0x0000, bytesOf("<plist/>"));
  message[5] = 0xDC;  // 1500 ms
  message[6] = 0x05;
  EXPECT_THAT(shown({message}, header), ElementsAre("\t0xff\t20\t0xff0000\t1500\t3c706c6973742f3e\t"));
  EXPECT_THAT(shown({message}, {"varnel.time.since_start", "varnel.time.date", "varnel.property_list"}),
              ElementsAre("1.500000000\t\t<plist/>"));
}

TEST_F(Dissector, ABinaryPropertyListIsNamed) {
  EXPECT_THAT(shown({packet(0xFF, 0x0002, bytesOf("bplist00")), packet(0xFF, 0x0002, bytesOf("bplis"))},
                    {"varnel.property_list"}),
              ElementsAre("(binary)", ""));
}

TEST_F(Dissector, AnObjectMessageIsOnePropertyList) {
  EXPECT_THAT(shown({bytesOf("<?xml?>"), bytesOf("bplist00")},
                    {"varnel.property_list", "_ws.col.Info", "varnel.log_type", "_ws.expert.message"}),
              ElementsAre("<?xml?>\tObject message (XML)\t\t", "(binary)\tObject message (binary)\t\t"));
}

TEST_F(Dissector, ALengthThatLiesIsToldWithTheRealOne) {
  Bytes longer = servingCell, shorter = servingCell;
  longer[1] = 15;
  shorter[2] = 0xFF;
  EXPECT_THAT(shown({longer, shorter}, {"varnel.length", "_ws.expert.message"}),
              ElementsAre("15\tThe record length is 15, but the record has 14 bytes",
                          "65294\tThe record length is 65294, but the record has 14 bytes"));
}

TEST_F(Dissector, ALengthIsHeldAgainstThePacketWithoutItsPrefix) {
  Bytes message = {0x81, 0};
  append(message, servingCell);
  message[3] = 16;
  EXPECT_THAT(shown({message}, {"_ws.expert.message"}),
              ElementsAre("The record length is 16, but the record has 14 bytes"));
}

TEST_F(Dissector, AMessageThatWasCutWhenCapturedIsHeldAgainstItsRealSize) {
  const Bytes beginning(servingCell.begin(), servingCell.begin() + 5);
  EXPECT_THAT(shown({Captured(beginning, 15), Captured(beginning, 16)}, header),
              ElementsAre("\t0x01\t14\t0x00b17f\t\t\t",
                          "\t0x01\t14\t0x00b17f\t\t\tThe record length is 14, but the record has 15 bytes"));
}

TEST_F(Dissector, AMessageShorterThanItsHeaderShowsTheFieldsThatItHas) {
  std::vector<Captured> messages;
  for (std::size_t size : {0, 1, 2, 3, 4, 5, 12, 13}) {
    Bytes message = packet(1, 0xB17F);
    message.resize(size);
    if (size > 1) message[1] = static_cast<std::uint8_t>(size - 1);
    messages.emplace_back(message);
  }
  EXPECT_THAT(shown(messages, header),
              ElementsAre("\t\t\t\t\t\tThe message has 0 of the 13 bytes of its header",
                          "\t0x01\t\t\t\t\tThe message has 1 of the 13 bytes of its header",
                          "\t0x01\t\t\t\t\tThe message has 2 of the 13 bytes of its header",
                          "\t0x01\t2\t\t\t\tThe message has 3 of the 13 bytes of its header",
                          "\t0x01\t3\t\t\t\tThe message has 4 of the 13 bytes of its header",
                          "\t0x01\t4\t0x00b17f\t\t\tThe message has 5 of the 13 bytes of its header",
                          "\t0x01\t11\t0x00b17f\t\t\tThe message has 12 of the 13 bytes of its header",
                          "\t0x01\t12\t0x00b17f\t0\t\t"));
}

TEST_F(Dissector, APrefixAloneIsShort) {
  EXPECT_THAT(shown({Bytes{0x81}, Bytes{0x81, 1}, Bytes{0x81, 1, 1}}, header),
              ElementsAre("\t\t\t\t\t\tThe message has 0 of the 13 bytes of its header",
                          "1\t\t\t\t\t\tThe message has 0 of the 13 bytes of its header",
                          "1\t0x01\t\t\t\t\tThe message has 1 of the 13 bytes of its header"));
}

TEST_F(Dissector, AnUnknownLogTypeIsTold) {
  EXPECT_THAT(shown({packet(2, 0xB17F)}, {"varnel.log_type", "_ws.expert.message"}),
              ElementsAre("0x02\tNeither a packet of a modem nor a message of the server"));
}

TEST_F(Dissector, AnUnknownLogCodeIsTold) {
  EXPECT_THAT(shown({packet(1, 0x1234), packet(0xFF, 0xB17F)},
                    {"varnel.log_code", "varnel.section", "_ws.expert.message", "_ws.col.Info"}),
              ElementsAre("0x001234\t\tNo decoder of Varnel knows this log code\t0x1234  unknown",
                          "0xffb17f\t\tNo decoder of Varnel knows this log code\t0xFFB17F  unknown"));
}

TEST_F(Dissector, ALogCodeNamesTheTechnologiesAndSectionsThatItFeeds) {
  EXPECT_THAT(shown({packet(1, 0xB17F), packet(1, 0xB193), packet(1, 0xB180), packet(1, 0xD00C),
                     packet(1, 0x417A), packet(1, 0x7132), packet(1, 0x119C), packet(1, 0x12B6),
                     packet(1, 0x134F), packet(0xFF, 0), packet(0xFF, 2)},
                    {"varnel.section"}),
              ElementsAre("LTE: Serving Cell Measurements|All radios: Measurements",
                          "All radios: Measurements|All radios: Carriers|All radios: Neighbors",
                          "LTE: Neighbor Measurements|LTE: Neighbor Cells List|All radios: Neighbors",
                          "UTRAN: TRCH BLER|UTRAN: CCTRCH SIR|All radios: TRCH BLER|All radios: CCTRCH SIR",
                          "GSM and UMTS: Active Set|GSM and UMTS: Detected Set|GSM and UMTS: Monitored Set|"
                          "GSM and UMTS: Virtual Active Set|All radios: Active Set|All radios: Detected Set|"
                          "All radios: Monitored Set|All radios: Virtual Active Set",
                          "GSM and UMTS: Process PS|GSM and UMTS: Process CO|GSM and UMTS: Serving PLMN|"
                          "GSM and UMTS: Process CS|All radios: Process PS|All radios: Process CO|"
                          "All radios: Process CS|All radios: Serving PLMN",
                          "CDMA2000: 1x|All radios: 1x", "CDMA2000: EV-DO|All radios: EV-DO",
                          "CDMA2000: Network|All radios: Network",
                          "LTE: SIM Info|GSM and UMTS: SIM Info|UTRAN: SIM Info|All radios: SIM Info",
                          "LTE: PDP Context Info|GSM and UMTS: PDP Context Info|UTRAN: PDP Context Info|"
                          "All radios: PDP Context Info"));
}

TEST_F(Dissector, TheListOfMessagesNamesEachOne) {
  EXPECT_THAT(
      shown({servingCell, packet(0xFF, 1), Bytes{1}}, {"_ws.col.Protocol", "_ws.col.Info"}),
      ElementsAre(
          "VARNEL\t0xB17F  LTE: Serving Cell Measurements; All radios: Measurements",
          "VARNEL\t0xFF0001  LTE: Serving Cell Info; GSM and UMTS: GSM Serving Cell, Neighboring Cells, "
          "Serving PLMN, UMTS Set, UMTS RR Info; UTRAN: Serving Cell Info; All radios: Serving Cell, "
          "Neighbors, "
          "UMTS Set, UMTS RR Info, Serving Cell Info, GSM Serving Cell, Neighboring Cells, Serving PLMN",
          "VARNEL\tMessage without a header"));
}

TEST_F(Dissector, AFilterFindsTheMessagesOfASection) {
  EXPECT_THAT(shownOfFile(pcap({packet(1, 0xB180), servingCell, packet(1, 0x1234)}), {"frame.number"},
                          "varnel.section contains \"Serving Cell\" && varnel.log_code == 0xB17F"),
              ElementsAre("2"));
}

TEST_F(Dissector, PcapngIsTakenAsWell) {
  Bytes message = servingCell;
  message[1] = 15;
  message.push_back(0xCC);
  EXPECT_THAT(shownOfFile(pcapng(message), header),
              ElementsAre("\t0x01\t15\t0x00b17f\t71404962074603520\taabbcc\t"));
}

TEST_F(Dissector, NoBytesWhateverMakeTheScriptFail) {
  std::mt19937 random(1);
  std::vector<Captured> messages;
  const std::uint8_t beginnings[] = {1, 0xFF, 0x81, '<', 'b', 0x7E};
  for (int i = 0; i < 2000; ++i) {
    Bytes message(random() % 40);
    for (std::uint8_t& byte : message) byte = static_cast<std::uint8_t>(random());
    if (!message.empty()) message[0] = beginnings[random() % std::size(beginnings)];
    messages.emplace_back(message);
  }
  EXPECT_THAT(shown(messages, {"_ws.col.Protocol", "_ws.lua.error", "_ws.malformed"}),
              AllOf(SizeIs(2000), Each("VARNEL\t\t")));
}

}  // namespace
}  // namespace varnel
