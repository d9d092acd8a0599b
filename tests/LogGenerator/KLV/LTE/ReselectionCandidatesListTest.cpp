#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t reselectionCode = 0xB186;
constexpr const char* trace = "<4>Reselection Candidates List";

using ReselectionCandidatesListTest = ListDecoderTest<ReselectionCandidatesList, reselectionCode>;

// A reselection with a count of candidates. All other bytes are 0.
PacketBuilder reselection(std::uint16_t candidates, std::size_t size) {
  PacketBuilder packet(reselectionCode, size);
  packet.u16(19, candidates);
  return packet;
}

// One candidate of that type, among other bytes that must not be shown.
PacketBuilder candidate(std::uint16_t type, std::size_t size) {
  PacketBuilder packet(reselectionCode, size);
  packet.fill(0xEE).u16(19, 1).u16(21, 6).u16(23, type);
  return packet;
}

// Three overlapping candidates that need 29, 37 and 33 bytes: LTE, HRPD and one of an unknown type.
Bytes threeCandidates() {
  return reselection(3, 37)
      .u16(21, 6)
      .u16(23, 0)
      .u16(25, 1300)
      .u16(27, 4)
      .u16(29, 0x0107)
      .u16(31, 9)
      .u16(33, 283)
      .u16(35, 511)
      .bytes();
}

constexpr const char* lteCandidate =
    R"({Candidate Priority: "6", Candidate RAT Type: "LTE", E ARFCN: "1300", Cell ID: "0"})";
constexpr const char* hrpdCandidate =
    R"({Candidate Priority: "1300", Candidate RAT Type: "CDMAHRPD", Band: "7", Channel: "283", Pilot: "511"})";
constexpr const char* unknownCandidate = R"({Candidate Priority: "263", Candidate RAT Type: "??"})";

TEST_F(ReselectionCandidatesListTest, AnLTECandidateShowsItsFrequencyAndCell) {
  decode(candidate(0, 29).u16(25, 1300).u16(27, 0x96B5).bytes());
  EXPECT_EQ(shown(),
            R"([{Candidate Priority: "6", Candidate RAT Type: "LTE", E ARFCN: "1300", Cell ID: "301"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ReselectionCandidatesListTest, AnLTECellIsTheUpperNineBitsWhateverTheLowerSevenHold) {
  decode(candidate(0, 29).u16(27, 0xFF80).bytes());
  EXPECT_EQ(shown("Cell ID"), R"("511")");
  decode(candidate(0, 29).u16(27, 0xFFFF).bytes());
  EXPECT_EQ(shown("Cell ID"), R"("511")");
  decode(candidate(0, 29).u16(27, 0x007F).bytes());
  EXPECT_EQ(shown("Cell ID"), R"("0")");
}

TEST_F(ReselectionCandidatesListTest, AUTRANCandidateShowsItsFrequencyAndScramblingCode) {
  decode(candidate(1, 29).u16(25, 10563).u16(27, 0x81FE).bytes());
  EXPECT_EQ(shown(),
            R"([{Candidate Priority: "6", Candidate RAT Type: "UTRAN", U ARFCN: "10563", PSC: "33278"}])");
}

TEST_F(ReselectionCandidatesListTest, AGERANCandidateShowsItsFrequencyBandAndStation) {
  decode(candidate(2, 29).u16(25, 975).u8(27, 254).u8(28, 63).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "GERAN", ARFCN: "975", Band: "254", )"
                     R"(BSIC ID: "63"}])");
}

TEST_F(ReselectionCandidatesListTest, ACDMACandidateShowsItsBandChannelAndPilot) {
  decode(candidate(3, 33).u8(25, 10).u16(29, 283).u16(31, 511).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "CDMA1XRTT", Band: "10", )"
                     R"(Channel: "283", Pilot: "511"}])");
  decode(candidate(4, 33).u8(25, 11).u16(29, 284).u16(31, 510).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "CDMAHRPD", Band: "11", )"
                     R"(Channel: "284", Pilot: "510"}])");
}

TEST_F(ReselectionCandidatesListTest, ACandidateOfType7ShowsItsPriorityAndQuestionMarksOnly) {
  decode(candidate(7, 33).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "??"}])");
}

TEST_F(ReselectionCandidatesListTest, EveryTypeAbove4ShowsQuestionMarks) {
  for (unsigned type = 5; type < 65536; ++type) {
    decode(candidate(static_cast<std::uint16_t>(type), 33).bytes());
    ASSERT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "??"}])") << type;
    log.take();
  }
}

TEST_F(ReselectionCandidatesListTest, AllOnesAreShownUnsigned) {
  const auto ones = [](std::uint16_t type) {
    return PacketBuilder(reselectionCode, 33).fill(0xFF).u16(19, 1).u16(23, type).bytes();
  };
  decode(ones(0));
  EXPECT_EQ(
      shown(),
      R"([{Candidate Priority: "65535", Candidate RAT Type: "LTE", E ARFCN: "65535", Cell ID: "511"}])");
  decode(ones(1));
  EXPECT_EQ(
      shown(),
      R"([{Candidate Priority: "65535", Candidate RAT Type: "UTRAN", U ARFCN: "65535", PSC: "65535"}])");
  decode(ones(2));
  EXPECT_EQ(shown(), R"([{Candidate Priority: "65535", Candidate RAT Type: "GERAN", ARFCN: "65535", )"
                     R"(Band: "255", BSIC ID: "255"}])");
  decode(ones(3));
  EXPECT_EQ(shown(), R"([{Candidate Priority: "65535", Candidate RAT Type: "CDMA1XRTT", Band: "255", )"
                     R"(Channel: "65535", Pilot: "65535"}])");
  decode(ones(4));
  EXPECT_EQ(shown(), R"([{Candidate Priority: "65535", Candidate RAT Type: "CDMAHRPD", Band: "255", )"
                     R"(Channel: "65535", Pilot: "65535"}])");
}

TEST_F(ReselectionCandidatesListTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> bytes = {"1", "2", "4", "8", "16", "32", "64", "128"};
  const std::vector<std::string_view> words = {"1",    "2",    "4",     "8",    "16",   "32",
                                               "64",   "128",  "256",   "512",  "1024", "2048",
                                               "4096", "8192", "16384", "32768"};
  const auto zeros = [](std::uint16_t type) { return reselection(1, 33).u16(23, type).bytes(); };
  expectTextsOfSingleBits(zeros(0), 21, 23, {{"Candidate Priority", 21, 0, "0", words}});
  expectTextsOfSingleBits(zeros(0), 25, 33,
                          {{"E ARFCN", 25, 0, "0", words},
                           {"Cell ID", 27, 7, "0", {"1", "2", "4", "8", "16", "32", "64", "128", "256"}}});
  expectTextsOfSingleBits(zeros(1), 25, 33, {{"U ARFCN", 25, 0, "0", words}, {"PSC", 27, 0, "0", words}});
  expectTextsOfSingleBits(
      zeros(2), 25, 33,
      {{"ARFCN", 25, 0, "0", words}, {"Band", 27, 0, "0", bytes}, {"BSIC ID", 28, 0, "0", bytes}});
  for (const std::uint16_t type : {3, 4}) {
    expectTextsOfSingleBits(
        zeros(type), 25, 33,
        {{"Band", 25, 0, "0", bytes}, {"Channel", 29, 0, "0", words}, {"Pilot", 31, 0, "0", words}});
  }
}

TEST_F(ReselectionCandidatesListTest, TwoCandidatesAreReadFromBytes21And25) {
  decode(reselection(2, 33).u16(21, 6).u16(23, 0).u16(25, 5).u16(27, 1).u16(29, 10563).u16(31, 301).bytes());
  EXPECT_EQ(shown(),
            R"([{Candidate Priority: "6", Candidate RAT Type: "LTE", E ARFCN: "5", Cell ID: "0"}, )"
            R"({Candidate Priority: "5", Candidate RAT Type: "UTRAN", U ARFCN: "10563", PSC: "301"}])");
}

TEST_F(ReselectionCandidatesListTest, EachReselectionReplacesTheListOfTheLastOne) {
  putOldContent();
  decode(threeCandidates());
  EXPECT_EQ(shown(), listOf({lteCandidate, hrpdCandidate, unknownCandidate}));
  decode(candidate(7, 33).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "6", Candidate RAT Type: "??"}])");
}

TEST_F(ReselectionCandidatesListTest, NoCandidatesEmptyTheListSilently) {
  putOldContent();
  decode(reselection(0, 33).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ReselectionCandidatesListTest, ACountOf0x0100YieldsAnEmptyList) {
  putOldContent();
  decode(reselection(0x0100, 1057).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ReselectionCandidatesListTest, OnlyTheLowByteOfTheCountIsUsed) {
  decode(reselection(0xFF02, 1057).bytes());
  EXPECT_EQ(rowCount(), 2u);
}

TEST_F(ReselectionCandidatesListTest, TwoHundredFiftyFiveCandidatesAreAllShown) {
  PacketBuilder packet = reselection(255, 1041);
  for (std::uint16_t i = 0; i < 255; ++i) packet.u16(21 + 4u * i, i).u16(23 + 4u * i, 5);
  decode(packet.bytes());
  ASSERT_EQ(rowCount(), 255u);
  EXPECT_EQ(described(section.array()->front()), R"({Candidate Priority: "0", Candidate RAT Type: "??"})");
  EXPECT_EQ(described(section.array()->back()), R"({Candidate Priority: "254", Candidate RAT Type: "??"})");
}

TEST_F(ReselectionCandidatesListTest, ACandidateIsKeptFromTheByteOnThatItsTypeNeeds) {
  const struct {
    std::uint16_t type;
    std::size_t size;
  } needs[] = {{0, 29}, {1, 29}, {2, 29}, {3, 33}, {4, 33}, {5, 25}, {0x0100, 25}, {0xFFFF, 25}};
  for (const auto& [type, size] : needs) {
    decode(candidate(type, size).bytes());
    EXPECT_EQ(rowCount(), 1u) << "type " << type;
    putOldContent();
    Bytes cut = candidate(type, size).bytes();
    cut.pop_back();
    decode(cut);
    EXPECT_EQ(shown(), "[]") << "type " << type;
  }
}

TEST_F(ReselectionCandidatesListTest, AShorterCandidateIsKeptBehindADroppedOne) {
  decode(reselection(2, 29).u16(23, 3).u16(25, 5).u16(27, 7).bytes());
  EXPECT_EQ(shown(), R"([{Candidate Priority: "5", Candidate RAT Type: "??"}])");
}

TEST_F(ReselectionCandidatesListTest, CandidatesBeyondThePacketLeaveAnEmptyList) {
  putOldContent();
  decode(reselection(255, 24).bytes());
  EXPECT_EQ(shown(), "[]");
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ReselectionCandidatesListTest, EveryTruncatedReselectionKeepsItsWholeCandidates) {
  forEachTruncation(threeCandidates(), [&](std::size_t size, const std::vector<std::string>& lines) {
    std::string expected = listOf({lteCandidate, unknownCandidate});
    if (size < 33) expected = listOf({lteCandidate});
    if (size < 29) expected = "[]";
    if (size < 21) expected = oldContent();
    EXPECT_EQ(shown(), expected);
    EXPECT_THAT(lines, ElementsAre(trace));
  });
}

TEST_F(ReselectionCandidatesListTest, ReselectionsOf21And22BytesAreAccepted) {
  for (const std::size_t size : {21u, 22u}) {
    putOldContent();
    decode(reselection(0, size).bytes());
    EXPECT_EQ(shown(), "[]") << size << " bytes";
  }
}

}  // namespace
}  // namespace varnel
