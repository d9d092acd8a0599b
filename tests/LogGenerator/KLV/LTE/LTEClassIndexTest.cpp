#include "LogGenerator/KLV/LTE/LTEClassIndex.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "tests/support/BeginsWith.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::IsEmpty;

class LTEClassIndexTest : public testing::Test {
 protected:
  RecordingLog log;
  std::ostringstream standardOutput;
  std::unique_ptr<LTEClassIndex> index = std::make_unique<LTEClassIndex>(standardOutput);
};

TEST_F(LTEClassIndexTest, OwnsTheDecoderOfEachSection) {
  EXPECT_NE(dynamic_cast<LTEServingCellInfo*>(index->getClass("Serving Cell Info")), nullptr);
  EXPECT_NE(dynamic_cast<ConnectedModeMeasurementMisc*>(
                index->getClass("Connected mode LTE Intra-frequency Measurement")),
            nullptr);
  EXPECT_NE(dynamic_cast<MeasuredNeighborCells*>(index->getClass("Measured Neighbor Cells")), nullptr);
  EXPECT_NE(dynamic_cast<DetectedCells*>(index->getClass("Detected Cells")), nullptr);
  EXPECT_NE(dynamic_cast<ServingCellMeasurement*>(index->getClass("Serving Cell Measurements")), nullptr);
  EXPECT_NE(dynamic_cast<NeighborMeasurementMisc*>(index->getClass("Neighbor Measurements")), nullptr);
  EXPECT_NE(dynamic_cast<NeighborCellsList*>(index->getClass("Neighbor Cells List")), nullptr);
  EXPECT_NE(dynamic_cast<ReselectionCandidatesMisc*>(index->getClass("Reselection Candidates")), nullptr);
  EXPECT_NE(dynamic_cast<ReselectionCandidatesList*>(index->getClass("Reselection Candidates List")),
            nullptr);
  EXPECT_NE(dynamic_cast<SimInfo*>(index->getClass("SIM Info")), nullptr);
  EXPECT_NE(dynamic_cast<PDPContextList*>(index->getClass("PDP Context Info")), nullptr);
}

// Newer decoders come after those that are named here, here and below.
TEST_F(LTEClassIndexTest, CreatesTheDecoderOfTheServingCellFirst) {
  std::vector<std::string> lines(11, "<4>Array Count: 1");
  lines[0] = "<4>Array Count: 3";
  EXPECT_THAT(log.takeTexts(), BeginsWithElements(lines));
}

TEST_F(LTEClassIndexTest, LogCodesStandInTheOrderOfTheirDecoders) {
  EXPECT_THAT(index->getAllLogCodes(), BeginsWith("45250", "45249", "16711681", "45433", "45439", "45440",
                                                  "45446", "16711680", "16711682"));
}

TEST_F(LTEClassIndexTest, EachCodeHasItsSubscribersInTheOrderOfTheirCreation) {
  const auto decoder = [this](std::string_view section) { return index->getClass(section); };
  EXPECT_THAT(index->getSubscribers(0xB0C2), BeginsWith(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xB0C1), BeginsWith(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0001), BeginsWith(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xB179),
              BeginsWith(decoder("Connected mode LTE Intra-frequency Measurement"),
                         decoder("Measured Neighbor Cells"), decoder("Detected Cells")));
  EXPECT_THAT(index->getSubscribers(0xB17F), BeginsWith(decoder("Serving Cell Measurements")));
  EXPECT_THAT(index->getSubscribers(0xB180),
              BeginsWith(decoder("Neighbor Measurements"), decoder("Neighbor Cells List")));
  EXPECT_THAT(index->getSubscribers(0xB186),
              BeginsWith(decoder("Reselection Candidates"), decoder("Reselection Candidates List")));
  EXPECT_THAT(index->getSubscribers(0xFF0000), BeginsWith(decoder("SIM Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0002), BeginsWith(decoder("PDP Context Info")));
  EXPECT_THAT(index->getSubscribers(0x10000), IsEmpty());
}

TEST_F(LTEClassIndexTest, DestructionWritesItsOwnLineAndThenTheBases) {
  EXPECT_EQ(standardOutput.str(), "");
  index.reset();
  EXPECT_EQ(standardOutput.str(), "Deallocing LTEClassIndex\nDeallocing ClassIndex\n");
}

}  // namespace
}  // namespace varnel
