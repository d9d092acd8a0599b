#include "programs/varnel/trends/TrendLook.h"

#include <array>

namespace varnel {

namespace {

constexpr std::array<QRgb, mostTrendLines> onLight = {0x0072B2, 0xD55E00, 0x007A59, 0xB0508A,
                                                      0x2B8CBE, 0xA86F00, 0x303030, 0x8C6D31};
constexpr std::array<QRgb, mostTrendLines> onDark = {0x56B4E9, 0xFF9E4A, 0x3CCB9E, 0xE79BC8,
                                                     0x9AD0FF, 0xF0E442, 0xE8E8E8, 0xC9A66B};
constexpr double lineWidth = 2;

QColor between(const QColor& from, const QColor& to, double share) {
  const auto part = [share](int one, int other) { return static_cast<int>(one + (other - one) * share); };
  return {part(from.red(), to.red()), part(from.green(), to.green()), part(from.blue(), to.blue())};
}

}  // namespace

TrendLook TrendLook::of(const QPalette& palette, const QFont& font) {
  const QColor ground = palette.color(QPalette::Base), text = palette.color(QPalette::Text);
  return {ground, text, between(ground, text, 0.18), ground.lightness() < text.lightness(), font};
}

TrendLook TrendLook::forPaper(const QFont& font) {
  return {Qt::white, Qt::black, QColor(0xD8D8D8), false, font};
}

QPen TrendLook::penOf(std::size_t line) const {
  const auto& colors = isDark ? onDark : onLight;
  return {QColor(colors[line % colors.size()]), lineWidth, Qt::SolidLine, Qt::FlatCap, Qt::MiterJoin};
}

}  // namespace varnel
