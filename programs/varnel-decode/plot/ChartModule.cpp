#include "programs/varnel-decode/plot/ChartModule.h"

#include <QApplication>
#include <QAreaSeries>
#include <QBuffer>
#include <QCategoryAxis>
#include <QChart>
#include <QDateTime>
#include <QGraphicsLayout>
#include <QGraphicsScene>
#include <QLegend>
#include <QLineSeries>
#include <QPainter>
#include <QPen>
#include <QScatterSeries>
#include <QSvgGenerator>
#include <QValueAxis>
#include <algorithm>
#include <array>
#include <cstdio>
#include <limits>
#include <map>
#include <span>
#include <vector>

#include "programs/shared/Legend.h"
#include "programs/shared/TimeTicks.h"

namespace varnel {

namespace {

constexpr double pictureWidth = 1200, pictureHeight = 600;  // points of an SVG viewer's screen
constexpr double leastChartHeight = 440;                    // a picture with a longer legend is higher
constexpr int resolution = 96;                              // one point each
constexpr int valueTicks = 6;
constexpr double dotSize = 5;
constexpr double lineWidth = 1.6;
constexpr int bandOpacity = 60;  // of 255

// People who do not see all colors can tell these apart too.
constexpr std::array<QRgb, 8> colors = {0x0072B2, 0xD55E00, 0x009E73, 0xCC79A7,
                                        0x56B4E9, 0xE69F00, 0x000000, 0x8C6D31};

// When there are more lines than colors, dashes tell them apart.
constexpr std::array<Qt::PenStyle, 3> styles = {Qt::SolidLine, Qt::DashLine, Qt::DotLine};

QPen penOf(std::size_t series) {
  const Qt::PenStyle style = styles[series / colors.size() % styles.size()];
  return {QColor(colors[series % colors.size()]), lineWidth, style, Qt::FlatCap};
}

double milliseconds(double seconds) { return seconds * 1000; }

// Without U+FFFE and U+FFFF, which XML cannot hold. Other such characters were replaced before.
QString text(const std::string& bytes) {
  QString text = QString::fromStdString(bytes);
  for (QChar& character : text)
    if (character >= QChar(0xFFFE)) character = QChar::ReplacementCharacter;
  return text;
}

struct Range {
  double lowest = std::numeric_limits<double>::infinity();
  double highest = -std::numeric_limits<double>::infinity();

  void take(double number) {
    lowest = std::min(lowest, number);
    highest = std::max(highest, number);
  }
};

bool isBand(const PlotPoint& point) { return point.lowest < point.highest; }

// A value holds until the next one, so the line is made of steps.
QLineSeries* steps(std::span<const PlotPoint> points, double PlotPoint::*value, QObject* owner) {
  QList<QPointF> corners;
  for (const PlotPoint& point : points) {
    corners.append({milliseconds(point.seconds), point.*value});
    if (point.until > point.seconds) corners.append({milliseconds(point.until), point.*value});
  }
  auto* line = new QLineSeries(owner);
  line->append(corners);
  return line;
}

// The axes and their series: one time axis, and one value axis per unit.
class ChartMaker {
 public:
  ChartMaker(QChart& chart, const Plot& plot) : _chart(chart) {
    chart.setTitle(text(plot.title).toHtmlEscaped());
    chart.setLocalizeNumbers(false);
    chart.setBackgroundRoundness(0);
    chart.layout()->setContentsMargins(0, 0, 0, 0);
    chart.legend()->hide();
    addTimeAxis(plot);
    for (const PlotSeries& series : plot.series) addValueAxis(series, plot);
    for (std::size_t i = 0; i < plot.series.size(); ++i) addBands(plot.series[i], penOf(i).color());
    for (std::size_t i = 0; i < plot.series.size(); ++i) addLines(plot.series[i], penOf(i));
    // Rounds the numbers of an axis, once it is known what the axis shows.
    for (const auto& [unit, axis] : _valueAxes) axis->applyNiceNumbers();
  }

  std::vector<LegendEntry> legend(const Plot& plot) const {
    std::vector<LegendEntry> entries;
    for (std::size_t i = 0; i < plot.series.size(); ++i)
      entries.push_back({text(legendOf(plot.series[i])), penOf(i)});
    return entries;
  }

 private:
  void addTimeAxis(const Plot& plot) {
    Range range;
    bool hasBands = false;
    for (const PlotSeries& series : plot.series) {
      for (const PlotPoint& point : series.points) {
        range.take(milliseconds(point.seconds));
        range.take(milliseconds(point.until));
        hasBands |= isBand(point);
      }
    }
    if (range.lowest == range.highest) range.highest += 1000;
    auto* axis = new QCategoryAxis(&_chart);
    axis->setLabelsPosition(QCategoryAxis::AxisLabelsPositionOnValue);
    axis->setRange(range.lowest, range.highest);
    axis->setStartValue(range.lowest);
    const TickLabels labels =
        plot.times == PlotTimes::SinceEpoch ? TickLabels::TimeOfDay : TickLabels::Seconds;
    for (const TimeTick& tick : timeTicks(range.lowest, range.highest, labels))
      axis->append(tick.label, tick.milliseconds);
    const QString times =
        plot.times == PlotTimes::SinceEpoch ? days(range) : QStringLiteral("seconds since the first record");
    axis->setTitleText(
        times + (hasBands ? QStringLiteral("; bands: lowest to highest, lines: their mean") : QString()));
    _chart.addAxis(axis, Qt::AlignBottom);
    _timeAxis = axis;
  }

  static QString days(const Range& range) {
    const auto dayOf = [](double time) {
      return QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(time), Qt::UTC)
          .toString(QStringLiteral("yyyy-MM-dd"));
    };
    const QString first = dayOf(range.lowest), last = dayOf(range.highest);
    return first == last ? QStringLiteral("UTC, %1").arg(first)
                         : QStringLiteral("UTC, from %1 to %2").arg(first, last);
  }

  void addValueAxis(const PlotSeries& series, const Plot& plot) {
    if (_valueAxes.contains(series.unit)) return;
    Range range;
    for (const PlotSeries& other : plot.series) {
      if (other.unit != series.unit) continue;
      for (const PlotPoint& point : other.points) {
        range.take(point.lowest);
        range.take(point.highest);
      }
    }
    if (range.lowest > range.highest) range = {0, 1};
    if (range.lowest == range.highest) range = {range.lowest - 1, range.highest + 1};
    auto* axis = new QValueAxis(&_chart);
    axis->setTickCount(valueTicks);
    axis->setTitleText(series.unit.empty() ? QStringLiteral("(no unit)") : text(series.unit).toHtmlEscaped());
    axis->setRange(range.lowest, range.highest);
    const bool isOdd = _valueAxes.size() % 2 != 0;
    _chart.addAxis(axis, isOdd ? Qt::AlignRight : Qt::AlignLeft);
    _valueAxes.emplace(series.unit, axis);
  }

  // The chart knows no gaps, so each unbroken line is a series.
  static std::vector<std::span<const PlotPoint>> unbroken(const PlotSeries& series) {
    const std::span points(series.points);
    std::vector<std::span<const PlotPoint>> parts;
    for (std::size_t start = 0, end = 0; start < points.size(); start = end) {
      for (end = start + 1; end < points.size() && !points[end].startsNewLine;) ++end;
      parts.push_back(points.subspan(start, end - start));
    }
    return parts;
  }

  void addBands(const PlotSeries& series, QColor color) {
    color.setAlpha(bandOpacity);
    for (const auto points : unbroken(series)) {
      if (std::ranges::none_of(points, isBand)) continue;
      auto* band = new QAreaSeries(steps(points, &PlotPoint::highest, &_chart),
                                   steps(points, &PlotPoint::lowest, &_chart));
      band->setPen(Qt::NoPen);
      band->setBrush(color);
      add(*band, series.unit);
    }
  }

  void addLines(const PlotSeries& series, const QPen& pen) {
    QList<QPointF> dots;
    for (const auto points : unbroken(series)) {
      QLineSeries* line = steps(points, &PlotPoint::mean, &_chart);
      if (line->count() > 1) {
        line->setPen(pen);
        add(*line, series.unit);
      } else {
        dots += line->points();
        delete line;
      }
    }
    if (!dots.isEmpty()) addDots(dots, series.unit, pen.color());
  }

  void addDots(const QList<QPointF>& points, const std::string& unit, const QColor& color) {
    auto* dots = new QScatterSeries(&_chart);
    dots->append(points);
    dots->setMarkerSize(dotSize);
    dots->setColor(color);
    dots->setBorderColor(color);
    add(*dots, unit);
  }

  void add(QAbstractSeries& series, const std::string& unit) {
    _chart.addSeries(&series);
    series.attachAxis(_timeAxis);
    series.attachAxis(_valueAxes.at(unit));
  }

  // If there are several axes, the unit tells which one belongs to the path.
  std::string legendOf(const PlotSeries& series) const {
    const bool isUnitNeeded = _valueAxes.size() > 1 && !series.unit.empty();
    return isUnitNeeded ? series.label + " (" + series.unit + ")" : series.label;
  }

  QChart& _chart;
  QCategoryAxis* _timeAxis = nullptr;
  std::map<std::string, QValueAxis*> _valueAxes;
};

// Messages of the toolkit about a missing desktop or display do not matter here.
void ignoreRemarks(QtMsgType type, const QMessageLogContext& /*context*/, const QString& remark) {
  if (type == QtFatalMsg) std::fprintf(stderr, "varnel-decode: %s\n", qPrintable(remark));
}

QByteArray draw(const Plot& plot) {
  QGraphicsScene scene;
  auto* chart = new QChart;
  scene.addItem(chart);
  const ChartMaker maker(*chart, plot);
  auto* legend = new Legend(maker.legend(plot), pictureWidth);
  scene.addItem(legend);
  const double chartHeight = std::max(leastChartHeight, pictureHeight - legend->height());
  const QSize size = QSizeF(pictureWidth, chartHeight + legend->height()).toSize();
  chart->resize(pictureWidth, chartHeight);
  legend->setPos(0, chartHeight);
  scene.setBackgroundBrush(chart->backgroundBrush());
  scene.setSceneRect(QRectF(QPointF(), QSizeF(size)));
  QApplication::processEvents();  // lays out the axes

  QBuffer file;
  QSvgGenerator generator;
  generator.setOutputDevice(&file);
  generator.setSize(size);
  generator.setViewBox(QRect(QPoint(), size));
  generator.setResolution(resolution);
  generator.setTitle(text(plot.title).toHtmlEscaped());  // the generator does not escape the title
  QPainter painter(&generator);
  painter.setRenderHint(QPainter::Antialiasing);
  scene.render(&painter, scene.sceneRect(), scene.sceneRect());
  painter.end();
  return file.data();
}

}  // namespace

}  // namespace varnel

extern "C" void varnelDrawPlot(const varnel::Plot& plot, std::string& svg) {
  qInstallMessageHandler(varnel::ignoreRemarks);
  std::array<char, 14> name = {"varnel-decode"};
  std::array<char, 10> option = {"-platform"};
  std::array<char, 10> platform = {"offscreen"};
  std::array<char*, 4> arguments = {name.data(), option.data(), platform.data(), nullptr};
  int count = static_cast<int>(arguments.size()) - 1;
  const QApplication application(count, arguments.data());
  svg = varnel::draw(plot).toStdString();
}
