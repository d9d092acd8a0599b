#include "widgets/RowWidget.h"

#include <QPainter>
#include <QPainterPath>
#include <QStringList>
#include <QToolTip>
#include <algorithm>

#include "platform/ui/TableView.h"
#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double textInset = 10;
constexpr double builtInTextSize = 15;
constexpr double accessoryRoom = 30;
constexpr double markStroke = 2;
constexpr double openMarkWidth = 4;

void stroke(QPainter& painter, const QColor& color, const QPainterPath& path) {
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setBrush(Qt::NoBrush);
  painter.setPen(QPen(color, markStroke, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.drawPath(path);
  painter.restore();
}

// Both marks are drawn around the middle of their room.
QPainterPath disclosureIndicator(const QPointF& middle) {
  QPainterPath path(middle + QPointF(-3, -6));
  path.lineTo(middle + QPointF(3, 0));
  path.lineTo(middle + QPointF(-3, 6));
  return path;
}

QPainterPath checkmark(const QPointF& middle) {
  QPainterPath path(middle + QPointF(-6, 0));
  path.lineTo(middle + QPointF(-2, 5));
  path.lineTo(middle + QPointF(6, -5));
  return path;
}

}  // namespace

RowWidget::RowWidget(CellStyle style, QWidget& parent) : QWidget(&parent), _labels(*this) {
  setAttribute(Qt::WA_TransparentForMouseEvents);
  setAttribute(Qt::WA_OpaquePaintEvent);
  // The built-in name of this style is heavier than plain text.
  setTextFont(style == CellStyle::NameAndDetail ? Font::boldSystem(builtInTextSize)
                                                : Font::system(builtInTextSize));
}

void RowWidget::layOut() { _contentBounds = contentArea(); }

Rect RowWidget::contentArea() const {
  return {0, 0, std::min(parentWidget()->width(), widest) - accessoryWidth(), tableRowHeight};
}

void RowWidget::fitLabels() {
  const Rect area = contentArea();
  const double end = _labels.endOfLabels();
  _labels.setContentSize({end > area.width ? end + textInset : area.width, area.height});
  _labels.setFrame(area);
}

Label& RowWidget::addLabel() { return _labels.addLabel(); }

ScrollContainer& RowWidget::addScrollContainer() {
  return *_containers.emplace_back(std::make_unique<PaintedScrollContainer>(*this));
}

void RowWidget::setAccessory(CellAccessory accessory) {
  if (accessory == _accessory) return;
  _accessory = accessory;
  update();
}

void RowWidget::setText(std::string_view text) {
  QString wanted = singleLine(text);
  if (wanted == _builtInText) return;
  _builtInText = std::move(wanted);
  update();
}

void RowWidget::setTextFont(const Font& font) {
  QFont wanted = qtFont(font);
  if (wanted == _builtInFont) return;
  _builtInFont = std::move(wanted);
  update();
}

void RowWidget::setRow(std::size_t row) {
  if (row == _row) return;
  _row = row;
  scrollSidewaysTo(0);
}

void RowWidget::setEmphasis(const Emphasis& emphasis) {
  if (emphasis == _emphasis) return;
  _emphasis = emphasis;
  update();
}

QString RowWidget::description() const {
  QStringList parts;
  const auto add = [&parts](const QString& text) {
    if (!text.isEmpty()) parts.append(text);
  };
  add(_builtInText);
  for (const auto& label : _labels.labels()) add(label->shownText());
  for (const auto& container : _containers) {
    for (const auto& label : container->labels()) add(label->shownText());
  }
  return parts.join(QStringLiteral(": "));
}

QString RowWidget::name() const {
  if (!_builtInText.isEmpty()) return _builtInText;
  for (const PaintedScrollContainer* part : {&_labels, &scrolledPart()}) {
    if (!part->labels().empty()) return part->labels().front()->shownText();
  }
  return {};
}

bool RowWidget::reachesPastItsEdge() const {
  if (QFontMetricsF(_builtInFont).horizontalAdvance(_builtInText) > builtInRoom().width()) return true;
  return _labels.hasMoreThanFits() ||
         std::ranges::any_of(_containers, [](const auto& container) { return container->hasMoreThanFits(); });
}

QString RowWidget::details(const QString& explanation) const {
  if (!reachesPastItsEdge()) return explanation;
  return explanation.isEmpty() ? description() : description() + QChar::LineFeed + explanation;
}

void RowWidget::showTooltip(const QPoint& globalPosition, const QString& explanation) const {
  const QString text = details(explanation);
  if (text.isEmpty()) return QToolTip::hideText();
  QToolTip::showText(globalPosition, plainTooltip(text), parentWidget(), geometry());
}

double RowWidget::sidewaysRange() const { return scrolledPart().range(); }

double RowWidget::sidewaysPosition() const { return scrolledPart().position(); }

const PaintedScrollContainer& RowWidget::scrolledPart() const {
  return _containers.empty() ? _labels : *_containers.front();
}

void RowWidget::scrollSidewaysTo(double position) {
  _labels.scrollTo(position);
  for (const auto& container : _containers) container->scrollTo(position);
}

void RowWidget::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  const bool isMarked = _emphasis.isSelected || _emphasis.isOpen;
  const QColor ground = isMarked ? selectionColor(palette()) : palette().color(QPalette::Base);
  painter.fillRect(rect(), ground);
  painter.setPen(palette().color(QPalette::Text));
  paintBuiltInText(painter);
  const PaintedScrollContainer::Colors colors{ground, barColor(palette()), markColor(palette())};
  _labels.paint(painter, colors);
  for (const auto& container : _containers) container->paint(painter, colors);
  paintAccessory(painter);
  paintSeparator(painter);
  if (_emphasis.isOpen) paintOpenMark(painter);
  if (_emphasis.hasFocusFrame) paintFocusFrame(painter);
}

QRectF RowWidget::builtInRoom() const { return qtRect(contentArea()).adjusted(textInset, 0, -textInset, 0); }

void RowWidget::paintBuiltInText(QPainter& painter) const {
  if (_builtInText.isEmpty()) return;
  painter.setFont(_builtInFont);
  const QRectF room = builtInRoom();
  const QString cut = QFontMetricsF(_builtInFont).elidedText(_builtInText, Qt::ElideRight, room.width());
  painter.drawText(room, Qt::AlignLeft | Qt::AlignAbsolute | Qt::AlignVCenter | Qt::TextSingleLine, cut);
}

void RowWidget::paintAccessory(QPainter& painter) const {
  const QPointF middle(width() - accessoryRoom / 2, tableRowHeight / 2);
  switch (_accessory) {
    case CellAccessory::None:
      return;
    case CellAccessory::DisclosureIndicator:
      return stroke(painter, markColor(palette()), disclosureIndicator(middle));
    case CellAccessory::Checkmark:
      return stroke(painter, accentColor(palette(), palette().color(QPalette::Base)), checkmark(middle));
  }
}

void RowWidget::paintSeparator(QPainter& painter) const {
  const double thickness = 1 / devicePixelRatioF();
  painter.fillRect(QRectF(textInset, height() - thickness, width() - textInset, thickness),
                   separatorColor(palette()));
}

void RowWidget::paintFocusFrame(QPainter& painter) const {
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setBrush(Qt::NoBrush);
  painter.setPen(QPen(accentColor(palette(), palette().color(QPalette::Base)), markStroke));
  painter.drawRoundedRect(QRectF(rect()).adjusted(2, 2, -2, -2), 4, 4);
  painter.restore();
}

// A color alone would not tell it from the selected row.
void RowWidget::paintOpenMark(QPainter& painter) const {
  painter.fillRect(QRectF(0, 0, openMarkWidth, height()),
                   accentColor(palette(), palette().color(QPalette::Base)));
}

double RowWidget::accessoryWidth() const { return _accessory == CellAccessory::None ? 0 : accessoryRoom; }

}  // namespace varnel
