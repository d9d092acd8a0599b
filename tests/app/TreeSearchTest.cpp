#include "app/TreeSearch.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class TreeSearchTest : public testing::Test {
 protected:
  TreeSearchTest() {
    const Value neighbor = dictionaryOf({{"RSRP", "-101 dBm"}, {"Cell ID", "16"}});
    PathDictionary paths;
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(
        dictionaryOf({{"Serving Cell", dictionaryOf({{"RSRP", "-90 dBm"}})},
                      {"Neighbors", Value::ofArray({neighbor})}}),
        paths);
  }
  std::vector<std::string> found(std::string_view words) const {
    std::vector<std::string> lines;
    for (const FoundNode& node : findNodes(*tree, words)) {
      std::string line;
      for (const std::string& name : node.path) line += "/" + name;
      lines.push_back(node.value.empty() ? line : line + "=" + node.value);
    }
    return lines;
  }

  std::shared_ptr<const VarnelModelNode> tree;
};

TEST_F(TreeSearchTest, FindsRowsInTheOrderOfTheTree) {
  EXPECT_THAT(found("rsrp"), ElementsAre("/Serving Cell/RSRP=-90 dBm", "/Neighbors/0/RSRP=-101 dBm"));
}

TEST_F(TreeSearchTest, AWordMayStandInTheNameOfASection) {
  EXPECT_THAT(found("neigh rsrp"), ElementsAre("/Neighbors/0/RSRP=-101 dBm"));
  EXPECT_THAT(found("rsrp NEIGH"), ElementsAre("/Neighbors/0/RSRP=-101 dBm"));
}

TEST_F(TreeSearchTest, OneWordStandsInTheNameOfTheRowItself) {
  EXPECT_THAT(found("serving"), ElementsAre("/Serving Cell"));
  EXPECT_THAT(found("cell"), ElementsAre("/Serving Cell", "/Neighbors/0/Cell ID=16"));
}

TEST_F(TreeSearchTest, AWordMayStandInTheValue) {
  EXPECT_THAT(found("-101"), ElementsAre("/Neighbors/0/RSRP=-101 dBm"));
  EXPECT_THAT(found("DBM"), ElementsAre("/Serving Cell/RSRP=-90 dBm", "/Neighbors/0/RSRP=-101 dBm"));
  EXPECT_THAT(found("serving dbm"), ElementsAre("/Serving Cell/RSRP=-90 dBm"));
  EXPECT_THAT(found("rsrp 16"), IsEmpty()) << "another row has this value";
}

TEST_F(TreeSearchTest, WithoutWordsFindsAll) {
  EXPECT_THAT(found(" "),
              ElementsAre("/Serving Cell", "/Serving Cell/RSRP=-90 dBm", "/Neighbors", "/Neighbors/0",
                          "/Neighbors/0/RSRP=-101 dBm", "/Neighbors/0/Cell ID=16"));
}

TEST_F(TreeSearchTest, AllWordsMustBeThere) { EXPECT_THAT(found("rsrp band"), IsEmpty()); }

TEST_F(TreeSearchTest, NamesLeadToANode) {
  ASSERT_TRUE(nodeUnderNames(*tree, {"Neighbors", "0", "Cell ID"}));
  EXPECT_EQ(*nodeUnderNames(*tree, {"Neighbors", "0", "Cell ID"})->value(), "16");
  EXPECT_EQ(nodeUnderNames(*tree, {}), tree.get());
  EXPECT_FALSE(nodeUnderNames(*tree, {"Neighbors", "1"}));
  EXPECT_FALSE(nodeUnderNames(*tree, {"Serving Cell", "RSRP", "x"}));
}

}  // namespace
}  // namespace varnel
