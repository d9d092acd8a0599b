#include "programs/varnel/trends/TrendPageWidget.h"

#include <QAction>
#include <QBuffer>
#include <QClipboard>
#include <QFile>
#include <QFileDialog>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QKeyEvent>
#include <QMenu>
#include <QVBoxLayout>
#include <algorithm>
#include <set>

#include "app/PrintableText.h"
#include "programs/shared/FileDialogs.h"
#include "programs/varnel/trends/TrendPicture.h"

namespace varnel {

namespace {

constexpr int narrow = 480;  // points; below, some things are left out
constexpr int narrowest = 240;
constexpr int mostTableRows = 4;
constexpr int millisecondsBetweenLooks = 250;

struct FormatTexts {
  const char* suffix;
  const char* filter;
  const char* command;
};

const FormatTexts& textsOf(TrendPageWidget::Format format) {
  static constexpr FormatTexts texts[] = {
      {"png", QT_TR_NOOP("Pictures (*.png)"), QT_TR_NOOP("Picture (PNG)…")},
      {"svg", QT_TR_NOOP("Drawings (*.svg)"), QT_TR_NOOP("Drawing (SVG)…")},
      {"csv", QT_TR_NOOP("Tables (*.csv)"), QT_TR_NOOP("Table (CSV)…")},
  };
  return texts[static_cast<std::size_t>(format)];
}

std::string bytesOf(const QByteArray& bytes) { return bytes.toStdString(); }

}  // namespace

TrendPageWidget::TrendPageWidget(TrendSource& source)
    : _source(source),
      _buttons(new QHBoxLayout),
      _content(new QStackedLayout),
      _picture(new QWidget),
      _view(new TrendView(source, this)),
      _marks(new EventLegendWidget(this)),
      _tableView(new QTableView(this)),
      _chooser(
          new RowChooser({[this](const std::string& key, bool isWanted) { return choose(key, isWanted); },
                          [this] { showPicture(); }},
                         this)),
      _remark(new QLabel(this)),
      _progress(new QProgressBar(this)) {
  setAccessibleName(tr("Trend"));
  setFocusProxy(_view);
  setBackgroundRole(QPalette::Base);
  setAutoFillBackground(true);
  setMinimumWidth(narrowest);  // the layout would ask for the room of a wide page

  _buttons->setContentsMargins(8, 4, 8, 4);
  _buttons->setSpacing(2);
  addLength(tr("2 min"), std::chrono::minutes(2), tr("The last 2 minutes (1)"));
  addLength(tr("10 min"), std::chrono::minutes(10), tr("The last 10 minutes (2)"));
  addLength(tr("60 min"), std::chrono::minutes(60), tr("The last 60 minutes (3)"));
  _wholeButton = addButton(tr("All"), tr("Everything there is (4)"));
  _wholeButton->setCheckable(true);
  _lengths.addButton(_wholeButton);
  connect(_wholeButton, &QToolButton::clicked, this, [this] {
    _view->stretch().showWhole();
    refresh();
  });
  _lengths.setExclusive(false);
  _buttons->addStretch(1);
  _zoomOut = addButton(QStringLiteral("−"), tr("A longer time (-)"));
  _zoomIn = addButton(QStringLiteral("+"), tr("A shorter time (+)"));
  const auto zoomBy = [this](double factor) {
    _view->stretch().zoom(factor, _source.whole());
    refresh();
  };
  connect(_zoomIn, &QToolButton::clicked, this, [zoomBy] { zoomBy(0.5); });
  connect(_zoomOut, &QToolButton::clicked, this, [zoomBy] { zoomBy(2); });
  connect(addButton(tr("Rows…"), tr("Choose the rows of the picture (T)")), &QToolButton::clicked, this,
          [this] { chooseRows(); });
  makeSaveMenu(*addButton(tr("Save"), tr("Save or copy the picture or its numbers (S)")));

  _remark->setWordWrap(true);
  _remark->setTextFormat(Qt::PlainText);
  _remark->setMargin(4);
  _remark->setIndent(8);
  _progress->setRange(0, 1000);
  _progress->setTextVisible(false);
  _progress->setMaximumHeight(6);
  _progress->setAccessibleName(tr("How much of the file is read"));

  _tableView->setModel(&_table);
  _tableView->verticalHeader()->hide();
  _tableView->setShowGrid(false);
  _tableView->setFrameShape(QFrame::NoFrame);
  _tableView->setSelectionBehavior(QAbstractItemView::SelectRows);
  _tableView->setSelectionMode(QAbstractItemView::SingleSelection);
  _tableView->setEditTriggers(QAbstractItemView::NoEditTriggers);
  _tableView->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  _tableView->setTabKeyNavigation(false);
  _tableView->setAccessibleName(tr("Lowest value, mean, and highest value"));
  QHeaderView& header = *_tableView->horizontalHeader();
  header.setHighlightSections(false);
  header.setSectionResizeMode(QHeaderView::ResizeToContents);
  header.setSectionResizeMode(TrendTable::Name, QHeaderView::Stretch);
  auto* const remove = new QAction(tr("Remove from the picture"), _tableView);
  remove->setShortcuts({QKeySequence(Qt::Key_Delete), QKeySequence(Qt::Key_Backspace)});
  remove->setShortcutContext(Qt::WidgetShortcut);
  _tableView->addAction(remove);
  _tableView->setContextMenuPolicy(Qt::ActionsContextMenu);
  connect(remove, &QAction::triggered, this, [this] {
    const auto row = static_cast<std::size_t>(_tableView->currentIndex().row());
    if (row < _keys.size()) removeRow(std::string(_keys[row]));
  });

  auto* const pictureColumn = new QVBoxLayout(_picture);
  pictureColumn->setContentsMargins(0, 0, 0, 0);
  pictureColumn->setSpacing(0);
  pictureColumn->addWidget(_view, 1);
  pictureColumn->addWidget(_marks);
  pictureColumn->addWidget(_tableView);
  _content->addWidget(_picture);
  _content->addWidget(_chooser);
  auto* const column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(0);
  column->addLayout(_buttons);
  column->addWidget(_remark);
  column->addWidget(_progress);
  column->addLayout(_content, 1);

  // A history that has just begun is not shown in a corner of its picture.
  const auto whole = _source.whole();
  _view->stretch().showLast(whole.end - whole.begin > std::chrono::minutes(2) ? std::chrono::minutes(10)
                                                                              : std::chrono::minutes(2));
  if (_source.isComplete()) {
    _view->stretch().showWhole();
    // A few seconds fill the picture too.
    if (whole.end - whole.begin < TrendStretch::leastWhole) _view->stretch().show(whole);
  }
  _view->setObserver([this] { pictureHasChanged(); });
  for (QWidget* const widget : {static_cast<QWidget*>(_view), _view->viewport(),
                                static_cast<QWidget*>(_tableView), _tableView->viewport()})
    widget->installEventFilter(this);
  connect(&_reading, &QTimer::timeout, this, [this] { refresh(); });
  refresh();
}

QToolButton* TrendPageWidget::addButton(const QString& text, const QString& tooltip) {
  auto* const button = new QToolButton(this);
  button->setText(text);
  button->setToolTip(tooltip);
  button->setAccessibleDescription(tooltip);
  button->setAutoRaise(true);
  button->setFocusPolicy(Qt::TabFocus);
  button->installEventFilter(this);
  _buttons->addWidget(button);
  return button;
}

void TrendPageWidget::addLength(const QString& text, std::chrono::minutes length, const QString& tooltip) {
  QToolButton* const button = addButton(text, tooltip);
  button->setCheckable(true);
  _lengths.addButton(button, static_cast<int>(length.count()));
  connect(button, &QToolButton::clicked, this, [this, length] {
    _view->stretch().showLast(length);
    refresh();
  });
}

void TrendPageWidget::makeSaveMenu(QToolButton& button) {
  auto* const menu = new QMenu(&button);
  for (const Format format : {Format::Png, Format::Svg, Format::Csv})
    connect(menu->addAction(tr(textsOf(format).command)), &QAction::triggered, this,
            [this, format] { askWhere(format); });
  connect(menu->addAction(tr("Copy picture")), &QAction::triggered, this, [this] { copyPicture(); });
  button.setMenu(menu);
  button.setPopupMode(QToolButton::InstantPopup);
  button.setObjectName(QStringLiteral("save"));
}

void TrendPageWidget::addRow(const std::string& key) { choose(key, true); }

void TrendPageWidget::removeRow(const std::string& key) { choose(key, false); }

bool TrendPageWidget::choose(const std::string& key, bool isWanted) {
  const auto found = std::ranges::find(_keys, key);
  if (isWanted == (found != _keys.end())) return true;
  const std::string refusal = isWanted ? refusalOf(key) : std::string();
  if (!refusal.empty()) {
    tell(QString::fromStdString(refusal));
    return false;
  }
  if (isWanted) {
    _keys.push_back(key);
  } else {
    _keys.erase(found);
  }
  _source.rememberRows(_keys);
  _view->setRows(_keys);
  fitTable();
  tell({});
  return true;
}

std::string TrendPageWidget::refusalOf(const std::string& key) const {
  if (_keys.size() == mostTrendLines) return "A picture has room for 8 rows. Remove one of them first.";
  std::set<std::string> units;
  for (const std::string& shown : _keys)
    if (const auto row = _source.row(shown)) units.insert(row->unit);
  if (const auto row = _source.row(key)) units.insert(row->unit);
  if (units.size() > mostTrendUnits) return "A picture has room for 4 units. Remove a row first.";
  return {};
}

void TrendPageWidget::refresh() {
  _view->setRows(_keys);
  const auto progress = _source.progress();
  _progress->setVisible(progress.has_value());
  if (progress) _progress->setValue(static_cast<int>(*progress * 1000));
  if (progress && !_reading.isActive()) _reading.start(millisecondsBetweenLooks);
  if (!progress) _reading.stop();
  showRemark();
}

void TrendPageWidget::pictureHasChanged() {
  const TrendLook look = TrendLook::of(palette(), font());
  _table.show(_view->data(), look);
  _marks->setLegend(EventLegend(_view->data().events, look));
  const TrendStretch& stretch = _view->stretch();
  for (QAbstractButton* const button : _lengths.buttons()) {
    const auto length = std::chrono::minutes(_lengths.id(button));
    button->setChecked(button == _wholeButton
                           ? stretch.kind() == TrendStretch::Kind::Whole
                           : stretch.kind() == TrendStretch::Kind::Last && stretch.length() == length);
  }
}

void TrendPageWidget::showRemark() {
  QStringList lines;
  if (!_message.isEmpty()) lines.append(_message);
  const bool isChoosing = _content->currentWidget() == _chooser;
  if (isChoosing) lines.append(tr("Choose the rows of the picture."));
  if (_keys.empty() && !isChoosing) lines.append(tr("The picture has no row yet: choose some by “Rows…”."));
  const QString remark = QString::fromStdString(_source.remark());
  if (!remark.isEmpty()) lines.append(remark);
  _remark->setText(lines.join(QLatin1Char('\n')));
  _remark->setVisible(!lines.isEmpty());
}

void TrendPageWidget::tell(const QString& message) {
  _message = message;
  showRemark();
}

void TrendPageWidget::chooseRows() {
  if (_content->currentWidget() == _chooser) return showPicture();
  _chooser->show(_source.rows(), _keys);
  _content->setCurrentWidget(_chooser);
  _chooser->setFocus(Qt::OtherFocusReason);
  tell({});
}

void TrendPageWidget::showPicture() {
  _content->setCurrentWidget(_picture);
  _view->setFocus(Qt::OtherFocusReason);
  refresh();
}

void TrendPageWidget::keyPressEvent(QKeyEvent* event) {
  const auto lengths = _lengths.buttons();
  const int number = event->key() - Qt::Key_1;
  if (event->modifiers() == Qt::NoModifier && number >= 0 && number < lengths.size()) {
    lengths[number]->click();
  } else if (event->key() == Qt::Key_S && event->modifiers() == Qt::NoModifier) {
    findChild<QToolButton*>(QStringLiteral("save"))->showMenu();
  } else {
    TrendPage::keyPressEvent(event);
  }
}

// What is told of one wish goes when the user does something else.
bool TrendPageWidget::eventFilter(QObject* watched, QEvent* event) {
  const bool isDeed = event->type() == QEvent::KeyPress || event->type() == QEvent::MouseButtonPress ||
                      event->type() == QEvent::Wheel;
  if (isDeed && !_message.isEmpty()) tell({});
  return TrendPage::eventFilter(watched, event);
}

void TrendPageWidget::resizeEvent(QResizeEvent* event) {
  TrendPage::resizeEvent(event);
  const bool isNarrow = width() < narrow;
  // Only the last of the numbers has the unit then.
  _lengths.button(2)->setText(isNarrow ? tr("2") : tr("2 min"));
  _lengths.button(10)->setText(isNarrow ? tr("10") : tr("10 min"));
  _zoomIn->setVisible(!isNarrow);
  _zoomOut->setVisible(!isNarrow);
  _tableView->setColumnHidden(TrendTable::Last, isNarrow);
  fitTable();
}

void TrendPageWidget::fitTable() {
  const int rows = std::clamp(_table.rowCount(), 1, mostTableRows);
  const int rowHeight = _table.rowCount() > 0 ? _tableView->rowHeight(0) : fontMetrics().height();
  _tableView->setFixedHeight(_tableView->horizontalHeader()->sizeHint().height() + rows * rowHeight + 4);
}

void TrendPageWidget::askWhere(Format format) {
  auto* const dialog = new QFileDialog(this, tr("Save the trend"));
  dialog->setAttribute(Qt::WA_DeleteOnClose);
  dialog->setAcceptMode(QFileDialog::AcceptSave);
  dialog->setNameFilter(tr(textsOf(format).filter));
  dialog->setDefaultSuffix(QString::fromLatin1(textsOf(format).suffix));
  QString name = QStringLiteral("trend");
  if (const auto row = _keys.empty() ? std::nullopt : _source.row(_keys.front())) {
    name = QString::fromStdString(row->name);
    for (QChar& character : name)
      if (!character.isLetterOrNumber()) character = QLatin1Char('-');
  }
  dialog->selectFile(name + QLatin1Char('.') + QString::fromLatin1(textsOf(format).suffix));
  connect(dialog, &QFileDialog::fileSelected, this,
          [this, format](const QString& path) { save(format, path); });
  openWithinScreen(*dialog);
}

void TrendPageWidget::save(Format format, const QString& path) {
  const auto stretch = _view->stretch().of(_source.whole());
  const TrendPicture picture{_source, _keys, stretch};
  std::string bytes;
  switch (format) {
    case Format::Png: {
      QBuffer file;
      picture.image().save(&file, "PNG");
      bytes = bytesOf(file.data());
      break;
    }
    case Format::Svg:
      bytes = bytesOf(picture.svg());
      break;
    case Format::Csv:
      bytes = _source.table(_keys, stretch);
      break;
  }
  const std::string error = _source.save(QFile::encodeName(path).toStdString(), bytes);
  tell(QString::fromStdString(error.empty() ? "Saved as " + printableText(path.toStdString()) + "." : error));
}

void TrendPageWidget::copyPicture() {
  QGuiApplication::clipboard()->setImage(
      TrendPicture{_source, _keys, _view->stretch().of(_source.whole())}.image());
  tell(tr("The picture is copied."));
}

}  // namespace varnel
