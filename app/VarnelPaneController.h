#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "app/RowFacts.h"
#include "app/SaveControl.h"
#include "app/TreeSearch.h"
#include "app/VarnelCell.h"
#include "model/VarnelModelNode.h"
#include "platform/ui/UserInterface.h"

namespace varnel {

/// A pane that lists the children of one node of the display tree. The row of an inner node leads to another
/// pane; the row of a leaf shows its value.
class VarnelPaneController final : public PaneController, public TableViewDelegate {
 public:
  using Node = std::shared_ptr<const VarnelModelNode>;

  /// A pane for the node with this path. The node is null while there is no tree. User interface, save
  /// control, and facts must outlive the pane. Without facts it shows texts only.
  VarnelPaneController(UserInterface& userInterface, SaveControl& saveControl, Node node, std::string path,
                       RowFacts* facts = nullptr);

  /// The node's path in the tree, "/" for the root.
  const std::string& path() const { return _keyPath; }
  /// The text of the title bar: the name of the node, or "Varnel" without a node.
  std::string_view title() const;
  /// Shows the status, or none if it is an empty text, and whether the viewer waits for the link.
  void setStatus_isLoading(std::optional<std::string_view> status, bool isLoading);
  /// Shows another node, or no node.
  void reloadWithNode(Node node);
  /// Shows what stands beside the texts of the visible rows anew.
  void showFactsAgain() { _pane->table().showFactsAgain(); }
  /// Selects the row with this name, if there is one.
  void selectRow(std::string_view name);
  /// Selects the row with this name, if there is one, and opens its pane, if it leads to one.
  void openRow(std::string_view name);
  /// Builds the toolbar again. Its label gets its size only once, so every change of the status needs a new
  /// toolbar.
  void createToolbarItems();

  TablePane& pane() override { return *_pane; }
  void viewWillAppear(Animation animation) override;
  void viewWillDisappear(Animation animation) override;

  std::size_t tableView_numberOfRowsInSection(TableView& table, std::size_t section) override;
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override;
  void tableView_showFactsInCell(TableView& table, TableCell& cell, const IndexPath& path) override;
  std::string tableView_explanationOfRow(TableView& table, const IndexPath& path) override;
  void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) override;

 private:
  std::unique_ptr<VarnelCell> innerNodeCell(TableView& table, std::unique_ptr<VarnelCell> reused,
                                            const VarnelModelNode& child) const;
  std::unique_ptr<VarnelCell> leafCell(TableView& table, std::unique_ptr<VarnelCell> reused,
                                       const VarnelModelNode& child) const;
  void showFacts(TableCell& cell, const VarnelModelNode& child) const;
  RowFacts::Row rowOf(const VarnelModelNode& child) const { return {child, *_nodes, _names}; }
  std::optional<IndexPath> rowNamed(std::string_view name) const;
  Node childAt(const IndexPath& path) const;
  void showTitle();

  UserInterface& _userInterface;
  SaveControl& _saveControl;
  std::unique_ptr<TablePane> _pane;
  Node _nodes;
  std::string _keyPath;
  NamePath _names;  // of the path, without the root's
  RowFacts* const _facts;
  std::string _status;
  bool _isLoading = true;
};

}  // namespace varnel
