#include <gmock/gmock.h>

#include <sys/stat.h>

#include <regex>
#include <set>
#include <sstream>

#include "LogGenerator/LogMessage.h"
#include "LogGenerator/Radios/AirMessage.h"
#include "tests/support/Tool.h"
#include "tests/varnel-decode/DecodeProgram.h"

// Runs the whole program as an exporter of messages, and lets tshark read what it wrote.

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

std::string bytes(std::initializer_list<int> numbers) {
  std::string text;
  for (const int number : numbers) text += static_cast<char>(number);
  return text;
}

void put(std::string& text, std::size_t offset, std::uint64_t number, int size) {
  text.replace(offset, static_cast<std::size_t>(size), littleEndian(number, size));
}

// A cell of LTE, and frame 392, subframe 4.
constexpr std::uint16_t physicalCell = 289, frameWord = 392 << 4 | 4;

// Where the fields of a header are.
struct Header {
  std::size_t size, cell, channel;
  int channelSize;
  std::size_t frame, number, length;
};

std::string lteRRC(std::uint8_t version, std::uint8_t number, const std::string& message,
                   std::uint32_t earfcn = 5230) {
  const Header at = version <= 4    ? Header{13, 4, 6, 2, 8, 10, 11}
                    : version <= 7  ? Header{17, 4, 6, 2, 8, 10, 15}
                    : version <= 24 ? Header{19, 4, 6, 4, 10, 12, 17}
                    : version <= 29 ? Header{21, 6, 8, 4, 12, 14, 19}
                                    : Header{24, 6, 8, 4, 12, 14, 19};
  std::string header(at.size, '\0');
  put(header, 0, version, 1);
  put(header, at.cell, physicalCell, 2);
  put(header, at.channel, earfcn, at.channelSize);
  put(header, at.frame, frameWord, 2);
  put(header, at.number, number, 1);
  put(header, at.length, message.size(), 2);
  return packet(1, 0xB0C0, header + message);
}

// A part of a message: 1 is the first, 7 the last one.
std::string lteRRCPart(std::uint8_t part, std::uint8_t number, const std::string& message) {
  std::string whole = lteRRC(30, number, message);
  whole[13 + 23] = static_cast<char>(part);
  return whole;
}

std::string nrRRC(std::uint8_t version, std::uint8_t number, const std::string& message) {
  const Header at = version <= 9    ? Header{24, 7, 9, 4, 13, 17, 22}
                    : version <= 14 ? Header{23, 7, 9, 4, 13, 16, 21}
                                    : Header{35, 7, 17, 4, 21, 24, 29};
  std::string header(at.size, '\0');
  put(header, 0, version, 4);
  put(header, at.cell, 500, 2);
  put(header, at.channel, 504990, 4);
  put(header, at.number, number, 1);
  put(header, at.length, message.size(), 2);
  return packet(1, 0xB821, header + message);
}

std::string lteNAS(std::uint16_t logCode, const std::string& message) {
  return packet(1, logCode, bytes({1, 9, 5, 0}) + message);
}

std::string nrNAS(std::uint16_t logCode, const std::string& message) {
  return packet(1, logCode, bytes({1, 0, 0, 0, 15, 4, 0}) + message);
}

std::string umtsRRC(std::uint8_t channel, const std::string& message) {
  return packet(1, 0x412F, littleEndian(channel, 1) + '\0' + littleEndian(message.size(), 2) + message);
}

std::string gsmRR(std::uint8_t channel, std::uint8_t type, const std::string& message) {
  return packet(1, 0x512F,
                littleEndian(channel, 1) + littleEndian(type, 1) + littleEndian(message.size(), 1) + message);
}

std::string circuitNAS(std::uint8_t fromPhone, const std::string& message) {
  return packet(1, 0x713A, littleEndian(fromPhone, 1) + littleEndian(message.size(), 4) + message);
}

const std::string zeros(24, '\0');
const std::string release = bytes({0x28, 0x02});
constexpr int downlink = 1, uplink = 2;

struct Sample {
  std::string packet;
  std::string name;  // ours
  int direction;     // as tshark shows it
  std::string comment;
  std::string shown{};  // tshark's name where it differs
};

constexpr const char* lteCell = ", EARFCN 5230, cell 289, SFN 392.4";
constexpr const char* nrCell = ", NR-ARFCN 504990, cell 500";

std::string onLTE(const char* channel) { return std::string("LTE RRC ") + channel + lteCell; }
std::string onNR(const char* channel) { return std::string("NR RRC ") + channel + nrCell; }

std::vector<Sample> lteSamples() {
  return {
      // Each numbering of the channels and each header.
      {lteRRC(2, 6, release), "RRCConnectionRelease", downlink, onLTE("DL-DCCH")},
      {lteRRC(6, 4, bytes({0x20})), "Paging", downlink, onLTE("PCCH")},
      {lteRRC(8, 7, bytes({0x51, 0x23, 0x45, 0x67, 0x89, 0xA8})), "RRCConnectionRequest", uplink,
       onLTE("UL-CCCH")},
      {lteRRC(9, 12, bytes({0x40, 0x80})), "RRCConnectionReject", downlink, onLTE("DL-CCCH")},
      {lteRRC(13, 8, bytes({0x2A, 0x00})), "SecurityModeComplete", uplink, onLTE("UL-DCCH")},
      {lteRRC(15, 1, bytes({0x62, 0x54, 0x00})), "MasterInformationBlock", downlink, onLTE("BCCH-BCH")},
      {lteRRC(19, 9, release), "RRCConnectionRelease", downlink, onLTE("DL-DCCH")},
      {lteRRC(20, 2, zeros), "SystemInformation", downlink, onLTE("BCCH-DL-SCH")},
      {lteRRC(24, 9, bytes({0x2A, 0x00})), "SecurityModeComplete", uplink, onLTE("UL-DCCH")},
      {lteRRC(25, 4, zeros), "MBSFNAreaConfiguration-r9", downlink, onLTE("MCCH")},
      {lteRRC(26, 9, release), "RRCConnectionRelease", downlink, onLTE("DL-DCCH")},
      {lteRRC(27, 7, bytes({0x20}), 66486), "Paging", downlink,
       "LTE RRC PCCH, EARFCN 66486, cell 289, SFN 392.4"},
      {lteRRC(30, 11, bytes({0x2A, 0x00})), "SecurityModeComplete", uplink, onLTE("UL-DCCH")},
      {lteRRC(26, 49, release), "RRCConnectionRelease-NB", downlink, onLTE("DL-DCCH-NB")},
      {lteRRC(20, 56, bytes({0x10})), "Paging-NB", downlink, onLTE("PCCH-NB")},
      {lteNAS(0xB0E2, bytes({0x02, 0x01, 0xD9})), "ESM information request", downlink, "LTE NAS"},
      {lteNAS(0xB0E3, bytes({0x52, 0x00, 0xCE})), "Deactivate EPS bearer context accept", uplink, "LTE NAS"},
      {lteNAS(0xB0E3, bytes({0x52, 0x00, 0xCE}) + zeros), "Deactivate EPS bearer context accept", uplink,
       "LTE NAS"},
      {lteNAS(0xB0EC, bytes({0x07, 0x55, 0x01})), "Identity request", downlink, "LTE NAS"},
      {lteNAS(0xB0ED, bytes({0x07, 0x4A})), "Tracking area update complete", uplink, "LTE NAS"},
      {lteNAS(0xB0EB, bytes({0xC7, 0x05, 0x11, 0x22})), "Service request", uplink, "LTE NAS"},
      {lteNAS(0xB0EA, bytes({0x17, 0x11, 0x12, 0x13, 0x14, 0x05, 0x07, 0x46})), "Detach accept", downlink,
       "LTE NAS"},
      {lteNAS(0xB0EA, bytes({0x27, 0x11, 0x12, 0x13, 0x14, 0x06, 0x71, 0x22, 0x33, 0x44})),
       "Security Protected (ciphered)", downlink, "LTE NAS", "Ciphered message"},
  };
}

std::vector<Sample> olderSamples() {
  const std::string cell = littleEndian(10588, 2) + littleEndian(77, 2);
  return {
      {umtsRRC(0, zeros), "CellUpdate", uplink, "UMTS RRC UL-CCCH"},
      {umtsRRC(1, std::string(6, '\0')), "ActiveSetUpdateComplete", uplink, "UMTS RRC UL-DCCH"},
      {umtsRRC(2, zeros), "CellUpdateConfirm-CCCH", downlink, "UMTS RRC DL-CCCH"},
      {umtsRRC(3, zeros), "ActiveSetUpdate", downlink, "UMTS RRC DL-DCCH"},
      {umtsRRC(4, zeros), "SystemInformation-BCH", downlink, "UMTS RRC BCCH-BCH"},
      {umtsRRC(0x85, cell + zeros), "SystemInformation-FACH", downlink,
       "UMTS RRC BCCH-FACH, UARFCN 10588, scrambling code 77"},
      {umtsRRC(0x89, cell + '\3' + zeros), "SysInfoType3", downlink,
       "UMTS RRC, UARFCN 10588, scrambling code 77"},
      {umtsRRC(0xFE, bytes({29}) + zeros), "SysInfoType15-5", downlink, "UMTS RRC"},
      {circuitNAS(0, bytes({0x08, 0x03})), "Attach Complete", downlink, "UMTS NAS"},
      {gsmRR(0x83, 0x3F,
             bytes({0x2D, 0x06, 0x3F, 0x00, 0x60, 0xC1, 0xE2, 0x83, 0x11, 0xA2, 0x05, 0x00}) +
                 std::string(11, '\x2B')),
       "Immediate Assignment", downlink, "GSM RR CCCH"},
      {gsmRR(0x81, 0x1B, bytes({0x49, 0x06, 0x1B, 0x00, 0x01, 0x00, 0xF1, 0x10, 0x00, 0x01, 0xC8, 0x00,
                                0x28, 0x0F, 0x65, 0x32, 0x79, 0x00, 0x00, 0x2B, 0x2B, 0x2B, 0x2B})),
       "System Information Type 3", downlink, "GSM RR BCCH"},
      {gsmRR(0x80, 0x0D, bytes({0x06, 0x0D, 0x00})), "Channel Release", downlink, "GSM RR DCCH"},
      {gsmRR(0x05, 0x32, bytes({0x06, 0x32})), "Ciphering Mode Complete", uplink, "GSM RR SDCCH"},
      {circuitNAS(0, bytes({0x05, 0x18, 0x01})), "Identity Request", downlink, "GSM NAS"},
      {circuitNAS(1, bytes({0x03, 0x2D})), "Release", uplink, "GSM NAS"},
  };
}

std::vector<Sample> nrSamples() {
  return {
      {nrRRC(8, 1, std::string(3, '\0')), "MIB", downlink, onNR("BCCH-BCH")},
      {nrRRC(8, 8, bytes({0x2A, 0x00})), "SecurityModeComplete", uplink, onNR("UL-DCCH")},
      {nrRRC(8, 9, std::string(1, '\0')), "RRCReconfiguration", downlink, std::string("NR RRC") + nrCell},
      {nrRRC(8, 10, std::string(1, '\0')), "RRCReconfigurationComplete", uplink,
       std::string("NR RRC") + nrCell},
      {nrRRC(8, 26, std::string(1, '\0')), "RadioBearerConfig", downlink, std::string("NR RRC") + nrCell},
      {nrRRC(12, 4, bytes({0x12, 0x00})), "RRCRelease", downlink, onNR("DL-DCCH")},
      {nrRRC(26, 6, std::string(1, '\0')), "Paging", downlink, onNR("PCCH")},
      {nrRRC(26, 8, std::string(8, '\0')), "RRCResumeRequest1", uplink, onNR("UL-CCCH1")},
      {nrNAS(0xB80A, bytes({0x7E, 0x00, 0x5B, 0x01})), "Identity request", downlink, "NR NAS"},
      {nrNAS(0xB80B, bytes({0x7E, 0x00, 0x43})), "Registration complete", uplink, "NR NAS"},
      {nrNAS(0xB801, bytes({0x2E, 0x01, 0x01, 0xD1})), "PDU session release request", uplink, "NR NAS"},
  };
}

std::vector<Sample> joined(std::vector<Sample> samples, const std::vector<Sample>& more) {
  samples.insert(samples.end(), more.begin(), more.end());
  return samples;
}

std::string captureOf(const std::vector<Sample>& samples) {
  std::string capture = pcapHeader();
  std::uint32_t second = afternoon;
  for (const Sample& sample : samples) capture += pcapRecord(second++, 250'000'000, sample.packet);
  return capture;
}

// Without what analyzers write differently: spaces, hyphens and dots, and uppercase letters.
std::string comparable(const std::string& text) {
  std::string kept;
  for (const char letter : text)
    if (std::isalnum(static_cast<unsigned char>(letter)))
      kept += static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
  return kept;
}

// The release at the end of a name is not always shown.
bool isShownAs(const std::string& name, const std::string& shown) {
  const std::string withoutRelease = std::regex_replace(name, std::regex("-r[0-9]+$"), "");
  return comparable(shown).find(comparable(withoutRelease)) != std::string::npos;
}

class DecodeMessages : public DecodeProgram {
 protected:
  using Row = std::vector<std::string>;

  // The columns of the packets, as tshark shows them.
  std::vector<Row> shown(const std::string& file, const std::vector<std::string>& columns,
                         const std::string& filter = "frame") const {
    std::vector<std::string> arguments = {"-n", "-r",     file, "-Y",          filter,
                                          "-T", "fields", "-E", "separator=/t"};
    for (const std::string& column : columns) arguments.insert(arguments.end(), {"-e", column});
    Process tshark(tool("tshark"), arguments, {"WIRESHARK_CONFIG_DIR=" + folder.file(""), "LC_ALL=C.UTF-8"});
    EXPECT_TRUE(tshark.waitForEnd());
    EXPECT_EQ(tshark.exitStatus(), 0) << tshark.error();
    std::vector<Row> rows;
    std::istringstream output(tshark.output());
    for (std::string line; std::getline(output, line);) {
      std::istringstream text(line);
      Row& row = rows.emplace_back();
      for (std::string cell; std::getline(text, cell, '\t');) row.push_back(cell);
      row.resize(columns.size());
    }
    return rows;
  }

  Result exported(const std::string& capture, std::vector<std::string> options = {}) const {
    options.insert(options.begin(), {"--format", "none", "--messages", out});
    options.push_back(write("capture", capture));
    return run(options);
  }

  void expectShown(const std::vector<Sample>& samples) const {
    const std::vector<Row> rows = shown(out, {"frame.time_epoch", "frame.packet_flags_direction",
                                              "frame.comment", "_ws.col.Info", "_ws.malformed"});
    ASSERT_EQ(rows.size(), samples.size());
    for (std::size_t i = 0; i < rows.size(); ++i) {
      const Sample& sample = samples[i];
      const std::string name = sample.name + ", message " + std::to_string(i);
      EXPECT_EQ(rows[i][0], std::to_string(afternoon + i) + ".250000000") << name;
      EXPECT_EQ(std::stoi(rows[i][1], nullptr, 0), sample.direction) << name;
      EXPECT_EQ(rows[i][2], sample.comment) << name;
      EXPECT_TRUE(isShownAs(sample.shown.empty() ? sample.name : sample.shown, rows[i][3]))
          << name << " is shown as " << rows[i][3];
      EXPECT_EQ(rows[i][4], "") << name;
    }
    EXPECT_THAT(shown(out, {"frame.number"}, "_ws.malformed"), IsEmpty());
  }

  const std::string out = folder.file("messages.pcapng");
};

TEST(MessageSamples, HaveTheseNames) {
  AirMessageReader reader;
  for (const Sample& sample : joined(joined(lteSamples(), olderSamples()), nrSamples())) {
    const Bytes message(sample.packet.begin(), sample.packet.end());
    const auto framed = LogMessage::framed(message);
    const AirMessageReading reading = reader.read(framed->packet(), framed->logCode());
    ASSERT_TRUE(reading.message) << sample.name;
    EXPECT_EQ(reading.message->name, sample.name);
  }
}

TEST_F(DecodeMessages, TsharkShowsThemAsWeDo) {
  const auto samples = joined(joined(lteSamples(), olderSamples()), nrSamples());
  const Result result = exported(captureOf(samples));
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(result.output, "");
  expectShown(samples);
}

TEST_F(DecodeMessages, TsharkShowsThemInGsmtap) {
  const auto samples = joined(lteSamples(), olderSamples());
  const Result result = exported(captureOf(joined(samples, nrSamples())), {"--messages-as", "gsmtap"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "varnel-decode: 11 messages of " + folder.file("capture") + " are not in " + out +
                              ": 3 of NR NAS, which GSMTAP cannot hold, 8 of NR RRC, which GSMTAP cannot "
                              "hold\n");
  expectShown(samples);
  const std::vector<Row> headers =
      shown(out, {"gsmtap.arfcn", "gsmtap.uplink", "gsmtap.frame_nr", "ip.checksum.status", "udp.dstport"});
  EXPECT_EQ(headers[2], (Row{"5230", "1", "392", "2", "4729"}));
  EXPECT_EQ(headers[11], (Row{"0", "0", "392", "2", "4729"})) << "66486 does not fit";
}

// A message for each first octet, on each channel and of each protocol.
std::vector<std::string> everyFirstOctet() {
  std::vector<std::string> packets;
  const std::string rest(40, '\0');
  for (int octet = 0; octet < 256; ++octet) {
    const std::string message = bytes({octet}) + rest;
    for (const std::uint8_t number : {3, 7, 8, 9, 10, 11, 46, 47, 48, 49, 50, 52})
      packets.push_back(lteRRC(26, number, message));
    for (const std::uint8_t number : {1, 2, 3, 4, 5, 6, 7, 8, 9})
      packets.push_back(nrRRC(26, number, message));
    for (const std::uint8_t number : {0, 1, 2, 3, 5, 6, 7, 8}) packets.push_back(umtsRRC(number, message));
    packets.push_back(lteNAS(0xB0EC, bytes({0x07, octet}) + rest));
    packets.push_back(lteNAS(0xB0E2, bytes({0x52, 0x01, octet}) + rest));
    packets.push_back(nrNAS(0xB80A, bytes({0x7E, 0x00, octet}) + rest));
    packets.push_back(nrNAS(0xB800, bytes({0x2E, 0x01, 0x01, octet}) + rest));
    packets.push_back(gsmRR(0x80, static_cast<std::uint8_t>(octet), bytes({0x06, octet}) + rest));
    for (const int discriminator : {0x03, 0x05, 0x08, 0x09, 0x0A, 0x0B})
      packets.push_back(circuitNAS(0, bytes({discriminator, octet}) + rest));
  }
  return packets;
}

TEST_F(DecodeMessages, EveryNameIsThatOfTshark) {
  const std::vector<std::string> packets = everyFirstOctet();
  std::string capture = pcapHeader();
  for (const std::string& message : packets) capture += pcapRecord(afternoon, 0, message);
  EXPECT_EQ(exported(capture).error, "");
  const std::vector<Row> rows = shown(out, {"_ws.col.Info"});
  ASSERT_EQ(rows.size(), packets.size());
  AirMessageReader reader;
  std::set<std::string> differences;
  for (std::size_t i = 0; i < rows.size(); ++i) {
    const Bytes message(packets[i].begin(), packets[i].end());
    const auto framed = LogMessage::framed(message);
    const AirMessageReading reading = reader.read(framed->packet(), framed->logCode());
    const std::string name(reading.message->name);
    const bool isName = name != "Unknown" && name != "Spare" && name != "Extension";
    if (isName && !isShownAs(name, rows[i][0])) differences.insert(name + " | " + rows[i][0]);
  }
  // tshark 4.0 does not know these messages.
  EXPECT_THAT(
      differences,
      ElementsAre("GERAN Iu Mode Classmark Change | (DTAP) (RR) ",
                  "System Information Type 13alt | (DTAP) (RR) ", "System Information Type 15 | (DTAP) (RR) ",
                  "System Information Type 22 | (DTAP) (RR) ", "System Information Type 23 | (DTAP) (RR) ",
                  "System Information Type 2n | (DTAP) (RR) "));
}

TEST_F(DecodeMessages, TheFileIsTheOwnersAlone) {
  EXPECT_EQ(exported(captureOf(lteSamples())).status, 0);
  struct stat status {};
  ASSERT_EQ(::stat(out.c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777, 0600u);
}

TEST_F(DecodeMessages, EachSubscriptionHasAnInterfaceAndAReader) {
  const std::string one = "\x81\x01", two = "\x81\x02";
  const std::string capture = pcapHeader() +
                              pcapRecord(afternoon, 0, two + lteRRCPart(1, 9, release.substr(0, 1))) +
                              pcapRecord(afternoon + 1, 0, one + lteRRC(26, 7, bytes({0x20}))) +
                              pcapRecord(afternoon + 2, 0, one + lteRRCPart(7, 9, release.substr(1))) +
                              pcapRecord(afternoon + 3, 0, two + lteRRCPart(7, 9, release.substr(1))) +
                              pcapRecord(afternoon + 4, 0, lteNAS(0xB0ED, bytes({0x07, 0x4A})));
  EXPECT_EQ(exported(capture).error, "");
  const std::vector<std::string> columns = {"frame.time_epoch", "frame.interface_name", "_ws.col.Info"};
  EXPECT_THAT(shown(out, columns),
              ElementsAre(ElementsAre("1709301910.000000000", "SIM 1", HasSubstr("Paging")),
                          ElementsAre("1709301912.000000000", "SIM 2", HasSubstr("RRCConnectionRelease")),
                          ElementsAre("1709301913.000000000", "No SIM", "Tracking area update complete")));
  EXPECT_EQ(exported(capture, {"--sim", "2"}).error, "");
  EXPECT_EQ(shown(out, columns).size(), 2u);
}

TEST_F(DecodeMessages, WhatIsNotInTheFileIsCountedByReason) {
  std::string wrongLength = lteRRC(26, 9, release);
  wrongLength[13 + 19] = 9;
  const std::string capture =
      pcapHeader() + pcapRecord(afternoon, 0, lteRRC(26, 9, release)) +
      pcapRecord(afternoon, 0, lteRRC(26, 200, release)) + pcapRecord(afternoon, 0, lteRRC(99, 9, release)) +
      pcapRecord(afternoon, 0, lteRRC(99, 9, release)) + pcapRecord(afternoon, 0, wrongLength) +
      pcapRecord(afternoon, 0, gsmRR(0x02, 0, "\x01")) + pcapRecord(afternoon, 0, antennas(2)) +
      pcapRecord(afternoon, 0, simFiles("<dict/>"));
  const Result result = exported(capture);
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error,
            "varnel-decode: 5 messages of " + folder.file("capture") + " are not in " + out +
                ": 1 of GSM RR RACH, which no dissector reads, 1 of LTE RRC, which no dissector reads, 2 of "
                "versions that are not known, 1 whose lengths are wrong\n");
  EXPECT_EQ(shown(out, {"frame.number"}).size(), 1u);
}

TEST_F(DecodeMessages, ACaptureWithoutMessagesYieldsAnEmptyFileAndALine) {
  const Result result = exported(pcapHeader() + pcapRecord(afternoon, 0, antennas(2)));
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "varnel-decode: " + folder.file("capture") + " has no RRC or NAS messages, so " +
                              out + " is empty\n");
  EXPECT_THAT(shown(out, {"frame.number"}), IsEmpty());
}

TEST_F(DecodeMessages, TheyAreWrittenBesideWhateverIsDecoded) {
  const std::string capture = write("capture", pcapHeader() + pcapRecord(afternoon, 0, antennas(2)) +
                                                   pcapRecord(afternoon + 1, 0, lteRRC(26, 9, release)));
  const Result result = run({"--technology", "kalvi-lte", "--csv", "Serving Cell Info/Num Tx Antennas",
                             "--messages", out, capture});
  EXPECT_EQ(result.status, 0) << result.error;
  EXPECT_THAT(result.output, HasSubstr(",2\n"));
  EXPECT_EQ(shown(out, {"frame.number"}).size(), 1u);
}

TEST_F(DecodeMessages, SeveralCapturesAreRefused) {
  const std::string capture = write("capture", captureOf(lteSamples()));
  const Result two = run({"--format", "none", "--messages", out, capture, capture});
  EXPECT_EQ(two.status, 2);
  EXPECT_THAT(two.error, HasSubstr("--messages takes one capture at a time"));
}

TEST_F(DecodeMessages, TheFormGoesWithThem) {
  const Result form = run({"--messages-as", "gsmtap", write("capture", captureOf(lteSamples()))});
  EXPECT_EQ(form.status, 2);
  EXPECT_THAT(form.error, HasSubstr("--messages-as goes with --messages"));
}

}  // namespace
}  // namespace varnel
