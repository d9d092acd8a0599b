#include <gtest/gtest.h>

#include "programs/varnel-telephonyd/simulation/radios/GSMMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/LTENASMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/NRMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/UMTSMessages.h"

// The bytes are coded by hand from the standards.
namespace varnel::simulation {
namespace {

constexpr TemporaryName name{.network = {1, 1, 2}, .group = 0x8003, .code = 0x11, .number = 0xC0FFEE01};

TEST(LTEMessages, PagingNamesOnePhone) {
  EXPECT_EQ(lteMessages::paging(name), (Bytes{0x40, 0x01, 0x1C, 0x0F, 0xFE, 0xE0, 0x10}));
}

TEST(LTEMessages, TheConnectionRequestHasTheNameAndTheCause) {
  EXPECT_EQ(lteMessages::connectionRequest(name, lteMessages::Cause::Signaling),
            (Bytes{0x41, 0x1C, 0x0F, 0xFE, 0xE0, 0x16}));
}

TEST(LTEMessages, TheConnectionSetupHasTheFirstSignalingBearer) {
  EXPECT_EQ(lteMessages::connectionSetup(), (Bytes{0x68, 0x10, 0x1B}));
}

TEST(LTEMessages, TheEndOfTheSetupCarriesAMessage) {
  EXPECT_EQ(lteMessages::connectionSetupComplete(Bytes{0x07, 0x4A}), (Bytes{0x22, 0x00, 0x04, 0x0E, 0x94}));
}

TEST(LTEMessages, TheSecurityModeCommandChoosesTheSecondAlgorithms) {
  EXPECT_EQ(lteMessages::securityModeCommand(), (Bytes{0x32, 0x02, 0x20}));
}

TEST(LTEMessages, TheReleaseHasNoReason) { EXPECT_EQ(lteMessages::connectionRelease(), (Bytes{0x2A, 0x02})); }

// -90 dBm is 51, -10 dB is 20.
TEST(LTEMessages, TheMeasurementReportHasLevelAndQuality) {
  EXPECT_EQ(lteMessages::measurementReport(-90 * 16, -10 * 16), (Bytes{0x08, 0x00, 0x33, 0x50}));
}

TEST(LTEMessages, PartsOfAStepDoNotCountInTheMeasurementReport) {
  EXPECT_EQ(lteMessages::measurementReport(-89 * 16 - 1, -10 * 16 + 7), (Bytes{0x08, 0x00, 0x33, 0x50}));
}

TEST(LTENASMessages, TheAreaUpdateRequestNamesThePhone) {
  EXPECT_EQ(lteNAS::areaUpdateRequest(name), (Bytes{0x07, 0x48, 0x00, 0x0B, 0xF6, 0x00, 0xF1, 0x10, 0x80,
                                                    0x03, 0x11, 0xC0, 0xFF, 0xEE, 0x01}));
}

TEST(LTENASMessages, AProtectedMessageHasACodeAndANumberBeforeIt) {
  const Bytes message = lteNAS::integrityProtected(lteNAS::areaUpdateComplete(), 9);
  ASSERT_EQ(message.size(), 8u);
  EXPECT_EQ(message[0], 0x17);
  EXPECT_EQ(message[5], 9);
  EXPECT_EQ((Bytes{message[6], message[7]}), (Bytes{0x07, 0x4A}));
}

TEST(NRMessages, TheMasterInformationHasTheUpperBitsOfTheFrameNumber) {
  EXPECT_EQ(nrMessages::masterInformation(0x3F5), (Bytes{0x7F, 0x63, 0x2C}));
}

TEST(NRMessages, TheSecondaryCellsComeInOneReconfiguration) {
  EXPECT_EQ(nrMessages::reconfiguration(), (Bytes{0x88, 0x02, 0x00, 0x00}));
  EXPECT_EQ(nrMessages::reconfigurationComplete(), (Bytes{0x80}));
}

TEST(UMTSMessages, PagingNamesOnePhone) {
  EXPECT_EQ(umtsMessages::paging(0x12345678), (Bytes{0x40, 0x02, 0x24, 0x68, 0xAC, 0xF0}));
}

TEST(GSMMessages, SystemInformation3HasTheCellAndItsArea) {
  const Cell cell{.area = 0x1234, .network = {1, 100, 3}, .identity = 0xABCD};
  const Bytes message = gsmMessages::systemInformation3(cell);
  ASSERT_EQ(message.size(), 23u);
  EXPECT_EQ(Bytes(message.begin(), message.begin() + 10),
            (Bytes{0x49, 0x06, 0x1B, 0xAB, 0xCD, 0x00, 0x01, 0x01, 0x12, 0x34}));
  EXPECT_EQ(Bytes(message.end() - 4, message.end()), (Bytes{0x2B, 0x2B, 0x2B, 0x2B}));
}

}  // namespace
}  // namespace varnel::simulation
