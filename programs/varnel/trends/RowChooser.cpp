#include "programs/varnel/trends/RowChooser.h"

#include <QApplication>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QPushButton>
#include <QRegularExpression>
#include <QScroller>
#include <QTouchEvent>
#include <QVBoxLayout>
#include <algorithm>
#include <map>
#include <utility>

namespace varnel {

namespace {

constexpr int keyRole = Qt::UserRole + 1;
constexpr int rowHeight = 32;  // for fingers

// Matches texts with all of these words.
QRegularExpression patternOf(const QString& words) {
  QString pattern;
  for (const QString& word : words.split(QLatin1Char(' '), Qt::SkipEmptyParts))
    pattern += QStringLiteral("(?=.*") + QRegularExpression::escape(word) + QLatin1Char(')');
  return QRegularExpression(pattern, QRegularExpression::CaseInsensitiveOption);
}

}  // namespace

RowChooser::RowChooser(Wishes wishes, QWidget* parent)
    : QWidget(parent),
      _wishes(std::move(wishes)),
      _words(new QLineEdit(this)),
      _tree(new QTreeView(this)),
      _nothing(new QLabel(this)) {
  _found.setSourceModel(&_rows);
  _found.setRecursiveFilteringEnabled(true);
  _words->setPlaceholderText(tr("Find a row"));
  _words->setAccessibleName(tr("Find a row"));
  _words->setClearButtonEnabled(true);
  _words->installEventFilter(this);
  _tree->setModel(&_found);
  _tree->installEventFilter(this);
  _tree->setHeaderHidden(true);
  _tree->setUniformRowHeights(true);
  _tree->setEditTriggers(QAbstractItemView::NoEditTriggers);
  // The end of a name tells the records of a list apart.
  _tree->setTextElideMode(Qt::ElideMiddle);
  _tree->setAccessibleName(tr("Rows with numbers, by unit"));
  _tree->viewport()->setAttribute(Qt::WA_AcceptTouchEvents);
  _tree->viewport()->installEventFilter(this);
  auto* const done = new QPushButton(tr("Show"), this);
  auto* const top = new QHBoxLayout;
  top->addWidget(_words);
  top->addWidget(done);
  auto* const column = new QVBoxLayout(this);
  column->setContentsMargins(8, 4, 8, 8);
  column->addLayout(top);
  column->addWidget(_nothing);
  column->addWidget(_tree);
  setFocusProxy(_words);
  connect(done, &QPushButton::clicked, this, [this] { _wishes.done(); });
  connect(_words, &QLineEdit::textChanged, this, [this](const QString& words) {
    _found.setFilterRegularExpression(patternOf(words));
    showFound();
  });
  connect(_tree, &QTreeView::clicked, this, &RowChooser::turn);
}

void RowChooser::show(const std::vector<TrendRow>& rows, const std::vector<std::string>& chosen) {
  _rows.clear();
  const auto isChosen = [&](const TrendRow& row) {
    return std::ranges::find(chosen, row.key) != chosen.end();
  };
  QStandardItem* picture = nullptr;
  if (std::ranges::any_of(rows, isChosen)) picture = addGroup(tr("In the picture"));
  std::map<std::string, QStandardItem*> units;
  for (const TrendRow& row : rows) {
    if (isChosen(row)) {
      addRow(*picture, row, Qt::Checked);
      continue;
    }
    QStandardItem*& unit = units[row.unit];
    if (!unit) unit = addGroup(row.unit.empty() ? tr("(no unit)") : QString::fromStdString(row.unit));
    addRow(*unit, row, Qt::Unchecked);
  }
  showFound();
  _tree->scrollToTop();
}

QStandardItem* RowChooser::addGroup(const QString& title) {
  auto* const group = new QStandardItem(title);
  group->setSelectable(false);
  group->setSizeHint(QSize(0, rowHeight));
  _rows.appendRow(group);
  return group;
}

void RowChooser::addRow(QStandardItem& group, const TrendRow& row, Qt::CheckState state) {
  QString text = QString::fromStdString(row.name);
  if (!row.place.empty()) text += QStringLiteral(" — ") + QString::fromStdString(row.place);
  auto* const item = new QStandardItem(text);
  item->setToolTip(text.toHtmlEscaped());
  // The whole row turns the check mark, which is larger than the mark under a finger.
  item->setCheckState(state);
  item->setData(QString::fromStdString(row.key), keyRole);
  item->setSizeHint(QSize(0, rowHeight));
  group.appendRow(item);
}

void RowChooser::showFound() {
  _tree->expandAll();
  _nothing->setVisible(_found.rowCount() == 0);
  _nothing->setText(_rows.rowCount() == 0 ? tr("There are no numbers yet.") : tr("No row has these words."));
}

void RowChooser::turn(const QModelIndex& index) {
  QStandardItem* const item = _rows.itemFromIndex(_found.mapToSource(index));
  if (!item || !item->data(keyRole).isValid()) return;
  const bool isWanted = item->checkState() != Qt::Checked;
  if (_wishes.choose(item->data(keyRole).toString().toStdString(), isWanted))
    item->setCheckState(isWanted ? Qt::Checked : Qt::Unchecked);
}

void RowChooser::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Escape || event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter)
    return _wishes.done();
  QWidget::keyPressEvent(event);
}

// A finger moves the list, and a tap chooses a row. The scroller gets the touches directly, since the toolkit
// would set up a gesture recognizer for each list and never free it.
void RowChooser::takeTouch(QTouchEvent& event) {
  event.accept();  // so that the toolkit makes no mouse event from it
  QScroller& scroller = *QScroller::scroller(_tree->viewport());
  if (event.type() == QEvent::TouchCancel || event.points().isEmpty()) {
    _tapBegan.reset();
    scroller.stop();
    return;
  }
  const QPointF position = event.points().front().position();
  const auto time_ms = static_cast<qint64>(event.timestamp());
  if (event.type() == QEvent::TouchBegin) {
    const bool stopsMovement = scroller.state() == QScroller::Scrolling;
    _tapBegan = stopsMovement ? std::nullopt : std::optional(position);
    scroller.handleInput(QScroller::InputPress, position, time_ms);
    return;
  }
  if (_tapBegan && (position - *_tapBegan).manhattanLength() >= QApplication::startDragDistance())
    _tapBegan.reset();
  const bool isEnd = event.type() == QEvent::TouchEnd;
  scroller.handleInput(isEnd ? QScroller::InputRelease : QScroller::InputMove, position, time_ms);
  if (!isEnd || !std::exchange(_tapBegan, std::nullopt)) return;
  const QModelIndex index = _tree->indexAt(position.toPoint());
  if (index.parent().isValid())
    turn(index);
  else
    _tree->setExpanded(index, !_tree->isExpanded(index));
}

// Down goes from the words to the rows, where Space and Return choose.
bool RowChooser::eventFilter(QObject* watched, QEvent* event) {
  const bool isTouch = event->type() == QEvent::TouchBegin || event->type() == QEvent::TouchUpdate ||
                       event->type() == QEvent::TouchEnd || event->type() == QEvent::TouchCancel;
  if (isTouch && watched == _tree->viewport()) {
    takeTouch(static_cast<QTouchEvent&>(*event));
    return true;
  }
  if (event->type() != QEvent::KeyPress) return QWidget::eventFilter(watched, event);
  const int key = static_cast<QKeyEvent*>(event)->key();
  if (watched == _words && key == Qt::Key_Down) {
    _tree->setFocus(Qt::TabFocusReason);
    const QModelIndex unit = _found.index(0, 0);
    if (!_tree->currentIndex().isValid()) _tree->setCurrentIndex(_found.index(0, 0, unit));
    return true;
  }
  const bool isTurning = key == Qt::Key_Space || key == Qt::Key_Return || key == Qt::Key_Enter;
  if (watched == _tree && isTurning) {
    turn(_tree->currentIndex());
    return true;
  }
  return QWidget::eventFilter(watched, event);
}

}  // namespace varnel
