#pragma once

#include <QAbstractScrollArea>
#include <QHelpEvent>
#include <functional>
#include <map>
#include <memory>
#include <optional>

#include "platform/ui/CellPool.h"
#include "platform/ui/RowIndex.h"
#include "platform/ui/TableView.h"
#include "widgets/MousePress.h"
#include "widgets/RowWidget.h"
#include "widgets/TouchScrolling.h"

namespace varnel {

/// A table that has widgets only for its visible rows.
///
/// A reload gives each row its own cell back, as long as the rows stay the same: the same number, and the
/// same names of the visible ones. Otherwise it makes every cell again.
///
/// One row is the current row, from which the arrow keys go on. It is also selected until it is deselected.
/// Choosing a row (by a click, a tap, Return, Enter, Space, or Right) makes it the current row and tells the
/// delegate.
///
/// Rows are never wider than `RowWidget::widest`. In a wider table they stand in its middle.
class TableWidget final : public QAbstractScrollArea, public TableView {
 public:
  explicit TableWidget(QWidget* parent = nullptr);
  ~TableWidget() override;

  void setDelegate(TableViewDelegate* delegate) override;
  void reloadData() override;
  void showFactsAgain() override;
  std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
  std::unique_ptr<CellView> makeCellView(CellStyle style) override;
  void selectRow(const IndexPath& path) override { moveTo(_rows.rowOf(path)); }
  void deselectRow(const IndexPath& path, Animation animation) override;
  void sizeToFit() override;

  /// The window's action with this object name shows the course of the current row. A click on the small line
  /// of a row causes it. Without such an action, the line is a part of the row like any other.
  static constexpr const char* courseCommand = "courseOfRow";

  /// Keeps what it shows, but makes no more calls.
  void fallSilent();

  /// Passes each choice of the user on to the delegate.
  using Choice = std::function<void()>;
  /// Whoever shows the table makes the user's choices, by calling each one. Without it the table does.
  void setChoiceMaker(std::function<void(const Choice&)> maker) { _choiceMaker = std::move(maker); }
  /// The observer is called after each load of the rows.
  void setLoadObserver(std::function<void()> observer) { _loadObserver = std::move(observer); }
  /// The place of the current row among all rows.
  std::optional<std::size_t> currentPlace() const { return _current; }
  /// Marks the row with this name: its pane is open beside this one. Right then leaves this table for that
  /// pane, except on another row that leads to a pane. Null: no pane is open beside this one.
  void markOpenRow(const QString& name);
  /// Paler marks of the current row and the open one: commands are for a row elsewhere.
  void setPale(bool isPale);

  /// The rows on the screen, from top to bottom.
  std::vector<RowWidget*> visibleRows() const;
  /// The row from which the arrow keys go on; null when there is none on the screen.
  const RowWidget* currentRow() const { return _current ? visibleRow(*_current) : nullptr; }
  void chooseRow(std::size_t row);
  /// What the delegate says about this row of `visibleRows`; empty for nothing.
  QString explanationOf(const RowWidget& row);

  QSize sizeHint() const override;

 protected:
  void showEvent(QShowEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void scrollContentsBy(int dx, int dy) override;
  bool viewportEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;
  void focusInEvent(QFocusEvent* event) override;
  void focusOutEvent(QFocusEvent* event) override;

 private:
  void load();
  enum class Rows { Same, Changed };
  Rows measureRows();
  void updateScrollRange();
  void updateVisibleRows();
  void showRow(std::size_t row);
  void placeRow(RowWidget& row) const;
  void putAwayRowsOutside(std::size_t begin, std::size_t end);
  void putAwayAllRows();
  void forgetCells();
  void settleNewCells(const std::map<QString, double>& sidewaysPositions);
  std::map<QString, double> sidewaysPositionsByName() const;
  bool haveOtherNames(const std::map<std::size_t, QString>& formerNames) const;
  std::map<std::size_t, QString> namesOfVisibleRows() const;

  RowWidget* visibleRow(std::size_t row) const;
  RowWidget::Emphasis emphasisOf(const RowWidget& row) const;
  int rowWidth() const;
  int leftOfRows() const;
  std::optional<std::size_t> rowAt(const QPoint& position) const;
  void scrollToRow(std::size_t row);
  std::size_t firstWhollyVisibleRow() const;
  std::size_t rowsOnScreen() const;
  void makeCurrent(std::size_t row);
  void takeClick(std::size_t row, const QPoint& position);
  QAction* courseActionAt(std::size_t row, const QPoint& position) const;
  void tellOfFocusOn(std::size_t row) const;
  void moveTo(std::optional<std::size_t> row);
  void turnPage(int key);
  std::optional<std::size_t> rowThatKeyLeadsTo(int key) const;
  void showTooltip(const QHelpEvent& event);
  bool scrollCurrentRowSideways(int key);
  bool rightLeavesTable() const;
  void chooseCurrentRow();
  void showEmphasis();

  TableViewDelegate* _delegate = nullptr;
  std::function<void(const Choice&)> _choiceMaker;
  std::function<void()> _loadObserver;
  QString _openRow;  // null while no pane is open beside this one
  bool _isLoaded = false;
  bool _sizesToFit = false;
  RowIndex _rows;
  std::map<std::size_t, std::unique_ptr<TableCell>> _visible;  // by row
  CellPool _reloaded;  // during a reload, the cells that were visible before it
  CellPool _pool;
  std::optional<std::size_t> _current;
  bool _currentIsSelected = false;
  bool _isPale = false;
  bool _keysAreUsed = false;  // keys were used last, not mouse or touch: the current row gets a frame
  std::optional<MousePress> _press;
  TouchScrolling _touch;
};

}  // namespace varnel
