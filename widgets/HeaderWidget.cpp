#include "widgets/HeaderWidget.h"

#include <QContextMenuEvent>
#include <QCoreApplication>
#include <QPainter>
#include <array>
#include <cmath>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr int barHeight = 48;
constexpr int inset = 10;
constexpr int menuWidth = 40, menuHeight = 44;
constexpr int overlap = 8;  // of the empty edges of two buttons
constexpr std::array<double, 3> titleSizes = {17, 15, 13};

int widthOf(const QString& text, double size) {
  const double width = QFontMetricsF(qtFont(Font::boldSystem(size))).horizontalAdvance(text);
  return static_cast<int>(std::ceil(width)) + 2;
}

}  // namespace

HeaderWidget::HeaderWidget(QWidget* parent)
    : QWidget(parent),
      _back(TextButton::Mark::Back, this),
      _title(this),
      _side(TextButton::Mark::None, this),
      _menu(this) {
  setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Fixed);
  _back.hide();
  _title.setTextFormat(Qt::PlainText);
  _title.setAlignment(Qt::AlignCenter);
  connect(&_back, &QAbstractButton::clicked, this, [this] {
    if (_backAction) _backAction();
  });
  _side.hide();
  connect(&_side, &QAbstractButton::clicked, this, [this] {
    // A copy: the action may end in another one.
    if (const auto action = _sideAction) action();
  });
  _menu.setGlyph(GlyphButton::Glyph::Menu, tr("Menu: what can be done with the row, and keys"));
  // The row that has the keyboard keeps it when the mouse presses the button.
  _menu.setFocusPolicy(Qt::TabFocus);
  _menu.hide();
  connect(&_menu, &QAbstractButton::clicked, this, [this] { askForMenu(); });
}

void HeaderWidget::setTitle(const QString& title) {
  if (title == _wholeTitle) return;
  _wholeTitle = title;
  _title.setAccessibleName(title);
  arrange();
}

void HeaderWidget::showBackButton(const QString& parentTitle) {
  if (_leadsBack && parentTitle == _back.text()) return;
  _leadsBack = true;
  _back.setText(parentTitle);
  _back.setShortcut({});  // an ampersand in the title is no mnemonic
  _back.setAccessibleName(QStringLiteral("Back to ") + parentTitle);
  _back.show();
  arrange();
}

void HeaderWidget::showSideButton(const std::optional<SideButton>& button) {
  if (button.has_value() == _hasSideButton && (!button || button->text == _side.text())) return;
  _hasSideButton = button.has_value();
  if (button) {
    _side.setText(button->text);
    _side.setToolTip(button->tooltip);
    _side.setAccessibleDescription(button->tooltip);
  }
  _side.setVisible(_hasSideButton);
  arrange();
}

void HeaderWidget::showMenuButton(bool isShown) {
  if (isShown == _hasMenuButton) return;
  _hasMenuButton = isShown;
  _menu.setVisible(isShown);
  arrange();
}

// What is around the pane opens it, as for a finger that rests.
void HeaderWidget::askForMenu() {
  const QPoint place = _menu.geometry().bottomLeft();
  QContextMenuEvent wish(QContextMenuEvent::Other, place, mapToGlobal(place));
  QCoreApplication::sendEvent(this, &wish);
}

QSize HeaderWidget::sizeHint() const { return {320, barHeight}; }

void HeaderWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  arrange();
}

void HeaderWidget::arrange() {
  for (const BackButton backButton : {BackButton::Whole, BackButton::Mark}) {
    for (const double size : titleSizes) {
      if (arrangeWith(_leadsBack ? backButton : BackButton::Hidden, size)) return;
    }
  }
}

// False when the title does not fit. Then it is placed where the least of it is cut.
bool HeaderWidget::arrangeWith(BackButton backButton, double titleSize) {
  int backWidth = 0;
  if (backButton == BackButton::Whole) backWidth = _back.sizeHint().width();
  if (backButton == BackButton::Mark) backWidth = _back.minimumSizeHint().width();
  const QSize side = _side.sizeHint();
  _menu.setGeometry(width() - menuWidth, (barHeight - menuHeight) / 2, menuWidth, menuHeight);
  const int endOfSide = width() - (_hasMenuButton ? menuWidth - overlap : 0);
  _side.setGeometry(endOfSide - side.width(), (barHeight - side.height()) / 2, side.width(), side.height());
  const int titleWidth = widthOf(_wholeTitle, titleSize);
  _back.setGeometry(0, (barHeight - _back.sizeHint().height()) / 2, backWidth, _back.sizeHint().height());
  _title.setGeometry(titleRoom(backWidth, titleWidth));
  _back.setToolTip(backButton == BackButton::Mark ? plainTooltip(_back.text()) : QString());
  showAsMuchAsFits(qtFont(Font::boldSystem(titleSize)));
  return titleWidth <= _title.width();
}

void HeaderWidget::showAsMuchAsFits(const QFont& font) {
  const QString fitting = QFontMetricsF(font).elidedText(_wholeTitle, Qt::ElideRight, _title.width());
  _title.setFont(font);
  _title.setText(fitting);
  _title.setToolTip(fitting == _wholeTitle ? QString() : plainTooltip(_wholeTitle));
}

int HeaderWidget::rightInset() const {
  if (_hasSideButton) return width() - _side.x();
  return _hasMenuButton ? menuWidth : inset;
}

// In the middle of the bar, or as near to it as the buttons allow.
QRect HeaderWidget::titleRoom(int backWidth, int titleWidth) const {
  const int left = backWidth > 0 ? backWidth : inset;
  const int right = this->width() - rightInset();
  const int width = std::max(0, std::min(titleWidth, right - left));
  const int middle = (this->width() - width) / 2;
  return {std::max(left, std::min(middle, right - width)), 0, width, barHeight - 1};
}

void HeaderWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  const double thickness = 1 / devicePixelRatioF();
  painter.fillRect(QRectF(0, height() - thickness, width(), thickness), separatorColor(palette()));
}

}  // namespace varnel
