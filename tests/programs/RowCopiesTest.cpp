#include "programs/varnel/RowCopies.h"

#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

class RowCopiesTest : public testing::Test {
 protected:
  RowCopiesTest() {
    const Value cell = dictionaryOf({{"RSRP", "-84.0 dBm"}, {"Name", "a \"cell\""}});
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(
        dictionaryOf({{"Cells", Value::ofArray({cell})}, {"Band", "3"}}), paths);
  }
  PathDictionary paths;
  std::shared_ptr<const VarnelModelNode> tree;
  const NamePath leaf{"Cells", "0", "RSRP"};
  const NamePath list{"Cells"};
};

TEST_F(RowCopiesTest, OfALeafAreItsValueAndItsRow) {
  EXPECT_EQ(copyOfValue(*tree, leaf), "-84.0 dBm");
  EXPECT_EQ(copyOfRow(*tree, leaf), "RSRP\t-84.0 dBm");
}

TEST_F(RowCopiesTest, TheSectionOfALeafIsWhatItIsIn) {
  EXPECT_EQ(copyOfSectionAsText(*tree, leaf), "RSRP  -84.0 dBm\nName  a \"cell\"\n");
  EXPECT_EQ(copyOfSectionAsJson(*tree, leaf), R"({"RSRP":"-84.0 dBm","Name":"a \"cell\""})");
}

TEST_F(RowCopiesTest, TheSectionOfARowThatLeadsToOthersIsWhatItLeadsTo) {
  EXPECT_EQ(copyOfSectionAsJson(*tree, list), R"([{"RSRP":"-84.0 dBm","Name":"a \"cell\""}])");
  EXPECT_EQ(copyOfSectionAsText(*tree, list), "0\n  RSRP  -84.0 dBm\n  Name  a \"cell\"\n");
  EXPECT_EQ(copyOfValue(*tree, list), copyOfSectionAsText(*tree, list));
  EXPECT_EQ(copyOfRow(*tree, list), "Cells");
}

TEST_F(RowCopiesTest, WithoutARowTheSectionIsTheWholeDisplay) {
  EXPECT_EQ(copyOfSectionAsJson(*tree, {}),
            R"({"Cells":[{"RSRP":"-84.0 dBm","Name":"a \"cell\""}],"Band":"3"})");
  EXPECT_EQ(copyOfSectionAsJson(*tree, {"Band"}), copyOfSectionAsJson(*tree, {}));
}

TEST_F(RowCopiesTest, OfARowThatIsGoneThereIsNone) { EXPECT_EQ(copyOfRow(*tree, {"Cells", "1"}), ""); }

}  // namespace
}  // namespace varnel
