#pragma once

#include <QTableView>
#include <functional>
#include <optional>
#include <set>
#include <string>

#include "widgets/RecordTableModel.h"
#include "widgets/TouchScrolling.h"

namespace varnel {

/// The records of a list as a table with columns, in place of its rows. It scrolls in both directions. A
/// click on a column's title sorts, and so does S for the column of the current cell.
///
/// Choosing a record is as with rows: a click, a tap, Return, Enter, or Space. Left in the first column and
/// Right in the last one are for the widget around.
class RecordTableWidget final : public QTableView {
 public:
  /// Called with the place of the chosen record in its list.
  using Chosen = std::function<void(std::size_t place)>;

  explicit RecordTableWidget(Chosen chosen, QWidget* parent = nullptr);
  ~RecordTableWidget() override;

  /// Shows these records. The current one stays current as long as the list has one of its identity.
  void showRecords(RecordList list);
  void markOpen(const QString& name) { _model.markOpen(name); }
  /// A paler mark of the current record: commands are for a row elsewhere.
  void setPale(bool isPale);
  /// Makes the record at this place of the list the current one.
  void makeCurrent(std::size_t place);
  /// The place of the current record in its list.
  std::optional<std::size_t> currentPlace() const { return _model.placeOf(currentIndex().row()); }
  /// The name of the current record's row; empty when there is none.
  QString currentName() const;
  /// The name of the current column; empty for the first one.
  QString currentColumn() const { return _model.columnName(currentIndex().column()); }

 protected:
  void initViewItemOption(QStyleOptionViewItem* option) const override;
  bool viewportEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  void choose(const QModelIndex& index);
  void sortByCurrentColumn();
  void widenColumns();
  void keepWidthOf(int column);
  void showTooltip(const QHelpEvent& event);
  bool leavesTable(const QKeyEvent& event) const;

  RecordTableModel _model;
  Chosen _chosen;
  std::set<int> _columnsOfUser;  // those to which the user has given a width
  bool _isWidening = false;
  bool _isPale = false;
  TouchScrolling _touch;
};

}  // namespace varnel
