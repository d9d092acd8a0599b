#include "app/TreeText.h"

#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

std::string text(const Value& display) {
  PathDictionary paths;
  return treeAsText(*VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths));
}

TEST(TreeText, ARootThatIsALeafIsItsValueAlone) {
  EXPECT_EQ(text(Value()), "(unknown)\n");
  EXPECT_EQ(text(Value("text")), "text\n");
}

TEST(TreeText, ARootWithoutChildrenIsNoText) { EXPECT_EQ(text(dictionaryOf({})), ""); }

TEST(TreeText, TheRootItselfIsNotShown) {
  EXPECT_EQ(text(dictionaryOf({{"Name", "value"}})), "Name  value\n");
}

TEST(TreeText, ValuesOfSiblingsAreAligned) {
  EXPECT_EQ(text(dictionaryOf({{"ID", "1"}, {"Bandwidth", "5 MHz"}, {"Band", "7"}})),
            "ID         1\n"
            "Bandwidth  5 MHz\n"
            "Band       7\n");
}

TEST(TreeText, ChildrenAreIndentedBelowTheirParentAndAlignedAmongThemselves) {
  EXPECT_EQ(text(dictionaryOf(
                {{"Serving Cell Info", dictionaryOf({{"Physical Cell ID", "17"}, {"Band", "7"}})},
                 {"Cells", Value::ofArray({dictionaryOf({{"ID", "1"}}), dictionaryOf({{"ID", "2"}})})},
                 {"Other", dictionaryOf({{"A", "x"}, {"Long", "y"}})}})),
            "Serving Cell Info\n"
            "  Physical Cell ID  17\n"
            "  Band              7\n"
            "Cells\n"
            "  0\n"
            "    ID  1\n"
            "  1\n"
            "    ID  2\n"
            "Other\n"
            "  A     x\n"
            "  Long  y\n");
}

TEST(TreeText, TheNamesOfInnerNodesDoNotPushValuesAside) {
  EXPECT_EQ(text(dictionaryOf({{"A", "1"}, {"A very long name of a section", dictionaryOf({{"B", "2"}})}})),
            "A  1\n"
            "A very long name of a section\n"
            "  B  2\n");
}

TEST(TreeText, ANameOfMoreThan80CharactersDoesNotPushTheValuesOfOthersAside) {
  const std::string widest(80, 'w'), wider(81, 'x');
  EXPECT_EQ(text(dictionaryOf({{"A", "1"}, {wider, "2"}})), "A  1\n" + wider + "  2\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "1"}, {widest, "2"}})),
            "A" + std::string(81, ' ') + "1\n" + widest + "  2\n");
}

TEST(TreeText, AnEmptySectionIsItsNameAlone) {
  EXPECT_EQ(text(dictionaryOf({{"PDP Context Info", Value::ofArray()}, {"SIM Info", dictionaryOf({})}})),
            "PDP Context Info\n"
            "SIM Info\n");
}

TEST(TreeText, AnEmptyValueLeavesNoBlanksBehindItsName) {
  EXPECT_EQ(text(dictionaryOf({{"Empty", ""}, {"Full", "1"}})), "Empty\nFull   1\n");
}

TEST(TreeText, NamesAreAlignedByTheirCharactersNotTheirBytes) {
  EXPECT_EQ(text(dictionaryOf({{"Zürich", "1"}, {"Berlin!", "2"}, {"日本", "3"}})),
            "Zürich   1\n"
            "Berlin!  2\n"
            "日本       3\n");
}

TEST(TreeText, ControlCharactersAreShownAsEscapes) {
  using namespace std::string_literals;
  EXPECT_EQ(text(dictionaryOf({{"A", "\x1b[2J"}})), "A  \\x1b[2J\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "a\nb\tc\rd"}})), "A  a\\x0ab\\x09c\\x0dd\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "\x7f\x01"}})), "A  \\x7f\\x01\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "a\0b"s}})), "A  a\\x00b\n");
}

TEST(TreeText, TheUpperControlCharactersAreShownAsEscapes) {
  EXPECT_EQ(text(dictionaryOf({{"A", "\u009b2J"}})), "A  \\x9b2J\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "\u0080\u009f"}})), "A  \\x80\\x9f\n");
  EXPECT_EQ(text(dictionaryOf({{"A", "\u00a0"}})), "A  \u00a0\n");
}

TEST(TreeText, NamesAndARootLeafAreEscapedToo) {
  EXPECT_EQ(text(dictionaryOf({{"\x1b[31m", "1"}, {"B", "2"}})),
            "\\x1b[31m  1\n"
            "B         2\n");
  EXPECT_EQ(text(Value("\x1b[2J")), "\\x1b[2J\n");
}

TEST(TreeText, OtherLettersStayAsTheyAre) {
  EXPECT_EQ(text(dictionaryOf({{"Größe", "5 µs – “日本” \U0001F4F6"}})), "Größe  5 µs – “日本” \U0001F4F6\n");
}

TEST(TreeText, BackslashesStayAsTheyAre) { EXPECT_EQ(text(dictionaryOf({{"A", "C:\\x"}})), "A  C:\\x\n"); }

}  // namespace
}  // namespace varnel
