#include "widgets/SearchPage.h"

#include <QCoreApplication>
#include <QKeyEvent>
#include <QPainter>
#include <QScrollBar>
#include <QStringList>
#include <QStyledItemDelegate>
#include <QVBoxLayout>
#include <algorithm>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int rowHeight = 50;
constexpr int fieldHeight = 44;
constexpr double fieldTextSize = 16;
constexpr double nameSize = 15;
constexpr double sectionsSize = 12;
constexpr double inset = 10;
constexpr double gapBeforeValue = 16;
constexpr double frameStroke = 2;

// The name with the value beside it, and the sections in a second line.
class SearchResultDelegate final : public QStyledItemDelegate {
 public:
  QSize sizeHint(const QStyleOptionViewItem&, const QModelIndex&) const override { return {0, rowHeight}; }

  void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override {
    const QPalette& palette = option.palette;
    const bool isCurrent = option.state.testFlag(QStyle::State_Selected);
    const QColor ground = isCurrent ? selectionColor(palette) : palette.color(QPalette::Base);
    const QRectF row(option.rect);
    painter->save();
    painter->setClipRect(row);
    painter->fillRect(row, ground);
    const QRectF room = row.adjusted(inset, 5, -inset, -5);
    const QString sections = index.data(SearchResults::SectionsRole).toString();
    // A row of the root stands in no section.
    const QRectF upper = sections.isEmpty() ? room : QRectF(room.topLeft(), QSizeF(room.width(), 22));
    const QRectF lower(room.left(), room.bottom() - 18, room.width(), 18);
    painter->setPen(palette.color(QPalette::Text));
    const double left = paintValue(*painter, upper, index.data(SearchResults::ValueRole).toString());
    paintText(*painter, qtFont(Font::boldSystem(nameSize)),
              QRectF(upper.topLeft(), QPointF(left, upper.bottom())), index.data().toString(), Qt::ElideRight,
              Qt::AlignLeft);
    painter->setPen(quietTextColor(palette));
    paintText(*painter, qtFont(Font::system(sectionsSize)), lower, sections, Qt::ElideLeft, Qt::AlignLeft);
    const double thickness = 1 / painter->device()->devicePixelRatioF();
    painter->fillRect(QRectF(row.left() + inset, row.bottom() - thickness, row.width() - inset, thickness),
                      separatorColor(palette));
    if (isCurrent) paintFrame(*painter, row, accentColor(palette, palette.color(QPalette::Base)));
    painter->restore();
  }

 private:
  // The value takes at most half of the row. Returns where the room for the name ends.
  static double paintValue(QPainter& painter, const QRectF& room, const QString& value) {
    if (value.isEmpty()) return room.right();
    const QFont font = qtFont(Font::system(nameSize));
    const double width = std::min(QFontMetricsF(font).horizontalAdvance(value) + 1, room.width() / 2);
    paintText(painter, font, QRectF(room.right() - width, room.top(), width, room.height()), value,
              Qt::ElideRight, Qt::AlignRight);
    return room.right() - width - gapBeforeValue;
  }

  static void paintText(QPainter& painter, const QFont& font, const QRectF& room, const QString& text,
                        Qt::TextElideMode elided, Qt::Alignment side) {
    painter.setFont(font);
    painter.drawText(room, static_cast<int>(side) | Qt::AlignAbsolute | Qt::AlignVCenter | Qt::TextSingleLine,
                     QFontMetricsF(font).elidedText(text, elided, room.width()));
  }

  static void paintFrame(QPainter& painter, const QRectF& row, const QColor& color) {
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(color, frameStroke));
    painter.drawRoundedRect(row.adjusted(2, 2, -2, -2), 4, 4);
  }
};

}  // namespace

// ---- The model ----

void SearchResults::show(std::vector<SearchResult> rows) {
  if (!haveSamePaths(rows)) {
    beginResetModel();
    _rows = std::move(rows);
    endResetModel();
    return;
  }
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (rows[i].value == _rows[i].value) continue;
    _rows[i].value = std::move(rows[i].value);
    const QModelIndex changed = index(static_cast<int>(i));
    Q_EMIT dataChanged(changed, changed);
  }
}

bool SearchResults::haveSamePaths(const std::vector<SearchResult>& rows) const {
  return std::ranges::equal(rows, _rows, {}, &SearchResult::path, &SearchResult::path);
}

QModelIndex SearchResults::indexOf(const std::vector<std::string>& path) const {
  const auto found = std::ranges::find(_rows, path, &SearchResult::path);
  return found == _rows.end() ? QModelIndex() : index(static_cast<int>(found - _rows.begin()));
}

int SearchResults::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(_rows.size());
}

QVariant SearchResults::data(const QModelIndex& index, int role) const {
  const SearchResult& found = row(index);
  const QString name = found.path.empty() ? QString() : singleLine(found.path.back());
  QStringList names;
  for (std::size_t i = 0; i + 1 < found.path.size(); ++i) names.append(singleLine(found.path[i]));
  const QString value = singleLine(found.value);
  const QString whole = value.isEmpty() ? name : name + QStringLiteral(": ") + value;
  switch (role) {
    case Qt::DisplayRole:
      return name;
    case ValueRole:
      return value;
    case SectionsRole:
      return names.join(QStringLiteral(" › "));
    case Qt::AccessibleTextRole:
      return names.isEmpty() ? whole : whole + QStringLiteral(", in ") + names.join(QStringLiteral(", "));
    case Qt::ToolTipRole:
      return plainTooltip(names.isEmpty() ? whole
                                          : names.join(QStringLiteral(" › ")) + QChar::LineFeed + whole);
    default:
      return {};
  }
}

// ---- The list ----

SearchResultsView::SearchResultsView(const std::function<void(const QModelIndex&)>& chosen)
    : _touch(
          *this, [](const QPoint&) { return nullptr; },
          [this, chosen](const QPoint& position) { chosen(indexAt(position)); }) {
  connect(this, &QListView::clicked, this, chosen);
  setFrameShape(QFrame::NoFrame);
  setUniformItemSizes(true);
  setItemDelegate(new SearchResultDelegate);
  itemDelegate()->setParent(this);
  setVerticalScrollMode(ScrollPerPixel);
  setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  setEditTriggers(NoEditTriggers);
  setAccessibleName(QStringLiteral("Rows found"));
}

bool SearchResultsView::viewportEvent(QEvent* event) {
  return _touch.take(*event) || QListView::viewportEvent(event);
}

// ---- The page ----

SearchPage::SearchPage(Search search, GoTo goTo)
    : _search(std::move(search)),
      _goTo(std::move(goTo)),
      _view([this](const QModelIndex& index) { this->goTo(index); }) {
  auto* const column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(0);
  auto* const top = new QVBoxLayout;
  top->setContentsMargins(10, 10, 10, 6);
  top->addWidget(&_words);
  top->addWidget(&_count);
  column->addLayout(top);
  column->addWidget(&_view, 1);
  _words.setPlaceholderText(QStringLiteral("Name or value"));
  _words.setAccessibleName(QStringLiteral("Words to find"));
  _words.setFont(qtFont(Font::system(fieldTextSize)));
  _words.setFixedHeight(fieldHeight);
  _words.setTextMargins(6, 0, 6, 0);
  _words.setClearButtonEnabled(true);
  _words.installEventFilter(this);
  _count.setFont(qtFont(Font::system(sectionsSize)));
  _count.setTextFormat(Qt::PlainText);
  _view.setModel(&_rows);
  _view.installEventFilter(this);
  setFocusProxy(&_words);
  connect(&_words, &QLineEdit::textChanged, this, [this] { searchAnew(); });
  searchAnew();
}

void SearchPage::searchAnew() {
  _rows.show(_search(utf8(_words.text())));
  _view.setCurrentIndex(_rows.index(0));
  _view.scrollToTop();
  showCount();
}

void SearchPage::searchAgain() {
  const QModelIndex former = _view.currentIndex();
  const auto formerRow = currentRow();
  const int formerTop = former.isValid() ? _view.visualRect(former).top() : 0;
  _rows.show(_search(utf8(_words.text())));
  showCount();
  if (former.isValid() && _view.currentIndex() == former && currentRow()->path == formerRow->path) return;
  QModelIndex next = formerRow ? _rows.indexOf(formerRow->path) : QModelIndex();
  if (!next.isValid())
    next = _rows.index(std::min(former.isValid() ? former.row() : 0, _rows.rowCount() - 1));
  if (!next.isValid()) return;
  _view.setCurrentIndex(next);
  QScrollBar& bar = *_view.verticalScrollBar();
  bar.setValue(bar.value() + _view.visualRect(next).top() - formerTop);
}

std::optional<SearchResult> SearchPage::currentRow() const {
  const QModelIndex current = _view.currentIndex();
  return current.isValid() ? std::optional(_rows.row(current)) : std::nullopt;
}

void SearchPage::startOver() {
  _words.setFocus(Qt::ShortcutFocusReason);
  _words.selectAll();
}

void SearchPage::showCount() {
  const int count = _rows.rowCount();
  if (count == 0) return _count.setText(QStringLiteral("No row has all of these words"));
  _count.setText(count == 1 ? QStringLiteral("1 row") : QString::number(count) + QStringLiteral(" rows"));
}

// The page may be gone when this returns.
void SearchPage::goTo(const QModelIndex& index) {
  if (!index.isValid()) return;
  const SearchResult row = _rows.row(index);
  _goTo(row);
}

bool SearchPage::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() != QEvent::KeyPress) return QWidget::eventFilter(watched, event);
  return takeKey(watched, static_cast<QKeyEvent&>(*event)) || QWidget::eventFilter(watched, event);
}

// While the user types, the list takes the keys that a line of text has no use for, and the other way round.
bool SearchPage::takeKey(const QObject* watched, QKeyEvent& event) {
  switch (event.key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
      goTo(_view.currentIndex());
      return true;
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
      if (watched == &_view) return false;
      QCoreApplication::sendEvent(&_view, &event);
      return true;
    default:
      break;
  }
  const bool isText = !event.text().isEmpty() && event.text().at(0).isPrint();
  if (watched == &_words || (!isText && event.key() != Qt::Key_Backspace)) return false;
  _words.setFocus(Qt::OtherFocusReason);
  QCoreApplication::sendEvent(&_words, &event);
  return true;
}

}  // namespace varnel
