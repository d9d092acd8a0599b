#include "widgets/NoticeWidget.h"

#include <QAccessible>
#include <QHelpEvent>
#include <QPainter>
#include <QResizeEvent>
#include <QTextLayout>
#include <QToolTip>
#include <cmath>
#include <memory>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double textSize = 13;
constexpr int sideInset = 10;
constexpr int upperInset = 6;
// The share of the desktop's highlight color in the ground.
constexpr double highlightShare = 0.15;

// The text in lines of at most this width. Paths may be broken anywhere.
std::unique_ptr<QTextLayout> layOut(const QString& text, int width) {
  QString broken = text;
  broken.replace(u'\n', QChar::LineSeparator);
  auto layout = std::make_unique<QTextLayout>(broken, qtFont(Font::system(textSize)));
  QTextOption option;
  option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
  layout->setTextOption(option);
  layout->beginLayout();
  double height = 0;
  for (QTextLine line = layout->createLine(); line.isValid(); line = layout->createLine()) {
    line.setLineWidth(std::max(1, width - 2 * sideInset));
    line.setPosition(QPointF(0, height));
    height += line.height();
  }
  layout->endLayout();
  return layout;
}

}  // namespace

NoticeWidget::NoticeWidget(QWidget* parent) : QWidget(parent) {
  QSizePolicy policy(QSizePolicy::Ignored, QSizePolicy::Fixed);
  policy.setHeightForWidth(true);
  setSizePolicy(policy);
  setAccessibleName(QStringLiteral("Notice"));
  hide();
}

void NoticeWidget::setText(std::string_view text) {
  const QString wanted = QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
  if (wanted == _text) return;
  _text = wanted;
  setAccessibleDescription(_text);
  updateGeometry();
  update();
  setVisible(!_text.isEmpty() && !_isShownElsewhere);
  // Only the one on the screen is spoken: every pane of a stack has one.
  if (!isVisible()) return;
  QAccessibleEvent spoken(this, QAccessible::Alert);
  QAccessible::updateAccessibility(&spoken);
}

void NoticeWidget::setShownElsewhere(bool isShownElsewhere) {
  _isShownElsewhere = isShownElsewhere;
  setVisible(!_text.isEmpty() && !_isShownElsewhere);
}

int NoticeWidget::heightForWidth(int width) const {
  return static_cast<int>(std::ceil(layOut(_text, width)->boundingRect().height())) + 2 * upperInset;
}

QSize NoticeWidget::sizeHint() const { return {width(), heightForWidth(width())}; }

QSize NoticeWidget::minimumSizeHint() const { return {0, 0}; }

bool NoticeWidget::event(QEvent* event) {
  if (event->type() != QEvent::ToolTip) return QWidget::event(event);
  if (height() < heightForWidth(width()))
    QToolTip::showText(static_cast<const QHelpEvent&>(*event).globalPos(), plainTooltip(_text), this);
  else
    QToolTip::hideText();
  return true;
}

// The height follows the width, which a hidden notice does not have yet.
void NoticeWidget::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  if (event->size().width() != event->oldSize().width()) updateGeometry();
}

void NoticeWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  const QColor ground = palette().color(QPalette::Base);
  painter.fillRect(rect(), blend(ground, palette().color(QPalette::Highlight), highlightShare));
  painter.setPen(palette().color(QPalette::Text));
  layOut(_text, width())->draw(&painter, QPointF(sideInset, upperInset));
  const double thickness = 1 / devicePixelRatioF();
  painter.fillRect(QRectF(0, height() - thickness, width(), thickness), separatorColor(palette()));
}

}  // namespace varnel
