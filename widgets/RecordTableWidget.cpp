#include "widgets/RecordTableWidget.h"

#include <QContextMenuEvent>
#include <QHeaderView>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QToolTip>
#include <algorithm>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int heightOfRows = 44;  // large enough for a finger
constexpr int heightOfHeader = 36;
constexpr int narrowestColumn = 40;
constexpr int widestColumn = 320;
constexpr int paddingOfCells = 12;

}  // namespace

RecordTableWidget::RecordTableWidget(Chosen chosen, QWidget* parent)
    : QTableView(parent),
      _chosen(std::move(chosen)),
      _touch(*this, nullptr, [this](const QPoint& position) { choose(indexAt(position)); }) {
  setModel(&_model);
  setFrameShape(QFrame::NoFrame);
  setSelectionBehavior(SelectRows);
  setSelectionMode(SingleSelection);
  setEditTriggers(NoEditTriggers);
  setTabKeyNavigation(false);
  setHorizontalScrollMode(ScrollPerPixel);
  setVerticalScrollMode(ScrollPerPixel);
  setWordWrap(false);
  setShowGrid(false);
  setAlternatingRowColors(true);
  verticalHeader()->hide();
  verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  verticalHeader()->setDefaultSectionSize(heightOfRows);
  horizontalHeader()->setDefaultSectionSize(narrowestColumn);
  horizontalHeader()->setMinimumHeight(heightOfHeader);
  horizontalHeader()->setHighlightSections(false);
  horizontalHeader()->setSortIndicatorClearable(true);
  horizontalHeader()->setSortIndicator(-1, Qt::AscendingOrder);
  setSortingEnabled(true);
  connect(horizontalHeader(), &QHeaderView::sectionResized, this,
          [this](int column) { keepWidthOf(column); });
  connect(this, &QTableView::clicked, this, [this](const QModelIndex& index) { choose(index); });
}

RecordTableWidget::~RecordTableWidget() { setModel(nullptr); }

void RecordTableWidget::showRecords(RecordList list) {
  const auto former = _model.identityOf(currentIndex().row());
  const int column = currentIndex().column();
  _model.show(std::move(list));
  if (!currentIndex().isValid() && former) {
    if (const auto row = _model.rowOfIdentity(*former))
      setCurrentIndex(_model.index(*row, std::max(0, column)));
  }
  widenColumns();
}

void RecordTableWidget::keepWidthOf(int column) {
  if (!_isWidening) _columnsOfUser.insert(column);
}

// Never makes a column narrower: it would jump with every value.
void RecordTableWidget::widenColumns() {
  QHeaderView& header = *horizontalHeader();
  _isWidening = true;
  for (int column = 0; column < _model.columnCount(); ++column) {
    const int wanted = std::max(sizeHintForColumn(column), header.sectionSizeHint(column)) + paddingOfCells;
    const int width = std::min(wanted, widestColumn);
    if (width > header.sectionSize(column) && !_columnsOfUser.contains(column))
      header.resizeSection(column, width);
  }
  _isWidening = false;
}

void RecordTableWidget::makeCurrent(std::size_t place) {
  const auto row = _model.rowOfPlace(place);
  if (row) setCurrentIndex(_model.index(*row, std::max(0, currentIndex().column())));
}

QString RecordTableWidget::currentName() const {
  return _model.index(currentIndex().row(), 0).data().toString();
}

void RecordTableWidget::choose(const QModelIndex& index) {
  const auto place = _model.placeOf(index.row());
  if (!place) return;
  setCurrentIndex(index);
  _chosen(*place);
}

void RecordTableWidget::sortByCurrentColumn() {
  const QHeaderView& header = *horizontalHeader();
  const int column = std::max(0, currentIndex().column());
  const bool isSorted = header.sortIndicatorSection() == column;
  const bool wasAscending = header.sortIndicatorOrder() == Qt::AscendingOrder;
  sortByColumn(column, isSorted && wasAscending ? Qt::DescendingOrder : Qt::AscendingOrder);
  scrollTo(currentIndex());
}

bool RecordTableWidget::leavesTable(const QKeyEvent& event) const {
  const int column = currentIndex().column();
  if (event.key() == Qt::Key_Left) return column <= 0;
  return event.key() == Qt::Key_Right && column == _model.columnCount() - 1;
}

void RecordTableWidget::keyPressEvent(QKeyEvent* event) {
  // The widget around the table handles keys with modifiers, and those that go back.
  if ((event->modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier) return event->ignore();
  if (leavesTable(*event)) return event->setAccepted(event->isAutoRepeat());
  switch (event->key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Space:
      return choose(currentIndex());
    case Qt::Key_S:
      return sortByCurrentColumn();
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_Left:
    case Qt::Key_Right:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
      return QTableView::keyPressEvent(event);
    case Qt::Key_Home:
    case Qt::Key_End: {
      const int row = event->key() == Qt::Key_Home ? 0 : _model.rowCount() - 1;
      return setCurrentIndex(_model.index(row, std::max(0, currentIndex().column())));
    }
    default:
      event->ignore();
  }
}

// What is around the table opens the menu, for the current cell.
void RecordTableWidget::contextMenuEvent(QContextMenuEvent* event) {
  const bool isAtPlace = event->reason() != QContextMenuEvent::Keyboard;
  if (const QModelIndex index = isAtPlace ? indexAt(event->pos()) : QModelIndex(); index.isValid()) {
    setFocus(Qt::OtherFocusReason);
    setCurrentIndex(index);
  }
  event->ignore();
}

void RecordTableWidget::setPale(bool isPale) {
  if (isPale == _isPale) return;
  _isPale = isPale;
  viewport()->update();
}

void RecordTableWidget::initViewItemOption(QStyleOptionViewItem* option) const {
  QTableView::initViewItemOption(option);
  // As in rows: the text on the ground of the selection keeps its color.
  option->palette.setColor(QPalette::Highlight,
                           _isPale ? paleSelectionColor(palette()) : selectionColor(palette()));
  option->palette.setColor(QPalette::HighlightedText, palette().color(QPalette::Text));
}

bool RecordTableWidget::viewportEvent(QEvent* event) {
  if (event->type() == QEvent::ToolTip) {
    showTooltip(static_cast<const QHelpEvent&>(*event));
    return true;
  }
  return _touch.take(*event) || QTableView::viewportEvent(event);
}

// Of a text that is cut.
void RecordTableWidget::showTooltip(const QHelpEvent& event) {
  const QModelIndex index = indexAt(event.pos());
  const QRect cell = visualRect(index);
  if (!index.isValid() || sizeHintForIndex(index).width() <= cell.width()) return QToolTip::hideText();
  QToolTip::showText(event.globalPos(), plainTooltip(index.data().toString()), viewport(), cell);
}

}  // namespace varnel
