#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "tests/support/BeginsWith.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

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

// Newer decoders come after those that are named here, here and below.
TEST_F(UTRANClassIndexTest, CreatesTheDecoderOfTheServingCellSecond) {
  std::vector<std::string> lines(8, "<4>Array Count: 1");
  lines[1] = "<4>Array Count: 2";
  EXPECT_THAT(log.takeTexts(), BeginsWithElements(lines));
}

TEST_F(UTRANClassIndexTest, LogCodesStandInTheOrderOfTheirDecoders) {
  EXPECT_THAT(index->getAllLogCodes(),
              BeginsWith("53472", "53474", "16711681", "53258", "53262", "53260", "16711682", "16711680"));
}

TEST_F(UTRANClassIndexTest, EachCodeHasItsSubscribersInTheOrderOfTheirCreation) {
  const auto decoder = [this](std::string_view section) { return index->getClass(section); };
  EXPECT_THAT(index->getSubscribers(0xD0E0), BeginsWith(decoder("RRC Info")));
  EXPECT_THAT(index->getSubscribers(0xD0E2), BeginsWith(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0001), BeginsWith(decoder("Serving Cell Info")));
  EXPECT_THAT(index->getSubscribers(0xD00A), BeginsWith(decoder("Neighbor Cell List")));
  EXPECT_THAT(index->getSubscribers(0xD00E), BeginsWith(decoder("GSM Neighbor Cell List")));
  EXPECT_THAT(index->getSubscribers(0xD00C), BeginsWith(decoder("TRCH BLER"), decoder("CCTRCH SIR")));
  EXPECT_THAT(index->getSubscribers(0xFF0002), BeginsWith(decoder("PDP Context Info")));
  EXPECT_THAT(index->getSubscribers(0xFF0000), BeginsWith(decoder("SIM Info")));
  EXPECT_THAT(index->getSubscribers(0x10000), IsEmpty());
}

TEST_F(UTRANClassIndexTest, DestructionWritesTheBasesLineOnly) {
  index.reset();
  EXPECT_EQ(standardOutput.str(), "Deallocing ClassIndex\n");
}

}  // namespace
}  // namespace varnel
