#include "app/VarnelPaneController.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeSaveControl.h"
#include "tests/support/RecordingUserInterface.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

VarnelPaneController::Node tree(const Value& display) {
  PathDictionary paths;
  return VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
}

// An inner node, a leaf, and an inner node without children.
Value display() {
  return dictionaryOf({{"Serving Cell", dictionaryOf({{"RSSI", "-71 dBm"}, {"Band", "7"}})},
                       {"State", "Idle"},
                       {"Neighbors", Value::ofArray()}});
}

class VarnelPaneControllerTest : public testing::Test {
 protected:
  // Shows the pane at the bottom of a stack on the screen.
  void show(VarnelPaneController::Node node, const std::string& path = "/") {
    controller = std::make_shared<VarnelPaneController>(userInterface, saveControl, std::move(node), path);
    stack = userInterface.makeNavigationStack(controller);
    userInterface.stack->appear();
  }
  RecordingPane& pane() const { return static_cast<RecordingPane&>(controller->pane()); }
  RecordingTable& table() const { return pane().table(); }
  std::string key(std::size_t row) const { return cell(row).key().text(); }
  std::string value(std::size_t row) const {
    return cell(row).value() ? cell(row).value()->text() : "no label";
  }
  VarnelCell& cell(std::size_t row) const { return static_cast<VarnelCell&>(table().cell(row)); }
  CellAccessory accessory(std::size_t row) const { return table().cellView(row).accessory; }
  VarnelPaneController& pushed() const {
    return static_cast<VarnelPaneController&>(*userInterface.stack->topController());
  }

  RecordingUserInterface userInterface;
  FakeSaveControl saveControl;
  std::shared_ptr<VarnelPaneController> controller;
  std::unique_ptr<NavigationStack> stack;
};

TEST_F(VarnelPaneControllerTest, ARowIsExplainedByItsNamesBelowTheRoot) {
  TestServices host;
  host.resources.add(
      "Explanations",
      dictionaryOf({{"Rows", dictionaryOf({{"Serving Cell/Band", "Its band."}, {"Band", "A band."}})}}));
  const ValueHistory history;
  const RowAnswers answers(host.resources, host.clock, history);
  RowFacts facts({host.clock, nullptr, &answers});
  const auto root = tree(display());
  facts.follow(root, RowFacts::Display::Renewed);
  controller = std::make_shared<VarnelPaneController>(userInterface, saveControl, root, "/", &facts);
  stack = userInterface.makeNavigationStack(controller);
  userInterface.stack->appear();
  table().select(0);
  auto& section = static_cast<RecordingPane&>(pushed().pane()).table();
  EXPECT_EQ(pushed().tableView_explanationOfRow(section, {0, 1}), "Its band.");
  EXPECT_EQ(pushed().tableView_explanationOfRow(section, {0, 0}), "");
}

TEST_F(VarnelPaneControllerTest, WithoutANodeItIsAnEmptyTableTitledVarnel) {
  show(nullptr);
  EXPECT_EQ(pane().title, "Varnel");
  EXPECT_EQ(table().rows(), 0u);
}

TEST_F(VarnelPaneControllerTest, ItsTitleIsTheNodesName) {
  show(tree(display())->childNodes()->at(0), "/Serving Cell");
  EXPECT_EQ(pane().title, "Serving Cell");
  EXPECT_EQ(controller->path(), "/Serving Cell");
}

TEST_F(VarnelPaneControllerTest, BeginsLoadingWithAnEmptyStatus) {
  show(nullptr);
  EXPECT_EQ(pane().toolbarText(), "[wheel] [] [space]");
}

TEST_F(VarnelPaneControllerTest, AppearingShowsTheToolbarOfTheStack) {
  show(nullptr);
  EXPECT_TRUE(userInterface.stack->isToolbarShown);
  EXPECT_EQ(pane().toolbars, 1u);
}

TEST_F(VarnelPaneControllerTest, ARowForEveryChild) {
  show(tree(display()));
  EXPECT_EQ(table().rows(), 3u);
  EXPECT_EQ(key(0), "Serving Cell");
  EXPECT_EQ(key(1), "State");
  EXPECT_EQ(key(2), "Neighbors");
}

TEST_F(VarnelPaneControllerTest, AnInnerNodesRowShowsItsNameWithADisclosureMark) {
  show(tree(display()));
  EXPECT_EQ(accessory(0), CellAccessory::DisclosureIndicator);
  EXPECT_EQ(value(0), "no label");
  EXPECT_EQ(table().cellView(0).style, CellStyle::NameAndDetail);
  EXPECT_EQ(cell(0).reuseIdentifier(), "VarnelPaneControllerCell");
}

TEST_F(VarnelPaneControllerTest, ALeafsRowShowsNameAndValueWithoutAMark) {
  show(tree(display()));
  EXPECT_EQ(accessory(1), CellAccessory::None);
  EXPECT_EQ(value(1), "Idle");
  EXPECT_EQ(table().cellView(1).style, CellStyle::NameAndDetail);
  EXPECT_EQ(cell(1).reuseIdentifier(), "VarnelPaneControllerCell");
}

TEST_F(VarnelPaneControllerTest, RowsAreLaidOutByTheirKind) {
  show(tree(display()));
  const auto& inner = *table().cellView(0).labels.at(0);
  EXPECT_EQ(inner.frame, (Rect{10, 15, 120, 20}));
  const auto& container = *table().cellView(1).containers.at(0);
  EXPECT_EQ(container.labels[0]->frame, (Rect{10, 15, 50, 20}));
  EXPECT_EQ(container.labels[1]->frame, (Rect{260, 15, 40, 20}));
}

TEST_F(VarnelPaneControllerTest, AnInnerNodeWithoutChildrenHasAMarkAndOpensAnEmptyPane) {
  show(tree(display()));
  EXPECT_EQ(accessory(2), CellAccessory::DisclosureIndicator);
  table().select(2);
  EXPECT_EQ(pushed().path(), "/Neighbors");
  EXPECT_EQ(userInterface.stack->pane().title, "Neighbors");
  EXPECT_EQ(userInterface.stack->pane().table().rows(), 0u);
}

TEST_F(VarnelPaneControllerTest, SelectingAnInnerNodePushesItsPane) {
  show(tree(display()));
  table().select(0);
  EXPECT_THAT(userInterface.events, ElementsAre("push animated"));
  EXPECT_EQ(pushed().path(), "/Serving Cell");
  EXPECT_EQ(userInterface.stack->pane().title, "Serving Cell");
  EXPECT_EQ(userInterface.stack->pane().table().rows(), 2u);
}

TEST_F(VarnelPaneControllerTest, APathGrowsByOneNameAPane) {
  show(tree(dictionaryOf({{"A", dictionaryOf({{"B", dictionaryOf({})}})}})));
  table().select(0);
  userInterface.stack->pane().table().select(0);
  EXPECT_EQ(pushed().path(), "/A/B");
}

TEST_F(VarnelPaneControllerTest, APushedPaneBeginsWithItsParentsStatus) {
  show(tree(display()));
  controller->setStatus_isLoading("Updated 2024-03-01 at 14:05:09", false);
  table().select(0);
  EXPECT_EQ(userInterface.stack->pane().toolbarText(),
            "[hidden wheel] [Updated 2024-03-01 at 14:05:09] [space]");
}

TEST_F(VarnelPaneControllerTest, SelectingALeafOnlyDeselectsItWithoutAnimation) {
  show(tree(display()));
  table().select(1);
  EXPECT_THAT(table().deselections, ElementsAre(Animation::None));
  EXPECT_FALSE(table().selected());
  EXPECT_THAT(userInterface.events, IsEmpty());
}

TEST_F(VarnelPaneControllerTest, SelectingNoRowDoesNothing) {
  show(tree(display()));
  table().selectNothing();
  EXPECT_THAT(table().deselections, IsEmpty());
  EXPECT_THAT(userInterface.events, IsEmpty());
}

TEST_F(VarnelPaneControllerTest, DisappearingOnlyGivesTheKeyboardAway) {
  show(tree(display()));
  const unsigned toolbars = pane().toolbars;
  table().select(0);
  EXPECT_EQ(pane().resignations, 1u);
  EXPECT_EQ(pane().toolbars, toolbars);
}

TEST_F(VarnelPaneControllerTest, TheToolbarHoldsIndicatorStatusAndSpaceWithoutTheMarker) {
  show(nullptr);
  controller->setStatus_isLoading("Connecting...", true);
  EXPECT_EQ(pane().toolbarText(), "[wheel] [Connecting...] [space]");
}

TEST_F(VarnelPaneControllerTest, OnInternalDevicesTheToolbarEndsInASaveButton) {
  saveControl.allows = true;
  show(nullptr);
  EXPECT_EQ(pane().toolbarText(), "[wheel] [] [space] [Save]");
  EXPECT_EQ(std::get<BarButton>(pane().toolbar[3]).item, BarButton::SystemItem::Save);
  pane().pressSave();
  EXPECT_EQ(saveControl.shows, 1u);
}

TEST_F(VarnelPaneControllerTest, TheStatusIsOfSize14) {
  show(nullptr);
  EXPECT_EQ(std::get<ToolbarLabel>(pane().toolbar[1]).font, Font::system(14));
}

TEST_F(VarnelPaneControllerTest, EveryStatusMakesANewToolbarAnimated) {
  show(nullptr);
  const unsigned before = pane().toolbars;
  controller->setStatus_isLoading("a", true);
  controller->setStatus_isLoading("a", true);
  EXPECT_EQ(pane().toolbars, before + 2);
  EXPECT_EQ(pane().toolbarAnimation, Animation::Animated);
}

TEST_F(VarnelPaneControllerTest, NoStatusIsAnEmptyOne) {
  show(nullptr);
  controller->setStatus_isLoading("Connecting...", true);
  controller->setStatus_isLoading(std::nullopt, false);
  EXPECT_EQ(pane().toolbarText(), "[hidden wheel] [] [space]");
}

TEST_F(VarnelPaneControllerTest, ReloadingShowsTheNewNode) {
  show(nullptr);
  const unsigned toolbars = pane().toolbars;
  controller->reloadWithNode(tree(display())->childNodes()->at(0));
  EXPECT_EQ(pane().title, "Serving Cell");
  EXPECT_EQ(table().reloads, 1u);
  EXPECT_EQ(table().rows(), 2u);
  EXPECT_EQ(value(0), "-71 dBm");
  EXPECT_EQ(pane().toolbars, toolbars + 1);
}

TEST_F(VarnelPaneControllerTest, ReloadingWithoutANodeShowsAnEmptyTableTitledVarnel) {
  show(tree(display())->childNodes()->at(0));
  controller->reloadWithNode(nullptr);
  EXPECT_EQ(pane().title, "Varnel");
  EXPECT_EQ(table().rows(), 0u);
}

TEST_F(VarnelPaneControllerTest, APaneWhoseNodeHasBecomeALeafIsEmpty) {
  show(tree(display()));
  controller->reloadWithNode(tree(Value("text")));
  EXPECT_EQ(table().rows(), 0u);
}

TEST_F(VarnelPaneControllerTest, AReloadUsesEachRowsOwnCellAgain) {
  show(tree(display()));
  const VarnelCell* const first = &cell(0);
  const VarnelCell* const second = &cell(1);
  controller->reloadWithNode(tree(display()));
  EXPECT_EQ(table().cellsMade, 3u);
  EXPECT_EQ(&cell(0), first);
  EXPECT_EQ(&cell(1), second);
  EXPECT_EQ(value(1), "Idle");
}

TEST_F(VarnelPaneControllerTest, ALeafInANameOnlyCellShowsItsNameOnly) {
  show(tree(dictionaryOf({{"Row", dictionaryOf({})}})));
  controller->reloadWithNode(tree(dictionaryOf({{"RSSI", "-71 dBm"}})));
  EXPECT_EQ(key(0), "RSSI");
  EXPECT_EQ(value(0), "no label");
  EXPECT_EQ(accessory(0), CellAccessory::None);
  EXPECT_EQ(table().cellView(0).labels[0]->frame, (Rect{10, 15, 40, 20}));
}

TEST_F(VarnelPaneControllerTest, ALeafShowsItsValueAsSoonAsThereAreMoreRows) {
  show(tree(dictionaryOf({{"Row", dictionaryOf({})}})));
  controller->reloadWithNode(tree(dictionaryOf({{"Row", "-71 dBm"}, {"Other", dictionaryOf({})}})));
  EXPECT_EQ(value(0), "-71 dBm");
}

TEST_F(VarnelPaneControllerTest, AnInnerNodeInANameAndValueCellShowsNoValue) {
  show(tree(dictionaryOf({{"RSSI", "-71 dBm"}})));
  controller->reloadWithNode(tree(dictionaryOf({{"Cells", dictionaryOf({})}})));
  EXPECT_EQ(key(0), "Cells");
  EXPECT_EQ(value(0), "");
  EXPECT_EQ(accessory(0), CellAccessory::DisclosureIndicator);
}

TEST_F(VarnelPaneControllerTest, ARowThatScrollsInGetsACellThatHasScrolledOut) {
  Value rows = Value::ofArray();
  for (int i = 0; i < 4; ++i) rows.array()->push_back(Value("value " + std::to_string(i)));
  controller = std::make_shared<VarnelPaneController>(userInterface, saveControl, tree(rows), "/");
  table().visibleRows = 2;
  stack = userInterface.makeNavigationStack(controller);
  userInterface.stack->appear();
  table().scroll(2);
  EXPECT_EQ(table().cellsMade, 2u);
  EXPECT_EQ(value(3), "value 3");
}

TEST_F(VarnelPaneControllerTest, AnotherWidthLaysItsRowsOutAgain) {
  show(tree(display()));
  table().resize(400);
  EXPECT_EQ(table().cellView(1).containers[0]->labels[1]->frame, (Rect{360, 15, 40, 20}));
}

TEST_F(VarnelPaneControllerTest, APaneOnNoStackPushesNothing) {
  controller = std::make_shared<VarnelPaneController>(userInterface, saveControl, tree(display()), "/");
  table().appear();
  table().select(0);
  EXPECT_THAT(userInterface.events, IsEmpty());
}

}  // namespace
}  // namespace varnel
