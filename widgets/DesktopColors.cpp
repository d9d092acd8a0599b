#include "widgets/DesktopColors.h"

#include <QApplication>
#include <QPalette>

namespace varnel {

namespace {

// The style derives the palette's other colors from these.
QPalette darkPalette() {
  QPalette palette(QColor(48, 48, 48), QColor(36, 36, 36));
  palette.setColor(QPalette::Base, QColor(24, 24, 24));
  palette.setColor(QPalette::Highlight, QColor(53, 132, 228));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  return palette;
}

}  // namespace

void DesktopColors::apply(Scheme scheme) {
  // Restores the toolkit's own palette, which may be dark already.
  QApplication::setPalette(QPalette());
  constexpr int halfLight = 128;
  const bool isDark = QApplication::palette().color(QPalette::Window).lightness() < halfLight;
  if (scheme == Scheme::Dark && !isDark) QApplication::setPalette(darkPalette());
}

DesktopSettings::Setting DesktopColors::setting() {
  return {QStringLiteral("org.freedesktop.appearance"), QStringLiteral("color-scheme"),
          [](const QVariant& value) { apply(static_cast<Scheme>(value.toUInt())); }};
}

}  // namespace varnel
