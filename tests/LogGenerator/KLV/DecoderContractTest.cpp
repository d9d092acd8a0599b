#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "LogGenerator/KLV/LTE/LTEClassIndex.h"
#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "tests/support/BeginsWith.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;

using Lines = std::vector<std::string>;

/// The messages of the telephony server. Their payload is a property list, so they have no minimum length.
constexpr std::uint32_t simCode = 0xFF0000;
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr std::uint32_t pdpCode = 0xFF0002;

enum class Technology { GSM, LTE, UTRAN };
enum class SectionKind { Dictionary, List };
/// What a decoder does with a code that it does not have.
enum class ForeignCode { Logged, Ignored, Taken };

/// What holds for the packets of one code.
struct PacketContract {
  std::uint32_t code;
  std::size_t minimumLength = 0;
  /// What a packet of zeros of the minimum length logs behind the trace line.
  Lines lines = {};
  /// The same without a section, where that is something else.
  Lines linesWithoutSection = {};
  /// Whether the section changes at once, or only with a later packet of another code.
  bool isShownAtOnce = true;
};

/// What holds for a decoder.
struct DecoderContract {
  Technology technology;
  const char* section;
  SectionKind kind;
  const char* trace;
  ForeignCode foreignCode;
  std::vector<PacketContract> packets;
};

constexpr auto GSM = Technology::GSM;
constexpr auto LTE = Technology::LTE;
constexpr auto UTRAN = Technology::UTRAN;
constexpr auto Dict = SectionKind::Dictionary;
constexpr auto List = SectionKind::List;
constexpr auto Logged = ForeignCode::Logged;
constexpr auto Ignored = ForeignCode::Ignored;
constexpr auto Taken = ForeignCode::Taken;

// The decoders of each technology in the order of their creation. Codes stand in the order in which their
// decoder subscribes to them. Newer decoders come after these; their own tests hold them.
const std::vector<DecoderContract> contracts = {
    {GSM, "Active Set", List, "<4>ActiveSet", Logged, {{0x417A, 16}}},
    // The trace line of its sibling.
    {GSM, "Coding Scheme", Dict, "<4>CellChangeCounters", Ignored, {}},
    {GSM,
     "GPRS Information",
     Dict,
     "<4>GPRSInformation",
     Logged,
     {{0x51F5, 18}, {0x7135, 32}, {0x51F6, 24}, {0x51FB, 34}, {0x51FD, 35}, {0x51F4, 15}, {0x5137, 29}}},
    {GSM,
     "GSM Serving Cell",
     Dict,
     "<4>GSMServingCell",
     Logged,
     {{0x5134, 26}, {0x5137, 29}, {0x5076, 17}, {cellMonitorCode}}},
    {GSM, "Mobile Allocation", Dict, "<4>MobileAllocation", Logged, {{0x51F8, 15}}},
    {GSM,
     "Neighboring Cells",
     List,
     "<4>NeighboringCells",
     Logged,
     // The BSICs of the second code are shown with the next neighbors.
     {{0x5137, 29}, {.code = 0x51FF, .minimumLength = 15, .isShownAtOnce = false}, {cellMonitorCode}}},
    {GSM, "PDP Context Info", List, "<4>PDPContextList", Taken, {{pdpCode}}},
    {GSM, "Process PS", Dict, "<4>ProcessPS", Logged, {{0x7130, 16}, {0x7132, 16}}},
    {GSM, "UMTS RR Measurement", Dict, "<4>UMTSRRMeasurement", Ignored, {}},
    {GSM, "Cell Change Counters", Dict, "<4>CellChangeCounters", Ignored, {}},
    {GSM, "Detected Set", List, "<4>DetectedSet", Logged, {{0x417A, 16}}},
    {GSM, "GSM Set", List, "<4>GSMSet", Logged, {{0x4005, 15}}},
    {GSM, "Non-Ranked GSM Set", List, "<4>NonRankedGSMSet", Ignored, {}},
    // The trace line of its sibling.
    {GSM, "Process CO", Dict, "<4>ProcessCS", Logged, {{0x7131, 16}, {0x7132, 16}}},
    {GSM, "Serving PLMN", Dict, "<4>Serving PLMN", Logged, {{0x7135, 32}, {0x7132, 16}, {cellMonitorCode}}},
    {GSM, "UMTS Set", List, "<4>UMTSSet", Logged, {{0x4005, 15}, {cellMonitorCode}}},
    {GSM, "Equivalent PLMN List", List, "<4>Equivalent PLMN List", Logged, {{0x7150, 17}}},
    {GSM,
     "GSM RR Info",
     Dict,
     "<4>GSMRRInfo",
     Logged,
     {{0x512C, 17}, {0x5137, 29}, {0x5072, 20}, {0x51F6, 24}}},
    {GSM, "Monitored Set", List, "<4>MonitoredSet", Logged, {{0x417A, 16}}},
    {GSM, "Non-Ranked UMTS Set", List, "<4>NonRankedUMTSSet", Ignored, {}},
    {GSM, "Process CS", Dict, "<4>ProcessCS", Logged, {{0x7131, 16}, {0x7132, 16}}},
    {GSM,
     "UMTS RR Info",
     Dict,
     "<4>UMTSRRInfo",
     Logged,
     {{0x4125, 14}, {0x4031, 16}, {0x4127, 29}, {0x4157, 19}, {cellMonitorCode}}},
    {GSM, "BLER", Dict, "<4>BLER", Logged, {{0x4116, 16}}},
    {GSM, "Virtual Active Set", List, "<4>VirtualActiveSet", Logged, {{0x417A, 16}}},
    {GSM, "SIM Info", Dict, "<4>SimInfo", Ignored, {{simCode}}},
    {GSM, "HSDPA Info", Dict, "<4>HSDPA Info", Ignored, {{0x4221, 18}}},

    {LTE,
     "Serving Cell Info",
     Dict,
     "<4>LTE Serving Cell Info",
     Logged,
     // The second code is decoded, and yet logged as unknown.
     {{0xB0C2, 38}, {0xB0C1, 22, {"<3>Received an unknown log message: 45249"}}, {cellMonitorCode}}},
    {LTE,
     "Connected mode LTE Intra-frequency Measurement",
     Dict,
     "<4>Connected mode LTE Intra-frequency Measurement",
     Logged,
     {{0xB179, 29}}},
    {LTE,
     "Measured Neighbor Cells",
     List,
     "<4>Measured Neighbor Cells",
     Logged,
     {{0xB179, 29, {"<3>Unexpected log packet bytes size: expected=0 actual=29"}}}},
    {LTE, "Detected Cells", List, "<4>Detected Cells", Logged, {{0xB179, 29}}},
    {LTE, "Serving Cell Measurements", Dict, "<4>Serving Cell Measurements", Logged, {{0xB17F, 33}}},
    {LTE, "Neighbor Measurements", Dict, "<4>Neighbor Measurements", Logged, {{0xB180, 21}}},
    {LTE,
     "Neighbor Cells List",
     List,
     "<4>Neighbor Cells List",
     Logged,
     {{0xB180, 21, {"<4>Number of neighboring cells being reported: 1\n"}}}},
    {LTE, "Reselection Candidates", Dict, "<4>Reselection Candidates", Logged, {{0xB186, 21}}},
    {LTE, "Reselection Candidates List", List, "<4>Reselection Candidates List", Logged, {{0xB186, 21}}},
    {LTE, "SIM Info", Dict, "<4>SimInfo", Ignored, {{simCode}}},
    {LTE, "PDP Context Info", List, "<4>PDPContextList", Taken, {{pdpCode}}},

    {UTRAN,
     "RRC Info",
     Dict,
     "<4>RRC Info",
     Ignored,
     // A packet of any length is decoded.
     {{0xD0E0,
       0,
       {"<4>LogCode_0xD0E0 is length is 0 expected size 15",
        "<4>Display Dict = {Old = \"entry\"; State = \"Unknown RRC Mode\"; }, rrc mode = 255 Unknown RRC "
        "Mode"},
       {"<4>LogCode_0xD0E0 is length is 0 expected size 15",
        "<4>Display Dict = (null), rrc mode = 255 Unknown RRC Mode"}}}},
    {UTRAN, "Serving Cell Info", Dict, "<4>Serving Cell Info", Ignored, {{0xD0E2, 26}, {cellMonitorCode}}},
    {UTRAN, "Neighbor Cell List", List, "<4>NeighbhorMeasurements List", Ignored, {{0xD00A, 21}}},
    {UTRAN, "GSM Neighbor Cell List", List, "<4>GSM Neighbor Cell List", Ignored, {{0xD00E, 17}}},
    {UTRAN, "TRCH BLER", List, "<5>TRCH BLER Measurement", Ignored, {{0xD00C, 17}}},
    {UTRAN, "CCTRCH SIR", List, "<4>CCTRCH SIR Measurement", Ignored, {{0xD00C, 17}}},
    {UTRAN, "PDP Context Info", List, "<4>PDPContextList", Taken, {{pdpCode}}},
    {UTRAN, "SIM Info", Dict, "<4>SimInfo", Ignored, {{simCode}}},
};

// Codes of every technology and of the server, and some that nobody has, with the decimals that a line shows.
struct CodeText {
  std::uint32_t code;
  const char* decimal;
};
constexpr CodeText someCodes[] = {
    {0x0000, "0"},     {0x4005, "16389"}, {0x417A, "16762"},     {0x5137, "20791"},  {0x51F6, "20982"},
    {0x7132, "28978"}, {0xB0C3, "45251"}, {0xB179, "45433"},     {0xB17F, "45439"},  {0xD00A, "53258"},
    {0xD00E, "53262"}, {0xD0E0, "53472"}, {simCode, "16711680"}, {0xFFFFFFFF, "-1"},
};

std::string technologyName(Technology technology) {
  return technology == GSM ? "GSM" : technology == LTE ? "LTE" : "UTRAN";
}

std::unique_ptr<ClassIndex> indexOf(Technology technology, std::ostream& standardOutput) {
  if (technology == GSM) return std::make_unique<KLV_GSMClassIndex>(standardOutput);
  if (technology == LTE) return std::make_unique<LTEClassIndex>(standardOutput);
  return std::make_unique<UTRANClassIndex>(standardOutput);
}

/// A packet of a length of its own, be it shorter than a header. The byte is everywhere behind the header.
Bytes packetOf(std::uint32_t code, std::size_t size, std::uint8_t byte) {
  Bytes packet = PacketBuilder(code, std::max(size, Packet::headerSize)).fill(byte).bytes();
  packet.resize(size);
  return packet;
}

/// A record per technology and cell type, each with an entry per value that any decoder shows.
Bytes everyCell() {
  Array records;
  for (const char* technology : {"GSM", "UMTS", "UTRAN", "LTE"}) {
    for (const char* type : {"Serving", "Neighbor"}) {
      records.push_back(cellRecord(
          technology, type,
          {number("MCC", 262), number("MNC", 2), number("LAC", 4660), number("CellIdentity", 26885891),
           number("ARFCN", 62), number("RSSI", -43), number("UARFCN", 10564), number("ScramblingCode", 77),
           number("RSCP", -95), number("EcN0", -9), number("TrackingAreaCode", 40002),
           number("PhysicalCellIdentity", 302), number("BandInfo", 7)}));
    }
  }
  return cellMonitorMessage(records);
}

/// The shortest packet that a decoder must take.
Bytes shortestTaken(const PacketContract& contract) {
  if (contract.code == cellMonitorCode) return everyCell();
  if (contract.code == simCode) {
    return serverMessage(simCode, dictionaryOf({{"kSimFile_ICCID", "8949226"}}));
  }
  if (contract.code == pdpCode) {
    return serverMessage(pdpCode, Value::ofArray({dictionaryOf({{"APN", "internet"}})}));
  }
  return packetOf(contract.code, contract.minimumLength, 0);
}

/// More packets of the code, with and without records and of wrong content.
std::vector<Bytes> morePackets(std::uint32_t code) {
  // An unreadable payload with SIM files ends the program.
  if (code == simCode) return {serverMessage(simCode, Value::ofDictionary())};
  if (code == cellMonitorCode) {
    Array records;
    for (const char* technology : {"GSM", "UMTS", "UTRAN", "LTE"}) {
      for (const char* type : {"Serving", "Neighbor"}) records.push_back(cellRecord(technology, type));
    }
    return {cellMonitorMessage(records), cellMonitorMessage({}), serverMessageOfText(code, "unreadable"),
            serverMessageOfText(code, "")};
  }
  if (code == pdpCode)
    return {serverMessage(code, Value::ofArray()), serverMessageOfText(code, "unreadable")};
  return {packetOf(code, 300, 0), packetOf(code, 300, 0x01), packetOf(code, 300, 0x41),
          packetOf(code, 300, 0xFF)};
}

/// The decoder of a contract in an index of its own, which delivers packets to this decoder alone.
class DecoderInItsIndex {
 public:
  explicit DecoderInItsIndex(const DecoderContract& contract)
      : _index(indexOf(contract.technology, _standardOutput)), _decoder(_index->getClass(contract.section)) {
    if (!_decoder) throw std::runtime_error(std::string("There is no decoder of ") + contract.section + ".");
    _log.take();
  }

  const Base& decoder() const { return *_decoder; }
  const ClassIndex& index() const { return *_index; }

  /// Binds a section with content that no packet makes.
  void bindFilled(SectionKind kind) {
    _section = kind == List ? Value::ofArray({"old", "older"}) : Value::ofDictionary();
    if (kind == Dict) _section.dictionary()->set("Old", "entry");
    _decoder->updateSectionRef(_section);
    _log.take();
  }
  static std::string filled(SectionKind kind) {
    return kind == List ? R"(["old", "older"])" : R"({Old: "entry"})";
  }
  std::string shown() const { return described(_section); }

  /// Delivers the packet by the subscription to the code, or else under a code that the decoder does not
  /// have. Returns the lines that this logs.
  Lines linesOf(const Bytes& packet, std::uint32_t code) {
    const CodeDictionary::Subscription* subscription = _index->subscription(code);
    const Subscriber* subscriber = nullptr;
    if (subscription) {
      const auto found = std::ranges::find(subscription->subscribers, _decoder, &Subscriber::decoder);
      if (found != subscription->subscribers.end()) subscriber = &*found;
    }
    if (subscriber) {
      subscriber->deliver(Packet(packet), code);
    } else {
      _decoder->updateWithData_logCode(Packet(packet), code);
    }
    return _log.takeTexts();
  }

 private:
  RecordingLog _log;
  std::ostringstream _standardOutput;
  std::unique_ptr<ClassIndex> _index;
  Base* _decoder;
  Value _section;
};

Lines behindTheTrace(const DecoderContract& contract, const Lines& lines) {
  Lines all = {contract.trace};
  all.insert(all.end(), lines.begin(), lines.end());
  return all;
}

// "GSM_ActiveSet".
std::string nameOf(const DecoderContract& contract) {
  std::string name = technologyName(contract.technology) + "_";
  for (const char* letter = contract.section; *letter; ++letter) {
    if (std::isalnum(static_cast<unsigned char>(*letter))) name += *letter;
  }
  return name;
}
void PrintTo(const DecoderContract& contract, std::ostream* stream) { *stream << nameOf(contract); }

/// A decoder with one of its codes.
struct DecoderAndPacket {
  DecoderContract decoder;
  PacketContract packet;
};

// "GSM_ActiveSet_0x417A".
std::string nameOf(const DecoderAndPacket& contract) {
  char code[16];
  std::snprintf(code, sizeof code, "_0x%04X", static_cast<unsigned>(contract.packet.code));
  return nameOf(contract.decoder) + code;
}
void PrintTo(const DecoderAndPacket& contract, std::ostream* stream) { *stream << nameOf(contract); }

std::vector<DecoderAndPacket> allPackets() {
  std::vector<DecoderAndPacket> all;
  for (const DecoderContract& decoder : contracts) {
    for (const PacketContract& packet : decoder.packets) all.push_back({decoder, packet});
  }
  return all;
}
std::vector<DecoderAndPacket> packetsWithAMinimumLength() {
  std::vector<DecoderAndPacket> all = allPackets();
  std::erase_if(all, [](const DecoderAndPacket& contract) { return contract.packet.minimumLength == 0; });
  return all;
}

template <class Contract>
std::string testName(const testing::TestParamInfo<Contract>& info) {
  return nameOf(info.param);
}

TEST(DecoderContracts, StandInTheOrderOfCreation) {
  for (const Technology technology : {GSM, LTE, UTRAN}) {
    Lines countOfCodesPerDecoder;
    for (const DecoderContract& contract : contracts) {
      if (contract.technology != technology) continue;
      countOfCodesPerDecoder.push_back("<4>Array Count: " + std::to_string(contract.packets.size()));
    }
    RecordingLog log;
    std::ostringstream standardOutput;
    const auto index = indexOf(technology, standardOutput);
    EXPECT_THAT(log.takeTexts(), BeginsWithElements(countOfCodesPerDecoder)) << technologyName(technology);
  }
}

class DecoderContractTest : public testing::TestWithParam<DecoderContract> {
 protected:
  const DecoderContract& contract = GetParam();
  DecoderInItsIndex subject{contract};

  bool has(std::uint32_t code) const {
    return std::ranges::find(contract.packets, code, &PacketContract::code) != contract.packets.end();
  }
  Lines linesOfForeignCode(const CodeText& foreign) const {
    if (contract.foreignCode != Logged) return {contract.trace};
    return {contract.trace, std::string("<3>Received an unknown log message: ") + foreign.decimal};
  }
  /// Packets that the decoder takes under its own codes, and others.
  std::vector<Bytes> packets() const {
    std::vector<Bytes> all = {{}, Bytes(13, 0x01), Bytes(300, 0xFF), everyCell()};
    for (const PacketContract& packet : contract.packets) all.push_back(shortestTaken(packet));
    return all;
  }
};

TEST_P(DecoderContractTest, FillsItsSectionFromTheseCodes) {
  EXPECT_EQ(subject.decoder().getSectionName(), contract.section);
  std::vector<std::uint32_t> codes;
  for (const PacketContract& packet : contract.packets) codes.push_back(packet.code);
  EXPECT_THAT(subject.decoder().getLogCodeArray(), ElementsAreArray(codes));
  for (const std::uint32_t code : codes) {
    EXPECT_THAT(subject.index().getSubscribers(code), Contains(&subject.decoder()).Times(1)) << code;
  }
}

TEST_P(DecoderContractTest, AForeignCodeIsLoggedOrIgnoredOrTaken) {
  for (const CodeText& foreign : someCodes) {
    if (has(foreign.code)) continue;
    SCOPED_TRACE("log code " + std::string(foreign.decimal));
    if (contract.foreignCode == Taken) {
      subject.bindFilled(contract.kind);
      const Bytes packet = shortestTaken(contract.packets.front());
      EXPECT_THAT(subject.linesOf(packet, foreign.code), ElementsAre(contract.trace));
      EXPECT_NE(subject.shown(), DecoderInItsIndex::filled(contract.kind));
      continue;
    }
    for (const Bytes& packet : packets()) {
      subject.bindFilled(contract.kind);
      EXPECT_EQ(subject.linesOf(packet, foreign.code), linesOfForeignCode(foreign));
      EXPECT_EQ(subject.shown(), DecoderInItsIndex::filled(contract.kind));
    }
  }
}

TEST_P(DecoderContractTest, WithoutASectionAForeignCodeLogsTheSame) {
  for (const CodeText& foreign : someCodes) {
    if (has(foreign.code)) continue;
    for (const Bytes& packet : packets()) {
      EXPECT_EQ(subject.linesOf(packet, foreign.code), linesOfForeignCode(foreign)) << foreign.decimal;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Decoders, DecoderContractTest, testing::ValuesIn(contracts),
                         testName<DecoderContract>);

class PacketContractTest : public testing::TestWithParam<DecoderAndPacket> {
 protected:
  const DecoderContract& contract = GetParam().decoder;
  const PacketContract& packet = GetParam().packet;
  DecoderInItsIndex subject{contract};
};

TEST_P(PacketContractTest, APacketOfTheMinimumLengthIsTaken) {
  subject.bindFilled(contract.kind);
  EXPECT_EQ(subject.linesOf(shortestTaken(packet), packet.code), behindTheTrace(contract, packet.lines));
  if (packet.isShownAtOnce) {
    EXPECT_NE(subject.shown(), DecoderInItsIndex::filled(contract.kind));
  } else {
    EXPECT_EQ(subject.shown(), DecoderInItsIndex::filled(contract.kind));
    EXPECT_EQ(subject.index().subscription(packet.code)->shortestTaken, packet.minimumLength);
  }
}

TEST_P(PacketContractTest, WithoutASectionItLogsTheSame) {
  const bool logsItsSection = !packet.linesWithoutSection.empty();
  EXPECT_EQ(subject.linesOf(shortestTaken(packet), packet.code),
            behindTheTrace(contract, logsItsSection ? packet.linesWithoutSection : packet.lines));
  for (const Bytes& another : morePackets(packet.code)) {
    const Lines lines = DecoderInItsIndex(contract).linesOf(another, packet.code);
    if (logsItsSection) continue;
    DecoderInItsIndex withASection(contract);
    withASection.bindFilled(contract.kind);
    EXPECT_EQ(lines, withASection.linesOf(another, packet.code));
  }
}

TEST_P(PacketContractTest, ASectionOfTheOtherKindIsLeftAlone) {
  const SectionKind otherKind = contract.kind == List ? Dict : List;
  std::vector<Bytes> packets = morePackets(packet.code);
  packets.push_back(shortestTaken(packet));
  for (const Bytes& another : packets) {
    subject.bindFilled(otherKind);
    subject.linesOf(another, packet.code);
    EXPECT_EQ(subject.shown(), DecoderInItsIndex::filled(otherKind));
  }
}

INSTANTIATE_TEST_SUITE_P(Packets, PacketContractTest, testing::ValuesIn(allPackets()),
                         testName<DecoderAndPacket>);

class MinimumLengthTest : public PacketContractTest {};

TEST_P(MinimumLengthTest, AShorterPacketLeavesTheSectionAndLogsTheTraceLineAlone) {
  for (const std::uint8_t byte : {0x00, 0x01, 0xEE}) {
    for (std::size_t size = 0; size < packet.minimumLength; ++size) {
      SCOPED_TRACE(std::to_string(size) + " bytes");
      subject.bindFilled(contract.kind);
      EXPECT_THAT(subject.linesOf(packetOf(packet.code, size, byte), packet.code),
                  ElementsAre(contract.trace));
      EXPECT_EQ(subject.shown(), DecoderInItsIndex::filled(contract.kind));
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Packets, MinimumLengthTest, testing::ValuesIn(packetsWithAMinimumLength()),
                         testName<DecoderAndPacket>);

}  // namespace
}  // namespace varnel
