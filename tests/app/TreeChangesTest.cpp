#include "app/TreeChanges.h"

#include <gtest/gtest.h>

#include "app/TreeSearch.h"
#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

class TreeChangesTest : public testing::Test {
 protected:
  void follow(const Value& display) {
    PathDictionary paths;
    tree = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
    changes.follow(tree);
  }
  bool isChanged(const NamePath& path) const { return changes.contains(*nodeUnderNames(*tree, path)); }
  static Value display(const char* level, const char* band = "3") {
    return dictionaryOf(
        {{"Cell", dictionaryOf({{"Level", level}, {"Band", band}})}, {"SIM", dictionaryOf({{"Name", "x"}})}});
  }

  TreeChanges::Node tree;
  TreeChanges changes;
};

TEST_F(TreeChangesTest, NothingOfTheFirstTreeHasChanged) {
  follow(display("-90"));
  EXPECT_FALSE(isChanged({"Cell"}));
  EXPECT_FALSE(isChanged({"Cell", "Level"}));
}

TEST_F(TreeChangesTest, ALeafAndWhatIsAboveItHaveChanged) {
  follow(display("-90"));
  follow(display("-91"));
  EXPECT_TRUE(isChanged({"Cell", "Level"}));
  EXPECT_TRUE(isChanged({"Cell"}));
  EXPECT_FALSE(isChanged({"Cell", "Band"}));
  EXPECT_FALSE(isChanged({"SIM"}));
}

TEST_F(TreeChangesTest, AChangeLastsForOneTree) {
  follow(display("-90"));
  follow(display("-91"));
  follow(display("-91"));
  EXPECT_FALSE(isChanged({"Cell", "Level"}));
  EXPECT_FALSE(isChanged({"Cell"}));
}

TEST_F(TreeChangesTest, RowsAreComparedByTheirNames) {
  follow(dictionaryOf({{"a", "1"}, {"b", "2"}}));
  follow(dictionaryOf({{"b", "2"}, {"c", "3"}}));
  EXPECT_FALSE(isChanged({"b"}));
  EXPECT_TRUE(isChanged({"c"})) << "new";
}

TEST_F(TreeChangesTest, ARowThatIsGoneChangesWhatIsAboveIt) {
  follow(dictionaryOf({{"Cell", dictionaryOf({{"a", "1"}, {"b", "2"}})}}));
  follow(dictionaryOf({{"Cell", dictionaryOf({{"a", "1"}})}}));
  EXPECT_TRUE(isChanged({"Cell"}));
  EXPECT_FALSE(isChanged({"Cell", "a"}));
}

TEST_F(TreeChangesTest, ARowThatBecomesASectionHasChanged) {
  follow(dictionaryOf({{"a", "1"}}));
  follow(dictionaryOf({{"a", dictionaryOf({{"b", "1"}})}}));
  EXPECT_TRUE(isChanged({"a"}));
}

TEST_F(TreeChangesTest, AfterNoTreeNothingHasChanged) {
  follow(display("-90"));
  changes.follow(nullptr);
  follow(display("-91"));
  EXPECT_FALSE(isChanged({"Cell"}));
}

}  // namespace
}  // namespace varnel
