#include "widgets/RowWidget.h"

#include <QPainter>
#include <QPainterPath>
#include <QStringList>
#include <QToolTip>
#include <algorithm>
#include <cmath>
#include <utility>

#include "platform/ui/TableView.h"
#include "widgets/Colors.h"
#include "widgets/LevelMark.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double textInset = 10;
constexpr double builtInTextSize = 15;
constexpr double accessoryRoom = 30;
constexpr double markStroke = 2;
constexpr double openMarkWidth = 4;

constexpr double changeMarkRadius = 2;
constexpr double changeMarkMiddle = 5;  // between the edge and the text
constexpr double gap = 8;               // between two things on a row
constexpr double gapBesideSparkline = 8;
constexpr double sparklineHeight = 26;
constexpr double narrowestSparkline = 60;
constexpr double widestSparkline = 96;
constexpr double narrowestSummary = 60;
constexpr double summaryTextSize = 13;
// So marks and sparklines end at the same place in most rows, whatever their values are.
constexpr double usualRoomOfValue = 106;

// Characters around a text of another direction, so that it leaves the order of the texts beside it alone.
constexpr QChar beginningOfIsolate(0x2068), endOfIsolate(0x2069);

QString isolated(const QString& text) {
  const bool hasOther = std::any_of(text.cbegin(), text.cend(), [](QChar character) {
    return character.direction() == QChar::DirR || character.direction() == QChar::DirAL;
  });
  return hasOther ? beginningOfIsolate + text + endOfIsolate : text;
}

QFont summaryFont() { return qtFont(Font::system(summaryTextSize)); }

// The first parts of a summary.
QString joined(const std::vector<std::string>& parts, std::size_t count, const QString& separator) {
  QStringList texts;
  for (std::size_t i = 0; i < count; ++i) texts.append(isolated(singleLine(parts[i])));
  return texts.join(separator);
}

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

void RowWidget::setFacts(CellFacts&& facts) {
  if (facts == _facts) return;
  _facts = std::move(facts);
  _sparkline.setCourse(_facts.course);
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
  add(joined(_facts.summary, _facts.summary.size(), QStringLiteral(", ")));
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
  if (!_facts.summary.empty()) {
    const double room = places().summary.width();
    if (shownSummary(room) != joined(_facts.summary, _facts.summary.size(), QStringLiteral(" · ")))
      return true;
  }
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
  const QColor mark = _emphasis.isPale ? paleSelectionColor(palette()) : selectionColor(palette());
  const QColor ground = isMarked ? mark : palette().color(QPalette::Base);
  painter.fillRect(rect(), ground);
  // The first letters of a text decide about its direction, not the desktop's language.
  painter.setLayoutDirection(Qt::LayoutDirectionAuto);
  const QColor plain = palette().color(QPalette::Text);
  findColors(ground);
  const QColor dimmed = _colors.dimmedText;
  const QColor name = _facts.dimming == CellDimming::All ? dimmed : plain;
  painter.setPen(name);
  paintBuiltInText(painter);
  paintFacts(painter, ground);
  const PaintedScrollContainer::Colors colors{name, _facts.dimming == CellDimming::None ? plain : dimmed,
                                              ground, barColor(palette()), markColor(palette())};
  _labels.paint(painter, colors);
  for (const auto& container : _containers) container->paint(painter, colors);
  paintAccessory(painter);
  paintSeparator(painter);
  if (_facts.change == CellChange::Changed) paintChangeMark(painter);
  if (_emphasis.isOpen) paintOpenMark(painter);
  if (_emphasis.hasFocusFrame) paintFocusFrame(painter);
}

std::vector<const PaintedLabel*> RowWidget::filledLabels() const {
  std::vector<const PaintedLabel*> filled;
  const auto add = [&filled](const PaintedScrollContainer& part) {
    for (const auto& label : part.labels()) {
      if (!label->isEmpty()) filled.push_back(label.get());
    }
  };
  add(_labels);
  for (const auto& container : _containers) add(*container);
  return filled;
}

RowWidget::Places RowWidget::places() const {
  Places places;
  if (_facts.level == CellLevel::None && _facts.summary.empty() && !_sparkline.hasLine()) return places;
  const auto labels = filledLabels();
  if (labels.size() == 2) placeBesideValue(places, *labels.front(), *labels.back());
  if (labels.size() == 1) placeBesideName(places, labels.front()->endOfText());
  return places;
}

void RowWidget::placeBesideValue(Places& places, const PaintedLabel& name, const PaintedLabel& value) const {
  constexpr double middle = tableRowHeight / 2;
  const double endOfName = name.endOfText();
  // There is always room for the mark before the value.
  double end = value.frame().left() - gap;
  if (_facts.level != CellLevel::None) {
    const double usual = std::min(end, contentArea().width - usualRoomOfValue);
    if (sidewaysRange() <= 0 && usual - levelMarkSize.width() >= endOfName + gap) end = usual;
    const QPointF corner(std::floor(end - levelMarkSize.width()), middle - levelMarkSize.height() / 2);
    places.levelMark = QRectF(corner, levelMarkSize);
    end = corner.x();
  } else {
    end = std::min(end, contentArea().width - usualRoomOfValue - levelMarkSize.width());
  }
  if (sidewaysRange() > 0 || !_sparkline.hasLine()) return;
  end -= gapBesideSparkline;
  const double begin = std::max(endOfName + gapBesideSparkline, end - widestSparkline);
  if (end - begin < narrowestSparkline) return;
  places.sparkline = QRectF(QPointF(std::ceil(begin), middle - sparklineHeight / 2),
                            QSizeF(std::floor(end) - std::ceil(begin), sparklineHeight));
}

void RowWidget::placeBesideName(Places& places, double endOfName) const {
  constexpr double middle = tableRowHeight / 2;
  if (_facts.summary.empty()) return;
  double end = contentArea().width;
  if (end - endOfName - gap < narrowestSummary) return;
  if (_facts.level != CellLevel::None) {
    end -= levelMarkSize.width();
    places.levelMark = QRectF(QPointF(end, middle - levelMarkSize.height() / 2), levelMarkSize);
    end -= gap;
  }
  const double begin = endOfName + 2 * gap;
  places.summary = QRectF(begin, 0, std::max(0.0, end - begin), tableRowHeight);
}

// As many of its parts as there is room for.
QString RowWidget::shownSummary(double width) const {
  const QFontMetricsF metrics(summaryFont());
  QString text;
  for (std::size_t count = _facts.summary.size(); count > 0; --count) {
    text = joined(_facts.summary, count, QStringLiteral(" · "));
    if (metrics.horizontalAdvance(text) <= width) return text;
  }
  return metrics.elidedText(text, Qt::ElideRight, width);
}

void RowWidget::findColors(const QColor& ground) {
  const qint64 key = palette().cacheKey();
  if (_colors.palette == key && _colors.ground == ground && _colors.ofLevel == _facts.level) return;
  _colors = {key,
             ground,
             _facts.level,
             dimmedTextColor(palette(), ground),
             accentColor(palette(), ground),
             levelColor(_facts.level, palette(), ground)};
}

void RowWidget::paintFacts(QPainter& painter, const QColor& ground) {
  const Places where = places();
  const bool isDimmed = _facts.dimming != CellDimming::None;
  if (!where.sparkline.isEmpty()) {
    const QColor line = isDimmed || !_sparkline.changes() ? barColor(palette()) : markColor(palette());
    const QColor end = isDimmed ? line : _colors.accent;
    _sparkline.paint(painter, where.sparkline.topLeft(),
                     {where.sparkline.size(), line, end, devicePixelRatioF()});
  }
  if (!where.levelMark.isEmpty()) {
    const QColor filled = isDimmed ? markColor(palette()) : _colors.level;
    painter.save();
    painter.setClipRect(qtRect(contentArea()));
    paintLevelMark(painter, where.levelMark.topLeft() - QPointF(sidewaysPosition(), 0), _facts.level, filled,
                   separatorColor(palette()));
    painter.restore();
  }
  if (!where.summary.isEmpty()) paintSummary(painter, where.summary, ground);
}

void RowWidget::paintSummary(QPainter& painter, const QRectF& area, const QColor& ground) const {
  const QColor text = palette().color(QPalette::Text);
  painter.setPen(_facts.dimming == CellDimming::None ? blend(text, ground, 0.2) : _colors.dimmedText);
  painter.setFont(summaryFont());
  painter.drawText(
      area,
      Qt::AlignRight | Qt::AlignAbsolute | Qt::AlignVCenter | Qt::TextSingleLine | Qt::TextForceLeftToRight,
      shownSummary(area.width()));
}

void RowWidget::paintChangeMark(QPainter& painter) const {
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  painter.setBrush(_colors.accent);
  const double middle = changeMarkMiddle + (_emphasis.isOpen ? openMarkWidth / 2 : 0);
  painter.drawEllipse(QPointF(middle, tableRowHeight / 2), changeMarkRadius, changeMarkRadius);
  painter.restore();
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
