#include "model/VarnelModelNode.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <functional>
#include <future>
#include <iterator>
#include <random>

#include "LogGenerator/ArrayLock.h"
#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::ExitedWithCode;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

// NAME=VALUE for a leaf, NAME{CHILD CHILD} for an inner node.
std::string outline(const VarnelModelNode& node) {
  if (const std::string* value = node.value()) return node.displayName() + "=" + *value;
  if (!node.childNodes()) return node.displayName() + " is neither leaf nor inner node";
  std::string children;
  for (const auto& child : *node.childNodes()) {
    if (!children.empty()) children += " ";
    children += outline(*child);
  }
  return node.displayName() + "{" + children + "}";
}

struct Tree {
  explicit Tree(const Value& object)
      : root(VarnelModelNode::makeTreeFromObject_withPathDictionary(object, paths)) {}

  std::string outline() const { return varnel::outline(*root); }
  // The outline of the node under that path.
  std::string at(const std::string& path) const {
    const auto found = paths.find(path);
    return found == paths.end() ? "nothing at " + path : varnel::outline(*found->second);
  }
  std::vector<std::string> allPaths() const {
    std::vector<std::string> all;
    for (const auto& [path, node] : paths) all.push_back(path);
    return all;
  }

  PathDictionary paths;
  std::shared_ptr<const VarnelModelNode> root;
};

TEST(VarnelModelNode, HasANameAndNeitherChildrenNorValue) {
  const VarnelModelNode node("Name");
  EXPECT_EQ(node.displayName(), "Name");
  EXPECT_EQ(node.childNodes(), nullptr);
  EXPECT_EQ(node.value(), nullptr);
}

TEST(VarnelModelNode, ALeafHasAValueAndNoChildren) {
  const VarnelModelLeafNode leaf("RSSI", "-77 dBm");
  EXPECT_EQ(leaf.displayName(), "RSSI");
  EXPECT_EQ(*leaf.value(), "-77 dBm");
  EXPECT_EQ(leaf.childNodes(), nullptr);
}

TEST(VarnelModelNode, AnInnerNodeHasItsChildrenInOrderAndNoValue) {
  const auto first = std::make_shared<VarnelModelLeafNode>("A", "1");
  const auto second = std::make_shared<VarnelModelLeafNode>("B", "2");
  const VarnelModelTreeNode node("Section", {first, second}, VarnelModelTreeNode::Origin::Dictionary);
  EXPECT_EQ(node.displayName(), "Section");
  EXPECT_EQ(node.value(), nullptr);
  EXPECT_THAT(*node.childNodes(), ElementsAre(first, second));
}

TEST(DisplayTree, AnAbsentObjectIsALeafNamedVarnelOfUnknownValueAtTheRootPath) {
  const Tree tree{Value()};
  EXPECT_EQ(tree.outline(), "Varnel=(unknown)");
  EXPECT_EQ(tree.allPaths(), std::vector<std::string>{"/"});
  EXPECT_EQ(tree.paths.at("/"), tree.root);
}

TEST(DisplayTree, AStringIsALeafNamedVarnel) {
  const Tree tree{Value("text")};
  EXPECT_EQ(tree.outline(), "Varnel=text");
  EXPECT_EQ(tree.allPaths(), std::vector<std::string>{"/"});
}

TEST(DisplayTree, AnEmptyDictionaryIsAnInnerNodeWithoutChildren) {
  const Tree tree{dictionaryOf({})};
  EXPECT_EQ(tree.outline(), "Varnel{}");
  EXPECT_THAT(*tree.root->childNodes(), IsEmpty());
  EXPECT_EQ(tree.root->value(), nullptr);
}

TEST(DisplayTree, AnEmptyArrayIsAnInnerNodeWithoutChildren) {
  EXPECT_EQ(Tree{Value::ofArray()}.outline(), "Varnel{}");
}

TEST(DisplayTree, AnEmptyTextIsALeafWithAnEmptyValue) {
  EXPECT_EQ(Tree{dictionaryOf({{"Name", ""}})}.outline(), "Varnel{Name=}");
}

TEST(DisplayTree, EverythingButTextsAndContainersHasAnUnknownValue) {
  const Tree tree{dictionaryOf({{"integer", Value::ofInteger(5)},
                                {"real", Value::ofReal(0.5)},
                                {"boolean", Value::ofBoolean(true)},
                                {"date", Value::ofDate({1, 0})},
                                {"data", Value::ofData({0x41})}})};
  EXPECT_EQ(tree.outline(),
            "Varnel{integer=(unknown) real=(unknown) boolean=(unknown) date=(unknown) data=(unknown)}");
}

TEST(DisplayTree, ADictionaryKeepsItsOwnOrderOfKeys) {
  EXPECT_EQ(Tree{dictionaryOf({{"b", "1"}, {"a", "2"}, {"C", "3"}})}.outline(), "Varnel{b=1 a=2 C=3}");
}

TEST(DisplayTree, WithoutTheMarkerAKeyWithASemicolonIsShownWhole) {
  const Tree tree{dictionaryOf({{"2;B", "b"}})};
  EXPECT_EQ(tree.outline(), "Varnel{2;B=b}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/2;B"));
}

TEST(DisplayTree, TheMarkerSortsKeysByCharactersAndHidesWhatStandsBeforeTheSemicolon) {
  const Tree tree{dictionaryOf({{"2;B", "b"}, {"10;A", "a"}, {"C", "c"}, {"_sorted", ""}})};
  EXPECT_EQ(tree.outline(), "Varnel{A=a B=b C=c}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/A", "/B", "/C"));
  EXPECT_EQ(tree.at("/A"), "A=a");
  EXPECT_EQ(tree.at("/B"), "B=b");
  EXPECT_EQ(tree.at("/C"), "C=c");
}

TEST(DisplayTree, SortingTellsUpperFromLowerCaseAndKnowsNoLanguage) {
  const Tree tree{
      dictionaryOf({{"_sorted", ""}, {"\u00e9", "1"}, {"a", "2"}, {"Z", "3"}, {"_", "4"}, {"9", "5"}})};
  EXPECT_EQ(tree.outline(), "Varnel{9=5 Z=3 _=4 a=2 \u00e9=1}");
}

TEST(DisplayTree, TheMarkerCountsWhateverItsValue) {
  EXPECT_EQ(Tree{dictionaryOf({{"_sorted", Value::ofBoolean(false)}, {"b", "1"}, {"a", "2"}})}.outline(),
            "Varnel{a=2 b=1}");
  EXPECT_EQ(Tree{dictionaryOf({{"b", "1"}, {"a", "2"}, {"_sorted", Value::ofArray()}})}.outline(),
            "Varnel{a=2 b=1}");
}

TEST(DisplayTree, TheMarkerItselfIsNeverShown) {
  const Tree tree{dictionaryOf({{"_sorted", "yes"}})};
  EXPECT_EQ(tree.outline(), "Varnel{}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/"));
}

TEST(DisplayTree, TheMarkerSortsItsOwnDictionaryOnly) {
  const Tree tree{dictionaryOf({{"_sorted", ""},
                                {"2;outer", dictionaryOf({{"2;b", "1"}, {"1;a", "2"}})},
                                {"1;other", dictionaryOf({{"_sorted", ""}, {"2;b", "3"}, {"1;a", "4"}})}})};
  EXPECT_EQ(tree.outline(), "Varnel{other{a=4 b=3} outer{2;b=1 1;a=2}}");
}

TEST(DisplayTree, AKeyThatEndsInItsSemicolonShowsAnEmptyName) {
  const Tree tree{dictionaryOf({{"Section", dictionaryOf({{"_sorted", ""}, {"x;", "1"}})}})};
  EXPECT_EQ(tree.outline(), "Varnel{Section{=1}}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/Section", "/Section/"));
  EXPECT_EQ(tree.at("/Section/"), "=1");
}

TEST(DisplayTree, AKeyThatBeginsWithItsSemicolonShowsWhatFollowsIt) {
  EXPECT_EQ(Tree{dictionaryOf({{"_sorted", ""}, {";x", "1"}})}.outline(), "Varnel{x=1}");
  EXPECT_EQ(Tree{dictionaryOf({{"_sorted", ""}, {";", "1"}})}.outline(), "Varnel{=1}");
}

TEST(DisplayTree, AKeyWithNoSemicolonOrWithTwoOrMoreIsShownWhole) {
  const Tree tree{dictionaryOf(
      {{"_sorted", ""}, {"plain", "1"}, {"1;a;b", "2"}, {"2;a;", "3"}, {";;", "4"}, {"3;a;b;c", "5"}})};
  EXPECT_EQ(tree.outline(), "Varnel{1;a;b=2 2;a;=3 3;a;b;c=5 ;;=4 plain=1}");
}

TEST(DisplayTree, AnEmptyNameBelowTheRootHasTheRootsPathWhichTheRootTakes) {
  const Tree tree{dictionaryOf({{"_sorted", ""}, {"1;", "lost"}})};
  EXPECT_EQ(tree.outline(), "Varnel{=lost}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/"));
  EXPECT_EQ(tree.paths.at("/"), tree.root);
}

TEST(DisplayTree, OfTwoNodesWithOnePathBothStayInTheTreeAndTheLaterIsFoundByItsPath) {
  const Tree tree{dictionaryOf({{"_sorted", ""}, {"1;Same", "first"}, {"2;Same", "second"}})};
  EXPECT_EQ(tree.outline(), "Varnel{Same=first Same=second}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/Same"));
  EXPECT_EQ(tree.at("/Same"), "Same=second");
}

TEST(DisplayTree, BelowTwoNodesWithOnePathTheChildrenOfBothAreFound) {
  const Tree tree{dictionaryOf({{"_sorted", ""},
                                {"1;Same", dictionaryOf({{"a", "1"}, {"b", "2"}})},
                                {"2;Same", dictionaryOf({{"b", "3"}})}})};
  EXPECT_EQ(tree.at("/Same"), "Same{b=3}");
  EXPECT_EQ(tree.at("/Same/a"), "a=1");
  EXPECT_EQ(tree.at("/Same/b"), "b=3");
}

TEST(DisplayTree, APathJoinsTheParentsAndTheNameByOneSlash) {
  const Tree tree{dictionaryOf({{"Serving Cell", dictionaryOf({{"RSSI", "-77"}})}})};
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/Serving Cell", "/Serving Cell/RSSI"));
}

TEST(DisplayTree, ANameMayHoldSlashes) {
  const Tree tree{dictionaryOf({{"SIM Info", dictionaryOf({{"EF-GPRS/PS-LOCI", "1"}, {"/x/", "2"}})},
                                {"/root", "3"},
                                {"ends/", dictionaryOf({{"below", "4"}})}})};
  EXPECT_EQ(tree.outline(), "Varnel{SIM Info{EF-GPRS/PS-LOCI=1 /x/=2} /root=3 ends/{below=4}}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/SIM Info", "/SIM Info/EF-GPRS/PS-LOCI",
                                                    "/SIM Info//x/", "//root", "/ends/", "/ends/below"));
}

TEST(DisplayTree, TheElementsOfAnArrayAreNamedByTheirNumbersFromZero) {
  const Tree tree{dictionaryOf({{"List", Value::ofArray({"a", "b", "c"})}})};
  EXPECT_EQ(tree.outline(), "Varnel{List{0=a 1=b 2=c}}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/List", "/List/0", "/List/1", "/List/2"));
}

TEST(DisplayTree, AnArrayMayBeTheRoot) {
  const Tree tree{Value::ofArray({"a", "b", "c"})};
  EXPECT_EQ(tree.outline(), "Varnel{0=a 1=b 2=c}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/0", "/1", "/2"));
}

TEST(DisplayTree, AnArrayElementThatIsANumberHasAnUnknownValueAndANumberOfItsOwn) {
  const Tree tree{Value::ofArray({"a", Value::ofInteger(7), "c"})};
  EXPECT_EQ(tree.outline(), "Varnel{0=a 1=(unknown) 2=c}");
}

TEST(DisplayTree, AnAbsentArrayElementHasAnUnknownValueAndANumberOfItsOwn) {
  const Tree tree{Value::ofArray({"a", Value(), "c"})};
  EXPECT_EQ(tree.outline(), "Varnel{0=a 1=(unknown) 2=c}");
}

TEST(DisplayTree, ElementsAreNumberedInDecimal) {
  const Tree tree{Value::ofArray(Array(11, Value("x")))};
  EXPECT_EQ(tree.root->childNodes()->back()->displayName(), "10");
  EXPECT_EQ(tree.at("/10"), "10=x");
}

TEST(DisplayTree, RowsOfAListAreInnerNodesUnderTheirNumbers) {
  const Tree tree{
      dictionaryOf({{"Cells", Value::ofArray({dictionaryOf({{"ID", "1"}}), dictionaryOf({{"ID", "2"}})})}})};
  EXPECT_EQ(tree.outline(), "Varnel{Cells{0{ID=1} 1{ID=2}}}");
  EXPECT_THAT(tree.allPaths(),
              UnorderedElementsAre("/", "/Cells", "/Cells/0", "/Cells/0/ID", "/Cells/1", "/Cells/1/ID"));
}

TEST(DisplayTree, InnerNodesRememberWhatTheyWereMadeFrom) {
  const Tree tree{dictionaryOf({{"List", Value::ofArray()}})};
  const auto origin = [&](const std::string& path) {
    return dynamic_cast<const VarnelModelTreeNode&>(*tree.paths.at(path)).origin();
  };
  EXPECT_EQ(origin("/"), VarnelModelTreeNode::Origin::Dictionary);
  EXPECT_EQ(origin("/List"), VarnelModelTreeNode::Origin::Array);
}

TEST(DisplayTree, ThePathDictionarySharesEveryNodeWithTheTree) {
  const Tree tree{dictionaryOf({{"Section", dictionaryOf({{"Row", "1"}})}, {"List", Value::ofArray({"a"})}})};
  ASSERT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/Section", "/Section/Row", "/List", "/List/0"));
  const auto& sections = *tree.root->childNodes();
  EXPECT_EQ(tree.paths.at("/"), tree.root);
  EXPECT_EQ(tree.paths.at("/Section"), sections[0]);
  EXPECT_EQ(tree.paths.at("/Section/Row"), sections[0]->childNodes()->front());
  EXPECT_EQ(tree.paths.at("/List"), sections[1]);
  EXPECT_EQ(tree.paths.at("/List/0"), sections[1]->childNodes()->front());
}

TEST(DisplayTree, ATreeStaysAsItWasBuilt) {
  const Value rows = dictionaryOf({{"Row", "before"}});
  const Value list = Value::ofArray({"a"});
  const Tree tree{dictionaryOf({{"Section", rows}, {"List", list}})};
  rows.dictionary()->setText("Row", "after");
  rows.dictionary()->set("Another", "row");
  list.array()->clear();
  EXPECT_EQ(tree.outline(), "Varnel{Section{Row=before} List{0=a}}");
}

TEST(DisplayTree, NodesLiveOnInThePathDictionary) {
  Tree tree{dictionaryOf({{"Row", "1"}})};
  tree.root.reset();
  EXPECT_EQ(tree.at("/"), "Varnel{Row=1}");
  EXPECT_EQ(tree.at("/Row"), "Row=1");
}

TEST(ChildPath, JoinsByASlashUnlessTheParentEndsInOne) {
  EXPECT_EQ(childPath("/", "Serving Cell"), "/Serving Cell");
  EXPECT_EQ(childPath("/Serving Cell", "RSSI"), "/Serving Cell/RSSI");
  EXPECT_EQ(childPath("/ends/", "below"), "/ends/below");
  EXPECT_EQ(childPath("/a", ""), "/a/");
  EXPECT_EQ(childPath("/", "/"), "//");
}

// Stands for the absence of a leaf.
constexpr std::string_view none = "(none)";
std::string leafAt(const Value& object, std::string_view path) {
  return std::string(leafValueUnderPath(object, path).value_or(none));
}

TEST(LeafValueUnderPath, IsTheTextThatTheTreeWouldShow) {
  const Value object = dictionaryOf(
      {{"Serving Cell", dictionaryOf({{"RSSI", "-77 dBm"}, {"Empty", ""}, {"Number", Value::ofInteger(7)}})},
       {"Cells", Value::ofArray({dictionaryOf({{"ID", "1"}}), "two", Value()})}});
  EXPECT_EQ(leafAt(object, "/Serving Cell/RSSI"), "-77 dBm");
  EXPECT_EQ(leafAt(object, "/Serving Cell/Empty"), "");
  EXPECT_EQ(leafAt(object, "/Serving Cell/Number"), "(unknown)");
  EXPECT_EQ(leafAt(object, "/Cells/0/ID"), "1");
  EXPECT_EQ(leafAt(object, "/Cells/1"), "two");
  EXPECT_EQ(leafAt(object, "/Cells/2"), "(unknown)");
}

TEST(LeafValueUnderPath, InnerNodesAndWhatIsNotThereHaveNone) {
  const Value object =
      dictionaryOf({{"Cell", dictionaryOf({{"ID", "1"}})}, {"Cells", Value::ofArray({"a"})}});
  for (const std::string_view path :
       {"/", "/Cell", "/Cells", "/Cell/", "/Cell/I", "/Cell/IDs", "/Cell/ID/", "/Cell//ID", "/CellID",
        "/Cells/1", "/Cells/00", "/Cells/-1", "//Cell", "Cell/ID", ""})
    EXPECT_EQ(leafAt(object, path), none) << path;
}

TEST(LeafValueUnderPath, ALeafMayBeTheRoot) {
  EXPECT_EQ(leafAt("text", "/"), "text");
  EXPECT_EQ(leafAt(Value(), "/"), "(unknown)");
  EXPECT_EQ(leafAt("text", "/text"), none);
  EXPECT_EQ(leafAt(Value::ofArray({"a", "b"}), "/1"), "b");
}

TEST(LeafValueUnderPath, TheMarkerSortsItsRowsAndIsNoneItself) {
  const Value object = dictionaryOf({{"_sorted", "mark"}, {"10;Name", "n"}, {"1;a;b", "whole"}});
  EXPECT_EQ(leafAt(object, "/Name"), "n");
  EXPECT_EQ(leafAt(object, "/10;Name"), none);
  EXPECT_EQ(leafAt(object, "/1;a;b"), "whole");
  EXPECT_EQ(leafAt(object, "/_sorted"), none);
}

TEST(LeafValueUnderPath, OfTwoRowsOfOneNameTheLaterCountsInTheOrderOfTheTree) {
  EXPECT_EQ(leafAt(dictionaryOf({{"2;Same", "second"}, {"1;Same", "first"}, {"_sorted", ""}}), "/Same"),
            "second");
  const Value sections = dictionaryOf({{"_sorted", ""},
                                       {"2;Same", dictionaryOf({{"b", "3"}})},
                                       {"1;Same", dictionaryOf({{"a", "1"}, {"b", "2"}})}});
  EXPECT_EQ(leafAt(sections, "/Same/b"), "3");
  EXPECT_EQ(leafAt(sections, "/Same/a"), "1") << "the later one has no such row";
  EXPECT_EQ(
      leafAt(dictionaryOf({{"_sorted", ""}, {"1;Same", "leaf"}, {"2;Same", dictionaryOf({})}}), "/Same"),
      none)
      << "the later one is no leaf";
}

TEST(LeafValueUnderPath, NamesWithSlashesMayShareAPathWithRowsOfASection) {
  EXPECT_EQ(leafAt(dictionaryOf({{"a", dictionaryOf({{"b", "row"}})}, {"a/b", "name"}}), "/a/b"), "name");
  EXPECT_EQ(leafAt(dictionaryOf({{"a/b", "name"}, {"a", dictionaryOf({{"b", "row"}})}}), "/a/b"), "row");
  const Value slashes =
      dictionaryOf({{"/root", "1"}, {"ends/", dictionaryOf({{"below", "2"}, {"/x/", "3"}})}});
  EXPECT_EQ(leafAt(slashes, "//root"), "1");
  EXPECT_EQ(leafAt(slashes, "/ends/below"), "2");
  EXPECT_EQ(leafAt(slashes, "/ends//x/"), "3");
  EXPECT_EQ(leafAt(slashes, "/ends//below"), none);
}

TEST(LeafValueUnderPath, ANodeTakesThePathOfARowWithoutAName) {
  const Value below = dictionaryOf({{"Section", dictionaryOf({{"_sorted", ""}, {"x;", "1"}})}});
  EXPECT_EQ(leafAt(below, "/Section/"), "1");
  EXPECT_EQ(leafAt(below, "/Section"), none);
  EXPECT_EQ(leafAt(dictionaryOf({{"_sorted", ""}, {"1;", "lost"}}), "/"), none) << "the root's own path";
  const Value nested = dictionaryOf({{"a", dictionaryOf({{"", dictionaryOf({{"b", "1"}, {"", "lost"}})}})}});
  EXPECT_EQ(leafAt(nested, "/a/b"), "1");
  EXPECT_EQ(leafAt(nested, "/a/"), none);
}

Value threeCells() {
  return Value::ofArray(
      {dictionaryOf({{"ID", "7"}, {"Band", "1"}, {"RSRP", "-90 dBm"}}),
       dictionaryOf({{"ID", "16"}, {"Band", "1"}, {"RSRP", "-95 dBm"}}),
       dictionaryOf({{"ID", "16"}, {"Band", "3"}, {"RSRP", "-99 dBm"}, {"RSRQ", "-9 dB"}})});
}

TEST(LeafValueUnderPath, BracketsSelectTheFirstRecordWithThatValue) {
  const Value object = dictionaryOf({{"Cells", threeCells()}});
  EXPECT_EQ(leafAt(object, "/Cells[ID=7]/RSRP"), "-90 dBm");
  EXPECT_EQ(leafAt(object, "/Cells[ID=16]/RSRP"), "-95 dBm");
  EXPECT_EQ(leafAt(object, "/Cells[Band=3]/ID"), "16");
  EXPECT_EQ(leafAt(object, "/Cells/[Band=3]/ID"), "16") << "in place of a row's number";
  EXPECT_EQ(leafAt(threeCells(), "/[Band=3]/ID"), "16");
  EXPECT_EQ(leafAt(object, "/Cells[ID=16]/RSRQ"), none)
      << "the first record counts, even where it lacks the row";
  for (const std::string_view path :
       {"/Cells[ID=1]/RSRP", "/Cells[ID=160]/RSRP", "/Cells[ID=]/RSRP", "/Cells[ID]/RSRP",
        "/Cells[id=16]/RSRP", "/Cells[ID=16]RSRP", "/Cells[ID=16]", "/Cells[ID=16]/", "/Cells[ID=16",
        "/Cells[", "/Cells[]/RSRP", "/[", "/Cells/0[ID=7]/RSRP", "/Cells/0/ID[ID=7]"})
    EXPECT_EQ(leafAt(object, path), none) << path;
}

TEST(LeafValueUnderPath, SeveralBracketsSelectTheFirstRecordWithAllValues) {
  const Value object = dictionaryOf({{"Cells", threeCells()}});
  EXPECT_EQ(leafAt(object, "/Cells[ID=16][Band=3]/RSRP"), "-99 dBm");
  EXPECT_EQ(leafAt(object, "/Cells[Band=1][ID=16]/RSRP"), "-95 dBm");
  EXPECT_EQ(leafAt(object, "/Cells[ID=7][Band=3]/RSRP"), none);
}

TEST(LeafValueUnderPath, RecordsMayBeRowsOfASectionInTheOrderOfTheTree) {
  const Value object =
      dictionaryOf({{"Cells", dictionaryOf({{"_sorted", ""},
                                            {"2;Later", dictionaryOf({{"ID", "1"}, {"Level", "b"}})},
                                            {"1;Earlier", dictionaryOf({{"ID", "1"}, {"Level", "a"}})}})}});
  EXPECT_EQ(leafAt(object, "/Cells[ID=1]/Level"), "a");
}

TEST(LeafValueUnderPath, SelectedRecordsMayHoldListsToSelectFrom) {
  const Value object = dictionaryOf(
      {{"A",
        Value::ofArray({dictionaryOf({{"x", "0"}}), dictionaryOf({{"x", "1"}, {"Cells", threeCells()}})})}});
  EXPECT_EQ(leafAt(object, "/A[x=1]/Cells[Band=3]/RSRP"), "-99 dBm");
  EXPECT_EQ(leafAt(object, "/A[x=1]/Cells/0/RSRP"), "-90 dBm");
}

TEST(LeafValueUnderPath, SelectingNamesAndValuesMayHoldAnyCharacter) {
  const Value object =
      dictionaryOf({{"List", Value::ofArray({dictionaryOf({{"a/b=[c]", "x]/y=[z"}, {"v", "1"}}),
                                             dictionaryOf({{"n", Value::ofInteger(7)}, {"v", "2"}}),
                                             Value::ofArray({"p", "q"})})}});
  EXPECT_EQ(leafAt(object, "/List[a/b=[c]=x]/y=[z]/v"), "1");
  EXPECT_EQ(leafAt(object, "/List[n=(unknown)]/v"), "2");
  EXPECT_EQ(leafAt(object, "/List[0=p]/1"), "q");
}

TEST(LeafValueUnderPath, ANameWithBracketsComesBeforeASelection) {
  const Value object = dictionaryOf({{"Cells[ID=7]", dictionaryOf({{"RSRP", "name"}})},
                                     {"Cells", threeCells()},
                                     {"Cells[ID=16]", "leaf"},
                                     {"Level [dBm]", "-3"}});
  EXPECT_EQ(leafAt(object, "/Cells[ID=7]/RSRP"), "name");
  EXPECT_EQ(leafAt(object, "/Cells[ID=16]"), "leaf");
  EXPECT_EQ(leafAt(object, "/Cells[ID=16]/RSRP"), "-95 dBm");
  EXPECT_EQ(leafAt(object, "/Level [dBm]"), "-3");
}

// Checks every path of the tree, and each path with one character more or less.
void expectLikeTheTree(const Value& object) {
  const Tree tree{object};
  const auto expectLike = [&](const std::string& path) {
    const auto found = tree.paths.find(path);
    const std::string* value = found == tree.paths.end() ? nullptr : found->second->value();
    EXPECT_EQ(leafAt(object, path), value ? *value : none) << path << " of " << tree.outline();
  };
  for (const std::string& path : tree.allPaths()) {
    expectLike(path);
    expectLike(path + "/");
    expectLike(path + "a");
    expectLike(path.substr(0, path.size() - 1));
  }
}

TEST(LeafValueUnderPath, FindsWhatThePathDictionaryHoldsWhateverTheNames) {
  const std::string names[] = {"", "/", "a", "a/", "/a", "a/a", "1;a", "2;a/a", "3;a/", "4;", "5;a;", "0"};
  std::mt19937 random(1);
  const auto below = [&](unsigned bound) { return static_cast<unsigned>(random() % bound); };
  int leaves = 0;
  const std::function<Value(int)> objectOf = [&](int depth) -> Value {
    const unsigned kind = depth == 0 ? 0 : below(4);
    if (kind == 0) return std::to_string(++leaves);
    if (kind == 1) return Value::ofArray({objectOf(depth - 1), objectOf(depth - 1)});
    Value rows = Value::ofDictionary();
    if (below(2) == 0) rows.dictionary()->set("_sorted", "");
    for (int i = 0; i < 4; ++i) rows.dictionary()->set(names[below(std::size(names))], objectOf(depth - 1));
    return rows;
  };
  for (int round = 0; round < 2000; ++round) expectLikeTheTree(objectOf(4));
}

// Whether the thread that runs the task waits for something. `isHeldUp` says whether it should. If it should
// not, it gets a long time, since the machine may be busy.
template <class Task>
bool isStuck(std::future<Task>& task, bool isHeldUp) {
  const auto patience = isHeldUp ? std::chrono::milliseconds(100) : std::chrono::minutes(1);
  return task.wait_for(patience) == std::future_status::timeout;
}

// Runs in its own process, because it uses the process-wide lock.
class DisplayTreeArrayLockDeathTest : public testing::Test {
 protected:
  DisplayTreeArrayLockDeathTest() { testing::FLAGS_gtest_death_test_style = "threadsafe"; }
};

[[noreturn]] void exitWith(bool success) { std::_Exit(success ? 0 : 1); }

[[noreturn]] void buildWhileTheLockIsHeld(const Value& object, bool isHeldUp) {
  ArrayLock::lockArray();
  std::future<std::string> outline = std::async(std::launch::async, [&] { return Tree{object}.outline(); });
  const bool wasHeldUp = isStuck(outline, isHeldUp);
  ArrayLock::unlockArray();
  outline.wait();
  exitWith(wasHeldUp == isHeldUp);
}

[[noreturn]] void lockAfterBuilding(const Value& object, bool isHeldUp) {
  const Tree tree{object};
  std::future<void> locking = std::async(std::launch::async, [] { ArrayLock::Scope lock; });
  exitWith(isStuck(locking, isHeldUp) == isHeldUp);
}

TEST_F(DisplayTreeArrayLockDeathTest, AWalkOverAnArrayWaitsForTheLock) {
  EXPECT_EXIT(buildWhileTheLockIsHeld(Value::ofArray({"a"}), true), ExitedWithCode(0), "");
}

TEST_F(DisplayTreeArrayLockDeathTest, DictionariesNeedNoLock) {
  EXPECT_EXIT(buildWhileTheLockIsHeld(dictionaryOf({{"Row", "1"}}), false), ExitedWithCode(0), "");
}

TEST_F(DisplayTreeArrayLockDeathTest, TheLockIsFreeAfterArraysSideBySide) {
  EXPECT_EXIT(
      lockAfterBuilding(dictionaryOf({{"A", Value::ofArray({"a"})}, {"B", Value::ofArray({"b"})}}), false),
      ExitedWithCode(0), "");
}

TEST_F(DisplayTreeArrayLockDeathTest, ArraysWithinArraysNestTheLockWhichTheThreadThenKeeps) {
  EXPECT_EXIT(lockAfterBuilding(Value::ofArray({Value::ofArray({"a"})}), true), ExitedWithCode(0), "");
}

TEST(DisplayTree, ArraysWithinArraysAreWalkedWhole) {
  const Tree tree{Value::ofArray({Value::ofArray({"a", "b"}), "c", Value::ofArray({Value::ofArray({"d"})})})};
  EXPECT_EQ(tree.outline(), "Varnel{0{0=a 1=b} 1=c 2{0{0=d}}}");
  EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/0", "/0/0", "/0/1", "/1", "/2", "/2/0", "/2/0/0"));
}

class FixedTimes final : public WriteTimes {
 public:
  std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view key) const override {
    return key == "RSRP" || key == "1;Sorted" ? std::optional(Time{.seconds = 100}) : std::nullopt;
  }
  std::optional<Time> refilledAt(const Array& /*list*/) const override { return Time{.seconds = 200}; }
};

std::optional<Time> timeOf(const PathDictionary& paths, const std::string& path) {
  return dynamic_cast<const VarnelModelLeafNode&>(*paths.at(path)).writtenAt();
}

TEST(DisplayTree, LeavesCarryTheTimeOfTheirEntryOrOfWhatTheyStandIn) {
  const Value display = dictionaryOf(
      {{"Serving Cell", dictionaryOf({{"RSRP", "-80 dBm"}, {"Band", "3"}})},
       {"Order", dictionaryOf({{"_sorted", "_sorted"}, {"1;Sorted", "yes"}})},
       {"Neighbors", Value::ofArray({dictionaryOf({{"RSRP", "-90 dBm"}, {"Band", "7"}}), "text"})}});
  PathDictionary paths;
  VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths, FixedTimes());
  EXPECT_EQ(timeOf(paths, "/Serving Cell/RSRP"), Time{.seconds = 100});
  EXPECT_EQ(timeOf(paths, "/Serving Cell/Band"), std::nullopt);
  EXPECT_EQ(timeOf(paths, "/Order/Sorted"), Time{.seconds = 100});
  EXPECT_EQ(timeOf(paths, "/Neighbors/0/RSRP"), Time{.seconds = 100});
  EXPECT_EQ(timeOf(paths, "/Neighbors/0/Band"), Time{.seconds = 200});
  EXPECT_EQ(timeOf(paths, "/Neighbors/1"), Time{.seconds = 200});
}

TEST(DisplayTree, WithoutTimesNoLeafHasOne) {
  PathDictionary paths;
  VarnelModelNode::makeTreeFromObject_withPathDictionary(dictionaryOf({{"RSRP", "-80 dBm"}}), paths);
  EXPECT_EQ(timeOf(paths, "/RSRP"), std::nullopt);
}

}  // namespace
}  // namespace varnel
