#pragma once

#include <QAbstractScrollArea>
#include <map>
#include <memory>
#include <optional>

#include "platform/ui/CellPool.h"
#include "platform/ui/TableView.h"
#include "widgets/RowIndex.h"
#include "widgets/RowWidget.h"
#include "widgets/TouchScrolling.h"

namespace varnel {

/// A table that has widgets for its visible rows only.
///
/// One row is the current one: arrow keys go on from it. It is selected as well until it is deselected.
/// Choosing a row (click, tap, Return, Enter, Space, Right) makes it the current one and tells the delegate.
class TableWidget final : public QAbstractScrollArea, public TableView {
 public:
  explicit TableWidget(QWidget* parent = nullptr);
  ~TableWidget() override;

  void setDelegate(TableViewDelegate* delegate) override;
  void reloadData() override;
  std::unique_ptr<TableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
  std::unique_ptr<CellView> makeCellView(CellStyle style) override;
  void deselectRow(const IndexPath& path, Animation animation) override;
  void sizeToFit() override;

  /// Keeps what it shows, but calls nobody from now on.
  void fallSilent() { _delegate = nullptr; }

  /// The rows on the screen, top first.
  std::vector<RowWidget*> visibleRows() const;
  void chooseRow(std::size_t row);

  QSize sizeHint() const override;

 protected:
  void showEvent(QShowEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void scrollContentsBy(int dx, int dy) override;
  bool viewportEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void focusInEvent(QFocusEvent* event) override;
  void focusOutEvent(QFocusEvent* event) override;

 private:
  void load();
  void measureRows();
  void updateScrollRange();
  void updateVisibleRows();
  void showRow(std::size_t row);
  void placeRow(RowWidget& row) const;
  void putAwayRowsOutside(std::size_t begin, std::size_t end);
  void putAwayAllRows();
  void dropUnusedCells();

  RowWidget* visibleRow(std::size_t row) const;
  std::optional<std::size_t> rowAt(const QPoint& position) const;
  void scrollToRow(std::size_t row);
  std::size_t firstWhollyVisibleRow() const;
  std::size_t rowsOnScreen() const;
  void makeCurrent(std::size_t row);
  void moveTo(std::optional<std::size_t> row);
  std::optional<std::size_t> rowThatKeyLeadsTo(int key) const;
  bool scrollCurrentRowSideways(int key);
  void chooseCurrentRow();
  void showEmphasis();

  TableViewDelegate* _delegate = nullptr;
  bool _isLoaded = false;
  bool _sizesToFit = false;
  RowIndex _rows;
  std::map<std::size_t, std::unique_ptr<TableCell>> _visible;  // by row
  CellPool _reloaded;  // during a reload, the cells that were visible before it
  CellPool _pool;
  std::optional<std::size_t> _current;
  bool _currentIsSelected = false;
  bool _keysAreUsed = false;  // rather than mouse or finger: the current row gets a frame
  std::optional<std::size_t> _pressed;
  TouchScrolling _touch;
};

}  // namespace varnel
