#include "programs/varnel/trends/TrendChart.h"

#include <QFontMetricsF>
#include <QGraphicsLayout>
#include <QLegend>
#include <algorithm>
#include <limits>
#include <optional>

namespace varnel {

namespace {

constexpr double narrow = 480;  // points
constexpr double pointsPerStep = 45;
constexpr double spaceBetweenTicks = 24;
constexpr int roomOfLastLabel = 28;  // half of the last time hangs over the end of its axis

// The values of all lines with a unit.
TrendScale scaleOf(const TrendData& data, const std::string& unit, int steps) {
  double lowest = std::numeric_limits<double>::infinity(), highest = -lowest;
  for (const TrendData::Line& line : data.lines) {
    if (line.row.unit != unit) continue;
    for (const auto& column : line.columns) {
      if (column.isEmpty) continue;
      lowest = std::min(lowest, column.lowest);
      highest = std::max(highest, column.highest);
    }
  }
  return scaleFor(lowest, highest, steps);
}

QString axisTitleOf(const std::string& unit) {
  return unit.empty() ? QObject::tr("(no unit)") : QString::fromStdString(unit).toHtmlEscaped();
}

}  // namespace

TrendChart::TrendChart()
    : _time(new QCategoryAxis(this)), _carrier(new QLineSeries(this)), _lines(new TrendLines(this)) {
  legend()->hide();
  setLocalizeNumbers(false);
  setBackgroundRoundness(0);
  layout()->setContentsMargins(0, 0, 0, 0);
  _time->setLabelsPosition(QCategoryAxis::AxisLabelsPositionOnValue);
  _time->setTruncateLabels(false);
  addSeries(_carrier);
  addAxis(_time, Qt::AlignBottom);
  _carrier->attachAxis(_time);
  _lines->setZValue(100);
  connect(this, &QChart::plotAreaChanged, this, [this](const QRectF& area) { _lines->setArea(area); });
}

void TrendChart::setLook(const TrendLook& look) {
  _look = look;
  setBackgroundBrush(look.ground);
  setBackgroundPen(Qt::NoPen);
  color(*_time, _look.text);
  for (UnitAxis& unit : _units) color(*unit.axis, unit.ink = _look.text);
}

void TrendChart::color(QAbstractAxis& axis, const QColor& ink) const {
  axis.setLabelsFont(_look.font);
  axis.setTitleFont(_look.font);
  axis.setLabelsColor(ink);
  axis.setTitleBrush(ink);
  axis.setLinePen(QPen(_look.grid, 1));
  axis.setGridLinePen(QPen(_look.grid, 1));
}

int TrendChart::mostTicks() const {
  const QFontMetricsF metrics(_look.font);
  const double width = metrics.horizontalAdvance(QStringLiteral("00:00:00")) + spaceBetweenTicks;
  const double room = std::max(_lines->area().width(), 1.0);
  return std::clamp(static_cast<int>(room / width), 3, 12);
}

void TrendChart::show(const TrendData& data) {
  showUnits(data);
  showTimes(data);
  std::vector<TrendScale> scales;
  for (const TrendData::Line& line : data.lines) scales.push_back(axisOf(line.row.unit).scale);
  _lines->show(data, std::move(scales), _look);
}

TrendChart::UnitAxis& TrendChart::axisOf(const std::string& unit) {
  const auto found = std::ranges::find(_units, unit, &UnitAxis::unit);
  if (found != _units.end()) return *found;
  auto* const axis = new QValueAxis(this);
  axis->setTickType(QValueAxis::TicksDynamic);
  axis->setTruncateLabels(false);
  axis->setTitleText(axisTitleOf(unit));
  color(*axis, _look.text);
  // One grid is enough.
  axis->setGridLineVisible(_units.empty());
  auto* const carrier = new QLineSeries(this);
  addSeries(carrier);
  addAxis(axis, _units.size() % 2 == 0 ? Qt::AlignLeft : Qt::AlignRight);
  carrier->attachAxis(_time);
  carrier->attachAxis(axis);
  return _units.emplace_back(UnitAxis{unit, axis, carrier, {}, _look.text});
}

// An axis of a single line has its color, so that it is plain which line belongs to which axis.
QColor TrendChart::inkOf(const TrendData& data, const std::string& unit) const {
  std::optional<std::size_t> only;
  for (std::size_t i = 0; i < data.lines.size(); ++i) {
    if (data.lines[i].row.unit != unit) continue;
    if (only) return _look.text;
    only = i;
  }
  return only && _units.size() > 1 ? _look.penOf(*only).color() : _look.text;
}

void TrendChart::showUnits(const TrendData& data) {
  std::erase_if(_units, [&](const UnitAxis& unit) {
    const bool isUsed = std::ranges::any_of(
        data.lines, [&](const TrendData::Line& line) { return line.row.unit == unit.unit; });
    if (isUsed) return false;
    removeSeries(unit.carrier);
    removeAxis(unit.axis);
    delete unit.carrier;
    delete unit.axis;
    return true;
  });
  if (!_units.empty()) _units.front().axis->setGridLineVisible(true);
  const int steps = std::max(2, static_cast<int>(_lines->area().height() / pointsPerStep));
  for (const TrendData::Line& line : data.lines) {
    UnitAxis& unit = axisOf(line.row.unit);
    const QColor ink = inkOf(data, unit.unit);
    if (ink != unit.ink) color(*unit.axis, unit.ink = ink);
    const TrendScale scale = scaleOf(data, unit.unit, steps);
    if (scale == unit.scale) continue;
    unit.scale = scale;
    unit.axis->setRange(scale.lowest, scale.highest);
    unit.axis->setTickAnchor(scale.lowest);
    unit.axis->setTickInterval(scale.step);
    unit.axis->setLabelFormat(QStringLiteral("%.%1f").arg(scale.decimals));
  }
  const bool hasAxisOnTheRight = std::ranges::any_of(
      _units, [](const UnitAxis& unit) { return unit.axis->alignment() == Qt::AlignRight; });
  // Where there is little room, the labels on the right would lie below the title of their axis.
  for (const UnitAxis& unit : _units)
    unit.axis->setTitleVisible(unit.axis->alignment() == Qt::AlignLeft || size().width() >= narrow);
  setMargins(QMargins(0, 4, hasAxisOnTheRight ? 0 : roomOfLastLabel, 0));
}

void TrendChart::showTicks(const std::vector<TimeTick>& ticks) {
  _ticks = ticks;
  for (const QString& label : _time->categoriesLabels()) _time->remove(label);
  if (!ticks.empty()) _time->setStartValue(ticks.front().milliseconds - 1);
  QStringList used;
  for (const TimeTick& tick : ticks) {
    // The axis takes no label twice, but a clock that was set back shows a time twice.
    QString label = tick.label;
    while (used.contains(label)) label += QChar(0x200B);
    used.append(label);
    _time->append(label, tick.milliseconds);
  }
}

void TrendChart::showTimes(const TrendData& data) {
  const double first = millisecondsOf(data.stretch.begin), last = millisecondsOf(data.stretch.end);
  // Ticks stand still for a while, and the axis lays out all labels anew when one of them changes.
  const bool areSame = std::ranges::equal(data.ticks, _ticks, [](const TimeTick& one, const TimeTick& other) {
    return one.milliseconds == other.milliseconds && one.label == other.label;
  });
  if (!areSame) showTicks(data.ticks);
  _time->setRange(first, last);
  if (_time->titleText() != data.axisTitle) _time->setTitleText(data.axisTitle);
}

}  // namespace varnel
