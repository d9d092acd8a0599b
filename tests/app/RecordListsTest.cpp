#include "app/RecordLists.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using testing::ElementsAre;

class RecordListsTest : public testing::Test {
 protected:
  // The display is a section "Cells" with this value.
  std::optional<RecordList> recordsIn(const Value& section) {
    PathDictionary paths;
    _root = VarnelModelNode::makeTreeFromObject_withPathDictionary(dictionaryOf({{"Cells", section}}), paths);
    return recordsOf(*_root, {"Cells"}, formats);
  }
  bool isList() const { return isListOfRecords(*_root->childNodes()->front()); }
  static std::vector<std::string> identities(const RecordList& list) {
    std::vector<std::string> all;
    for (const auto& record : list.records) all.push_back(record.identity);
    return all;
  }

  NumberFormats formats;

 private:
  std::shared_ptr<const VarnelModelNode> _root;
};

TEST_F(RecordListsTest, AColumnIsALeafOfAnyRecord) {
  const auto list = recordsIn(Value::ofArray(
      {dictionaryOf({{"EARFCN", "1300"}, {"Physical Cell ID", "16"}}),
       dictionaryOf({{"EARFCN", "1300"}, {"RSRP", "-90.00 dBm"}, {"Physical Cell ID", "7"}})}));
  ASSERT_TRUE(list);
  EXPECT_TRUE(isList());
  EXPECT_THAT(list->columns, ElementsAre("EARFCN", "Physical Cell ID", "RSRP"));
  ASSERT_EQ(list->records.size(), 2u);
  EXPECT_EQ(list->records[0].name, "0");
  EXPECT_EQ(list->records[0].cells.size(), 3u);
  EXPECT_EQ(list->records[0].cells[2].text, "");
  EXPECT_EQ(list->records[1].cells[1].text, "7");
  EXPECT_EQ(list->records[1].cells[2].number, -90.0);
  EXPECT_THAT(identities(*list), ElementsAre("EARFCN 1300, PCI 16", "EARFCN 1300, PCI 7"));
}

TEST_F(RecordListsTest, ANumberIsThatOfTheFormatOrTheBeginningOfTheText) {
  formats.add("Cells", "Band", integer("B%d"));
  const auto list = recordsIn(Value::ofArray({dictionaryOf({{"Band", "B20"},
                                                            {"A", "-84.5 dBm"},
                                                            {"B", "14:05:09"},
                                                            {"C", "Not Present"},
                                                            {"D", "7"},
                                                            {"E", ""}})}));
  ASSERT_TRUE(list);
  const auto& cells = list->records[0].cells;
  EXPECT_EQ(cells[0].number, 20.0);
  EXPECT_EQ(cells[1].number, -84.5);
  EXPECT_EQ(cells[2].number, std::nullopt);
  EXPECT_EQ(cells[3].number, std::nullopt);
  EXPECT_EQ(cells[4].number, 7.0);
  EXPECT_EQ(cells[5].number, std::nullopt);
}

TEST_F(RecordListsTest, EachRecordHasAnIdentityOfItsOwn) {
  const Value cell = dictionaryOf({{"EARFCN", "1300"}, {"Physical Cell ID", "16"}});
  const auto cells = recordsIn(Value::ofArray({cell, cell, cell}));
  EXPECT_THAT(identities(*cells),
              ElementsAre("EARFCN 1300, PCI 16", "EARFCN 1300, PCI 16 (2)", "EARFCN 1300, PCI 16 (3)"));
  const auto messages = recordsIn(
      Value::ofArray({dictionaryOf({{"Name", "Paging"}}), dictionaryOf({{"Name", "Attach Request"}})}));
  EXPECT_THAT(identities(*messages), ElementsAre("Name=Paging\n", "Name=Attach Request\n"))
      << "what is about nothing is known by its texts";
}

TEST_F(RecordListsTest, SectionsTextsAndMixedListsAreNoRecords) {
  EXPECT_FALSE(recordsIn(dictionaryOf({{"A", dictionaryOf({{"B", "1"}})}})));
  EXPECT_FALSE(isList());
  EXPECT_FALSE(recordsIn(Value::ofArray({"1", "2"})));
  EXPECT_FALSE(isList());
  EXPECT_FALSE(recordsIn(Value::ofArray({"1", dictionaryOf({{"B", "1"}})})));
  EXPECT_FALSE(recordsIn("1"));
}

TEST_F(RecordListsTest, AnEmptyListHasNoRecordsAndDoesNotTellWhetherItIsOneOfRecords) {
  const auto list = recordsIn(Value::ofArray());
  ASSERT_TRUE(list);
  EXPECT_TRUE(list->records.empty());
  EXPECT_FALSE(isList());
}

TEST_F(RecordListsTest, APathThatLeadsNowhereHasNoRecords) {
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(dictionaryOf({}), paths);
  EXPECT_FALSE(recordsOf(*root, {"Cells"}, formats));
  EXPECT_FALSE(recordsOf(*root, {}, formats));
}

}  // namespace
}  // namespace varnel
