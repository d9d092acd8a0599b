#include "programs/varnel-decode/NearestPaths.h"

#include <gmock/gmock.h>

#include "base/Dictionary.h"

namespace varnel {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

Value section(std::initializer_list<std::pair<const char*, Value>> rows) {
  Value section = Value::ofDictionary();
  for (const auto& [name, value] : rows) section.dictionary()->set(name, value);
  return section;
}

TEST(NearestPaths, AreThoseOfTheFewestEdits) {
  NearestPaths paths;
  paths.take(section({{"Cell", section({{"RSRP", "1"}, {"RSRQ", "2"}, {"RSSI", "3"}, {"Band", "4"}})}}));
  EXPECT_THAT(paths.to("Cell/RSRP"), ElementsAre("Cell/RSRP", "Cell/RSRQ", "Cell/RSSI"));
  EXPECT_THAT(paths.to("/cell/Ban"), ElementsAre("Cell/Band"));
  EXPECT_THAT(paths.to("Something else altogether"), IsEmpty());
  EXPECT_THAT(paths.to(""), IsEmpty());
  EXPECT_THAT(paths.to(std::string(100'000, 'x')), IsEmpty());
}

TEST(NearestPaths, APartOfANameLeadsToTheNamesThatHaveIt) {
  NearestPaths paths;
  paths.take(section(
      {{"Measurements", section({{"Paging Cycle", "1"}, {"Average RSRP", "2"}, {"Frequency Band", "3"}})}}));
  EXPECT_THAT(paths.to("Measurments/RSRP"), ElementsAre("Measurements/Average RSRP"));
  EXPECT_THAT(paths.to("Elsewhere/RSRP"), IsEmpty());
}

TEST(NearestPaths, ASectionLeadsToItsValues) {
  NearestPaths paths;
  paths.take(section({{"Cell", section({{"A rather long name", "1"}, {"B", section({})}})}, {"Call", "2"}}));
  EXPECT_THAT(paths.to("Cell"), ElementsAre("Cell/A rather long name", "Call"));
}

TEST(NearestPaths, ComeFromEveryDisplay) {
  NearestPaths paths;
  paths.take(section({{"Earlier", "1"}}));
  paths.take(section({{"Later", "1"}}));
  EXPECT_THAT(paths.to("earlier"), ElementsAre("Earlier"));
  EXPECT_THAT(paths.to("later"), ElementsAre("Later"));
}

TEST(NearestPaths, ASelectionStandsForARowsNumber) {
  NearestPaths paths;
  paths.take(section({{"Cells", Value::ofArray({section({{"RSRP", "1"}})})}}));
  EXPECT_THAT(paths.to("Cells[Physical Cell ID=16]/RSRP"), ElementsAre("Cells/0/RSRP"));
  EXPECT_THAT(paths.to("Cells[ID=16]/Missing"), IsEmpty());
  EXPECT_THAT(paths.to("Cells/[ID=16]/RSR"), ElementsAre("Cells/0/RSRP"));
}

}  // namespace
}  // namespace varnel
