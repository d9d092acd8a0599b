#include "widgets/Sparkline.h"

#include <QPolygonF>
#include <algorithm>

namespace varnel {

namespace {

constexpr double lineWidth = 1.25;
constexpr double dotRadius = 2;

}  // namespace

void Sparkline::setCourse(const Course& course) {
  if (course == _course) return;
  _course = course;
  _look.reset();
  _lowest = _highest = 0;
  std::size_t values = 0;
  for (const auto& value : _course) {
    if (!value) continue;
    _lowest = values == 0 ? *value : std::min(_lowest, *value);
    _highest = values == 0 ? *value : std::max(_highest, *value);
    ++values;
  }
  _hasLine = values > 1;
}

void Sparkline::paint(QPainter& painter, const QPointF& topLeft, const Look& look) {
  if (_look != look) draw(look);
  painter.drawPixmap(topLeft, _picture);
}

void Sparkline::draw(const Look& look) {
  ++_timesDrawn;
  _look = look;
  const QSize pixels = (look.size * look.pixelRatio).toSize();
  if (_picture.size() != pixels) _picture = QPixmap(pixels);
  _picture.setDevicePixelRatio(look.pixelRatio);
  _picture.fill(Qt::transparent);
  if (!_hasLine) return;
  QPainter painter(&_picture);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(QPen(look.line, lineWidth, Qt::SolidLine, Qt::SquareCap, Qt::BevelJoin));
  const QRectF area = QRectF(QPointF(), look.size).adjusted(dotRadius, dotRadius, -dotRadius, -dotRadius);
  const double step = area.width() / static_cast<double>(_course.size() - 1);
  QPolygonF run;
  const auto drawRun = [&] {
    if (run.size() == 1) painter.drawPoint(run.front());
    if (run.size() > 1) painter.drawPolyline(run);
    run.clear();
  };
  QPointF newest;
  for (std::size_t i = 0; i < _course.size(); ++i) {
    if (!_course[i]) {
      drawRun();
      continue;
    }
    const double share = changes() ? (*_course[i] - _lowest) / (_highest - _lowest) : 0.5;
    newest = {area.left() + static_cast<double>(i) * step, area.bottom() - share * area.height()};
    run.append(newest);
  }
  drawRun();
  painter.setPen(Qt::NoPen);
  painter.setBrush(look.end);
  painter.drawEllipse(newest, dotRadius, dotRadius);
}

}  // namespace varnel
