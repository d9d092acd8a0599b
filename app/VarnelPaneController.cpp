#include "app/VarnelPaneController.h"

#include <algorithm>
#include <utility>

namespace varnel {

namespace {

// Kept: both kinds of cell have one identifier. So a row can get a cell of the other kind, and then shows
// only what the labels of that cell can show.
constexpr std::string_view cellIdentifier = "VarnelPaneControllerCell";
constexpr std::string_view titleWithoutNode = "Varnel";
constexpr double statusFontSize = 14;

}  // namespace

VarnelPaneController::VarnelPaneController(UserInterface& userInterface, SaveControl& saveControl, Node node,
                                           std::string path, RowFacts* facts)
    : _userInterface(userInterface),
      _saveControl(saveControl),
      _pane(userInterface.makeTablePane()),
      _nodes(std::move(node)),
      _keyPath(std::move(path)),
      _facts(facts) {
  _pane->table().setDelegate(this);
}

void VarnelPaneController::viewWillAppear(Animation animation) {
  PaneController::viewWillAppear(animation);
  showTitle();
  if (navigationController()) navigationController()->showToolbar();
  createToolbarItems();
}

// Kept: the default action of a pane that disappears is missing here.
void VarnelPaneController::viewWillDisappear(Animation) { _pane->resignFirstResponder(); }

void VarnelPaneController::setStatus_isLoading(std::optional<std::string_view> status, bool isLoading) {
  _status = status.value_or("");
  _isLoading = isLoading;
  createToolbarItems();
}

void VarnelPaneController::reloadWithNode(Node node) {
  _nodes = std::move(node);
  showTitle();
  _pane->table().reloadData();
  createToolbarItems();
}

void VarnelPaneController::createToolbarItems() {
  std::vector<ToolbarItem> items{ActivityIndicator{_isLoading},
                                 ToolbarLabel{_status, Font::system(statusFontSize)}, FlexibleSpace{}};
  if (_saveControl.allowSaveButton()) {
    items.emplace_back(
        BarButton{BarButton::SystemItem::Save, [&control = _saveControl] { control.showSaveView(); }});
  }
  _pane->setToolbarItems(std::move(items), Animation::Animated);
}

std::size_t VarnelPaneController::tableView_numberOfRowsInSection(TableView&, std::size_t) {
  const auto* children = _nodes ? _nodes->childNodes() : nullptr;
  return children ? children->size() : 0;
}

std::unique_ptr<TableCell> VarnelPaneController::tableView_cellForRowAtIndexPath(TableView& table,
                                                                                 const IndexPath& path) {
  const Node child = childAt(path);
  // This class made every cell of the table.
  std::unique_ptr<VarnelCell> reused(
      static_cast<VarnelCell*>(table.dequeueReusableCell(cellIdentifier).release()));
  return child->childNodes() ? innerNodeCell(table, std::move(reused), *child)
                             : leafCell(table, std::move(reused), *child);
}

std::unique_ptr<VarnelCell> VarnelPaneController::innerNodeCell(TableView& table,
                                                                std::unique_ptr<VarnelCell> reused,
                                                                const VarnelModelNode& child) const {
  auto cell = reused ? std::move(reused)
                     : VarnelCell::initWithStyleKey_reuseIdentifier(table, _userInterface.textMetrics(),
                                                                    CellStyle::NameAndDetail, cellIdentifier);
  cell->key().setText(child.displayName());
  cell->cellView().setAccessory(CellAccessory::DisclosureIndicator);
  if (cell->value()) cell->value()->setText("");
  showFacts(*cell, child);
  cell->setLayoutKey();
  return cell;
}

std::unique_ptr<VarnelCell> VarnelPaneController::leafCell(TableView& table,
                                                           std::unique_ptr<VarnelCell> reused,
                                                           const VarnelModelNode& child) const {
  auto cell = reused ? std::move(reused)
                     : VarnelCell::initWithStyle_reuseIdentifier(table, _userInterface.textMetrics(),
                                                                 CellStyle::NameAndDetail, cellIdentifier);
  cell->key().setText(child.displayName());
  cell->cellView().setAccessory(CellAccessory::None);
  if (cell->value()) cell->value()->setText(*child.value());
  showFacts(*cell, child);
  cell->setLayout();
  return cell;
}

void VarnelPaneController::showFacts(TableCell& cell, const VarnelModelNode& child) const {
  if (_facts) cell.cellView().setFacts(_facts->of(rowOf(child)));
}

void VarnelPaneController::tableView_showFactsInCell(TableView&, TableCell& cell, const IndexPath& path) {
  showFacts(cell, *childAt(path));
}

std::string VarnelPaneController::tableView_explanationOfRow(TableView&, const IndexPath& path) {
  return _facts ? _facts->explanation(rowOf(*childAt(path))) : std::string();
}

void VarnelPaneController::tableView_didSelectRowAtIndexPath(TableView& table,
                                                             const std::optional<IndexPath>& path) {
  if (!path) return;
  const Node child = childAt(*path);
  if (!child->childNodes()) {
    table.deselectRow(*path, Animation::None);
    return;
  }
  const auto next = std::make_shared<VarnelPaneController>(_userInterface, _saveControl, child,
                                                           childPath(_keyPath, child->displayName()), _facts);
  next->_names = _names;
  next->_names.push_back(child->displayName());
  next->setStatus_isLoading(_status, _isLoading);
  if (navigationController()) navigationController()->push(next, Animation::Animated);
}

std::optional<IndexPath> VarnelPaneController::rowNamed(std::string_view name) const {
  const auto* children = _nodes ? _nodes->childNodes() : nullptr;
  if (!children) return std::nullopt;
  const auto found =
      std::ranges::find_if(*children, [name](const Node& child) { return child->displayName() == name; });
  if (found == children->end()) return std::nullopt;
  return IndexPath{0, static_cast<std::size_t>(found - children->begin())};
}

void VarnelPaneController::selectRow(std::string_view name) {
  if (const auto row = rowNamed(name)) _pane->table().selectRow(*row);
}

void VarnelPaneController::openRow(std::string_view name) {
  const auto row = rowNamed(name);
  if (!row) return;
  _pane->table().selectRow(*row);
  tableView_didSelectRowAtIndexPath(_pane->table(), row);
}

VarnelPaneController::Node VarnelPaneController::childAt(const IndexPath& path) const {
  return _nodes->childNodes()->at(path.row);
}

std::string_view VarnelPaneController::title() const {
  return _nodes ? std::string_view(_nodes->displayName()) : titleWithoutNode;
}

void VarnelPaneController::showTitle() { _pane->setTitle(title()); }

}  // namespace varnel
