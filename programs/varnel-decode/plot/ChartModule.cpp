#include "programs/varnel-decode/plot/ChartModule.h"

#include <QApplication>
#include <QBuffer>
#include <QChart>
#include <QDateTime>
#include <QDateTimeAxis>
#include <QGraphicsLayout>
#include <QGraphicsScene>
#include <QLegend>
#include <QLegendMarker>
#include <QLineSeries>
#include <QPainter>
#include <QScatterSeries>
#include <QSvgGenerator>
#include <QTimeZone>
#include <QValueAxis>
#include <algorithm>
#include <array>
#include <cstdlib>
#include <ctime>
#include <limits>
#include <map>
#include <span>
#include <vector>

namespace varnel {

namespace {

constexpr QSize pictureSize(1200, 600);  // points of an SVG viewer's screen
constexpr int resolution = 96;           // a point each
constexpr int timeTicks = 7;
constexpr int valueTicks = 6;
constexpr double dotSize = 5;
constexpr double lineWidth = 1.6;

// Told apart also by those who do not see all colours.
constexpr std::array<QRgb, 8> colours = {0x0072B2, 0xD55E00, 0x009E73, 0xCC79A7,
                                         0x56B4E9, 0xE69F00, 0x000000, 0x8C6D31};

qint64 milliseconds(double seconds) { return static_cast<qint64>(seconds * 1000); }

QString text(const std::string& bytes) { return QString::fromStdString(bytes); }

// What tells one tick of the time axis from the next.
QString timeFormat(double seconds, bool isOneDay) {
  if (!isOneDay) return seconds < 600 ? QStringLiteral("MM-dd HH:mm:ss") : QStringLiteral("MM-dd HH:mm");
  return seconds < 2 * timeTicks ? QStringLiteral("HH:mm:ss.zzz") : QStringLiteral("HH:mm:ss");
}

struct Range {
  double lowest = std::numeric_limits<double>::infinity();
  double highest = -std::numeric_limits<double>::infinity();

  void take(double number) {
    lowest = std::min(lowest, number);
    highest = std::max(highest, number);
  }
};

// Axes, and which series goes with which: one time axis, and a value axis for each unit.
class ChartMaker {
 public:
  ChartMaker(QChart& chart, const Plot& plot) : _chart(chart) {
    chart.setTitle(text(plot.title).toHtmlEscaped());
    chart.setLocalizeNumbers(false);
    chart.setBackgroundRoundness(0);
    chart.layout()->setContentsMargins(0, 0, 0, 0);
    chart.legend()->setAlignment(Qt::AlignBottom);
    chart.legend()->setMarkerShape(QLegend::MarkerShapeFromSeries);
    addTimeAxis(plot);
    for (const PlotSeries& series : plot.series) addValueAxis(series, plot);
    for (std::size_t i = 0; i < plot.series.size(); ++i)
      addSeries(plot.series[i], QColor(colours[i % colours.size()]));
    // Round numbers beside the lines, once the axes know what they show.
    for (const auto& [unit, axis] : _valueAxes) axis->applyNiceNumbers();
  }

 private:
  void addTimeAxis(const Plot& plot) {
    Range range;
    for (const PlotSeries& series : plot.series)
      for (const PlotPoint& point : series.points) range.take(point.seconds);
    if (range.lowest == range.highest) range.highest += 1;
    const QDateTime start = QDateTime::fromMSecsSinceEpoch(milliseconds(range.lowest), Qt::UTC);
    const QDateTime end = QDateTime::fromMSecsSinceEpoch(milliseconds(range.highest), Qt::UTC);
    const bool isOneDay = start.date() == end.date();
    const QString day = QStringLiteral("yyyy-MM-dd");
    auto* axis = new QDateTimeAxis(&_chart);
    axis->setFormat(timeFormat(range.highest - range.lowest, isOneDay));
    axis->setTickCount(timeTicks);
    axis->setTitleText(
        isOneDay ? QStringLiteral("UTC, %1").arg(start.toString(day))
                 : QStringLiteral("UTC, from %1 to %2").arg(start.toString(day), end.toString(day)));
    axis->setRange(start, end);
    _chart.addAxis(axis, Qt::AlignBottom);
    _timeAxis = axis;
  }

  void addValueAxis(const PlotSeries& series, const Plot& plot) {
    if (_valueAxes.contains(series.unit)) return;
    Range range;
    for (const PlotSeries& other : plot.series) {
      if (other.unit != series.unit) continue;
      for (const PlotPoint& point : other.points) range.take(point.value);
    }
    if (range.lowest > range.highest) range = {0, 1};
    if (range.lowest == range.highest) range = {range.lowest - 1, range.highest + 1};
    auto* axis = new QValueAxis(&_chart);
    axis->setTickCount(valueTicks);
    axis->setTitleText(text(series.unit).toHtmlEscaped());
    axis->setRange(range.lowest, range.highest);
    const bool isOdd = _valueAxes.size() % 2 != 0;
    _chart.addAxis(axis, isOdd ? Qt::AlignRight : Qt::AlignLeft);
    _valueAxes.emplace(series.unit, axis);
  }

  // The chart knows no gaps: each unbroken line is a series of its own, points without neighbours are
  // another, and the first of them all stands in the legend.
  void addSeries(const PlotSeries& series, const QColor& colour) {
    const std::span points(series.points);
    std::vector<QXYSeries*> parts;
    QList<QPointF> lonePoints;
    for (std::size_t start = 0, end = 0; start < points.size(); start = end) {
      for (end = start + 1; end < points.size() && !points[end].startsNewLine;) ++end;
      QList<QPointF> line;
      for (const PlotPoint& point : points.subspan(start, end - start))
        line.append({static_cast<double>(milliseconds(point.seconds)), point.value});
      if (line.size() > 1) {
        parts.push_back(addLine(line, colour));
      } else {
        lonePoints += line;
      }
    }
    if (!lonePoints.isEmpty()) parts.push_back(addDots(lonePoints, colour));
    for (QXYSeries* part : parts) {
      part->attachAxis(_timeAxis);
      part->attachAxis(_valueAxes.at(series.unit));
      part->setName(text(legendOf(series)).toHtmlEscaped());
      if (part != parts.front()) _chart.legend()->markers(part).constFirst()->setVisible(false);
    }
  }

  // Where there are several axes, the unit tells which one is meant.
  std::string legendOf(const PlotSeries& series) const {
    const bool isUnitNeeded = _valueAxes.size() > 1 && !series.unit.empty();
    return isUnitNeeded ? series.label + " (" + series.unit + ")" : series.label;
  }

  QXYSeries* addLine(const QList<QPointF>& points, const QColor& colour) {
    auto* line = new QLineSeries(&_chart);
    line->append(points);
    line->setPen(QPen(colour, lineWidth));
    _chart.addSeries(line);
    return line;
  }

  QXYSeries* addDots(const QList<QPointF>& points, const QColor& colour) {
    auto* dots = new QScatterSeries(&_chart);
    dots->append(points);
    dots->setMarkerSize(dotSize);
    dots->setColor(colour);
    dots->setBorderColor(colour);
    _chart.addSeries(dots);
    return dots;
  }

  QChart& _chart;
  QDateTimeAxis* _timeAxis = nullptr;
  std::map<std::string, QValueAxis*> _valueAxes;
};

// What the toolkit has to say of its surroundings (no desktop, no display) is of no use here.
void ignoreRemarks(QtMsgType type, const QMessageLogContext& /*context*/, const QString& remark) {
  if (type == QtFatalMsg) std::fprintf(stderr, "varnel-decode: %s\n", qPrintable(remark));
}

QByteArray draw(const Plot& plot) {
  QGraphicsScene scene;
  auto* chart = new QChart;
  scene.addItem(chart);
  const ChartMaker maker(*chart, plot);
  chart->resize(pictureSize);
  scene.setSceneRect(QRectF(QPointF(), QSizeF(pictureSize)));
  QApplication::processEvents();  // lays out axes and legend

  QBuffer file;
  QSvgGenerator generator;
  generator.setOutputDevice(&file);
  generator.setSize(pictureSize);
  generator.setViewBox(QRect(QPoint(), pictureSize));
  generator.setResolution(resolution);
  generator.setTitle(text(plot.title));
  QPainter painter(&generator);
  painter.setRenderHint(QPainter::Antialiasing);
  scene.render(&painter, scene.sceneRect(), scene.sceneRect());
  painter.end();
  return file.data();
}

}  // namespace

}  // namespace varnel

extern "C" void varnelDrawPlot(const varnel::Plot& plot, std::string& svg) {
  // The time axis knows local time only.
  ::setenv("TZ", "UTC", 1);
  ::tzset();
  qInstallMessageHandler(varnel::ignoreRemarks);
  std::array<char, 14> name = {"varnel-decode"};
  std::array<char, 10> option = {"-platform"};
  std::array<char, 10> platform = {"offscreen"};
  std::array<char*, 4> arguments = {name.data(), option.data(), platform.data(), nullptr};
  int count = static_cast<int>(arguments.size()) - 1;
  const QApplication application(count, arguments.data());
  svg = varnel::draw(plot).toStdString();
}
