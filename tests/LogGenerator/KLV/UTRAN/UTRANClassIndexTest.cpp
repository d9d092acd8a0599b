#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class UTRANClassIndexTest : public testing::Test {
 protected:
  RecordingLog log;
  std::ostringstream standardOutput;
  std::unique_ptr<UTRANClassIndex> index = std::make_unique<UTRANClassIndex>(standardOutput);
};

TEST_F(UTRANClassIndexTest, OwnsTheDecoderOfEachSection) {
  EXPECT_NE(dynamic_cast<RRC_State*>(index->getClass("RRC Info")), nullptr);
  EXPECT_NE(dynamic_cast<UTRANServingCellInfo*>(index->getClass("Serving Cell Info")), nullptr);
  EXPECT_NE(dynamic_cast<UTRANNeighbhorMeasurements*>(index->getClass("Neighbor Cell List")), nullptr);
  EXPECT_NE(dynamic_cast<GSMNeighbhorMeasurements*>(index->getClass("GSM Neighbor Cell List")), nullptr);
  EXPECT_NE(dynamic_cast<TRCHBLERMeasurement*>(index->getClass("TRCH BLER")), nullptr);
  EXPECT_NE(dynamic_cast<CCTRCHSIRMeasurement*>(index->getClass("CCTRCH SIR")), nullptr);
  EXPECT_NE(dynamic_cast<PDPContextList*>(index->getClass("PDP Context Info")), nullptr);
  EXPECT_NE(dynamic_cast<SimInfo*>(index->getClass("SIM Info")), nullptr);
}

TEST_F(UTRANClassIndexTest, CreatesEightDecodersTheServingCellSecond) {
  std::vector<std::string> lines(8, "<4>Array Count: 1");
  lines[1] = "<4>Array Count: 2";
  EXPECT_EQ(log.takeTexts(), lines);
}

TEST_F(UTRANClassIndexTest, LogCodesStandInTheOrderOfTheirDecoders) {
  EXPECT_THAT(index->getAllLogCodes(),
              ElementsAre("53472", "53474", "16711681", "53258", "53262", "53260", "16711682", "16711680"));
}

TEST_F(UTRANClassIndexTest, EachCodeHasItsSubscribersInTheOrderOfTheirCreation) {
  const auto decoder = [this](std::string_view section) { return index->getClass(section); };
  EXPECT_THAT(index->getSubscribers(0xD0E0), ElementsAre(decoder("RRC Info")));
  EXPECT_THAT(index->getSubscribers(0xD0E2), ElementsAre(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0001), ElementsAre(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xD00A), ElementsAre(decoder("Neighbor Cell List")));
  EXPECT_THAT(index->getSubscribers(0xD00E), ElementsAre(decoder("GSM Neighbor Cell List")));
  EXPECT_THAT(index->getSubscribers(0xD00C), ElementsAre(decoder("TRCH BLER"), decoder("CCTRCH SIR")));
  EXPECT_THAT(index->getSubscribers(0xFF0002), ElementsAre(decoder("PDP Context Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0000), ElementsAre(decoder("SIM Info")));
  EXPECT_THAT(index->getSubscribers(0xD00B), IsEmpty());
}

TEST_F(UTRANClassIndexTest, DestructionWritesTheBasesLineOnly) {
  index.reset();
  EXPECT_EQ(standardOutput.str(), "Deallocing ClassIndex\n");
}

}  // namespace
}  // namespace varnel
