#include "programs/varnel/trends/TrendPicture.h"

#include <QApplication>
#include <QBuffer>
#include <QGraphicsLayout>
#include <QGraphicsScene>
#include <QPainter>
#include <QSvgGenerator>
#include <cmath>

#include "programs/shared/Legend.h"
#include "programs/varnel/trends/EventLegend.h"
#include "programs/varnel/trends/TrendChart.h"
#include "programs/varnel/trends/TrendScale.h"

namespace varnel {

namespace {

constexpr double width = 1200, chartHeight = 520, titleHeight = 34;
constexpr int pointsPerInch = 96;
constexpr double imageScale = 2;  // sharp on paper too

// Without U+FFFE and U+FFFF, which XML cannot hold. Other such characters were replaced before.
QString fit(QString text) {
  for (QChar& character : text)
    if (character >= QChar(0xFFFE)) character = QChar::ReplacementCharacter;
  return text;
}

QString legendOf(const TrendData::Line& line) {
  const TrendStatistics statistics = statisticsOf(line.summary);
  QString text = legendText(line.row);
  if (statistics.mean.empty()) return text + QObject::tr(": no value");
  return text + QObject::tr(": lowest %1, mean %2, highest %3")
                    .arg(QString::fromStdString(statistics.lowest), QString::fromStdString(statistics.mean),
                         QString::fromStdString(statistics.highest));
}

// The scene with everything, and the data that it shows.
class Scene {
 public:
  explicit Scene(const TrendPicture& picture) {
    QFont font = QApplication::font();
    font.setPixelSize(13);
    const TrendLook look = TrendLook::forPaper(font);
    auto* const chart = new TrendChart;
    _scene.addItem(chart);
    chart->setLook(look);
    chart->setPos(0, titleHeight);
    chart->resize(width, chartHeight);
    // The axes take room according to their labels, and the columns depend on the room that is left.
    for (int i = 0; i < 3; ++i) {
      const double room = std::max(1.0, std::round(chart->lines().area().width()));
      _data = trendData(picture.source, picture.keys, picture.stretch,
                        {static_cast<std::size_t>(room), chart->mostTicks()});
      _data.playing.reset();
      chart->show(_data);
      chart->layout()->invalidate();
      chart->layout()->activate();
    }
    std::vector<LegendEntry> entries;
    for (std::size_t i = 0; i < _data.lines.size(); ++i)
      entries.push_back({fit(legendOf(_data.lines[i])), look.penOf(i)});
    auto* const legend = new Legend(entries, width);
    _scene.addItem(legend);
    legend->setPos(0, titleHeight + chartHeight + 4);
    const double legendEnd = titleHeight + chartHeight + 4 + legend->height();
    auto* const marks = new EventLegendItem(EventLegend(_data.events, look), width);
    _scene.addItem(marks);
    marks->setPos(0, legendEnd);
    const double room = marks->boundingRect().height();
    addTitle(picture, font);
    _size = QSizeF(width, legendEnd + (room > 0 ? room + 8 : 0)).toSize();
    _scene.setSceneRect(QRectF(QPointF(), QSizeF(_size)));
    _scene.setBackgroundBrush(look.ground);
  }

  const QSize& size() const { return _size; }
  const QString& title() const { return _title; }
  void render(QPainter& painter) {
    painter.setRenderHint(QPainter::Antialiasing);
    _scene.render(&painter, QRectF(QPointF(), QSizeF(_size)), _scene.sceneRect());
  }

 private:
  void addTitle(const TrendPicture& picture, QFont font) {
    QStringList names;
    for (const TrendData::Line& line : _data.lines) {
      const QString name = QString::fromStdString(line.row.name);
      if (!names.contains(name)) names.append(name);
    }
    _title = fit(names.join(QStringLiteral(", ")) + QStringLiteral(" — ") +
                 QString::fromStdString(picture.source.name()));
    font.setPixelSize(17);
    font.setBold(true);
    const QFontMetricsF metrics(font);
    auto* const text = _scene.addSimpleText(metrics.elidedText(_title, Qt::ElideRight, width - 32), font);
    text->setPos((width - text->boundingRect().width()) / 2, 8);
  }

  TrendData _data;
  QGraphicsScene _scene;
  QSize _size;
  QString _title;
};

}  // namespace

QImage TrendPicture::image() const {
  Scene scene(*this);
  QImage image(scene.size() * imageScale, QImage::Format_RGB32);
  image.setDevicePixelRatio(imageScale);
  image.fill(Qt::white);
  QPainter painter(&image);
  scene.render(painter);
  painter.end();
  image.setDevicePixelRatio(1);
  const int dotsPerMeter = static_cast<int>(pointsPerInch * imageScale / 0.0254);
  image.setDotsPerMeterX(dotsPerMeter);
  image.setDotsPerMeterY(dotsPerMeter);
  return image;
}

QByteArray TrendPicture::svg() const {
  Scene scene(*this);
  QBuffer file;
  QSvgGenerator generator;
  generator.setOutputDevice(&file);
  generator.setSize(scene.size());
  generator.setViewBox(QRect(QPoint(), scene.size()));
  generator.setResolution(pointsPerInch);
  generator.setTitle(scene.title().toHtmlEscaped());  // the generator does not escape the title
  QPainter painter(&generator);
  scene.render(painter);
  painter.end();
  return file.data();
}

}  // namespace varnel
