#include <gmock/gmock.h>

#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

using ExplainProgram = DecodeProgram;

TEST_F(ExplainProgram, APathIsExplainedWithoutACapture) {
  const Result result = run({"--explain", "Serving PLMN/Mobile Country Code"});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_EQ(result.output,
            "Serving PLMN/Mobile Country Code\n"
            "  The country of the network.\n"
            "  Usual: 3 digits\n"
            "  Defined in: 3GPP TS 23.003, 2.2\n");
}

TEST_F(ExplainProgram, ALevelTellsItsLimits) {
  const Result result = run({"--explain", "/LTE/Neighbors/Cells[EARFCN=1300]/RSRP"});
  EXPECT_EQ(result.status, 0);
  EXPECT_THAT(result.output, HasSubstr("\n  Unit: dBm\n"));
  EXPECT_THAT(result.output, HasSubstr("\n  Levels: poor below -100 dBm, fair from there, good from -90 dBm, "
                                       "excellent from -80 dBm (a rule of thumb, not a standard)\n"));
}

TEST_F(ExplainProgram, SeveralPathsAreExplainedOneAfterTheOther) {
  const Result result = run({"--explain", "GSM", "EV-DO"});
  EXPECT_EQ(result.status, 0);
  EXPECT_THAT(result.output, StartsWith("GSM\n  "));
  EXPECT_THAT(result.output, HasSubstr("\n\nEV-DO\n  "));
}

TEST_F(ExplainProgram, AWrongPathGetsThoseThatItMayMean) {
  const Result result = run({"--explain", "LTE/Measurements/Filterd RSRP", "RRC Stat"});
  EXPECT_EQ(result.status, 2);
  EXPECT_EQ(result.output, "");
  EXPECT_THAT(result.error,
              HasSubstr("nothing explains 'LTE/Measurements/Filterd RSRP'; did you mean 'Filtered RSRP'"));
  EXPECT_THAT(result.error, HasSubstr("nothing explains 'RRC Stat'; did you mean 'RRC State'"));
}

TEST_F(ExplainProgram, APathLikeNoOtherGetsAdvice) {
  const Result result = run({"--explain", "xyzxyzxyzxyz"});
  EXPECT_EQ(result.status, 2);
  EXPECT_THAT(result.error,
              HasSubstr("nothing explains 'xyzxyzxyzxyz'; --format paths shows the paths of a capture\n"));
}

TEST_F(ExplainProgram, NoOtherOptionGoesWithIt) {
  const Result result = run({"--format", "json", "--explain", "RSRP"});
  EXPECT_EQ(result.status, 2);
  EXPECT_THAT(result.error, HasSubstr("--format does not go with --explain, which takes paths only"));
}

}  // namespace
}  // namespace varnel
