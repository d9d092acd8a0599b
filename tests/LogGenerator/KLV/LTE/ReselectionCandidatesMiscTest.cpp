#include "LogGenerator/KLV/LTE/ReselectionCandidatesMisc.h"

#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using testing::ElementsAre;

constexpr std::uint32_t reselectionCode = 0xB186;
constexpr const char* trace = "<4>Reselection Candidates";

using ReselectionCandidatesMiscTest = RowsDecoderTest<ReselectionCandidatesMisc, reselectionCode>;

// Fields that all differ, among other bytes that must not be shown.
Bytes reselection(std::size_t size = 21) {
  return PacketBuilder(reselectionCode, size).fill(0xEE).u8(13, 4).u16(15, 1300).u16(17, 301).bytes();
}

constexpr const char* reselectionRows = R"({Version: "4", Serving EARFCN: "1300", Serving Cell ID: "301"})";

TEST_F(ReselectionCandidatesMiscTest, AReselectionShowsThreeEntriesInThisOrder) {
  decode(reselection());
  EXPECT_EQ(shown(), reselectionRows);
  EXPECT_THAT(log.takeTexts(), ElementsAre(trace));
}

TEST_F(ReselectionCandidatesMiscTest, AReselectionOf22BytesShowsTheSameAsOneOf21) {
  decode(reselection(22));
  EXPECT_EQ(shown(), reselectionRows);
}

TEST_F(ReselectionCandidatesMiscTest, AllOnesAreShownUnsigned) {
  decode(PacketBuilder(reselectionCode, 21).fill(0xFF).bytes());
  EXPECT_EQ(shown(), R"({Version: "255", Serving EARFCN: "65535", Serving Cell ID: "65535"})");
}

TEST_F(ReselectionCandidatesMiscTest, EachBitCountsInItsOwnEntryAlone) {
  const std::vector<std::string_view> powersOfTwo = {"1",    "2",    "4",     "8",    "16",   "32",
                                                     "64",   "128",  "256",   "512",  "1024", "2048",
                                                     "4096", "8192", "16384", "32768"};
  expectTextsOfSingleBits(PacketBuilder(reselectionCode, 21).bytes(), 13, 21,
                          {{"Version", 13, 0, "0", {"1", "2", "4", "8", "16", "32", "64", "128"}},
                           {"Serving EARFCN", 15, 0, "0", powersOfTwo},
                           {"Serving Cell ID", 17, 0, "0", powersOfTwo}});
}

}  // namespace
}  // namespace varnel
