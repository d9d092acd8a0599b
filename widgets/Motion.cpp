#include "widgets/Motion.h"

#include <QApplication>
#include <QStyle>

namespace varnel {

bool isShownHappening(const QWidget& widget, Animation animation) {
  return animation == Animation::Animated && widget.isVisible() && desktopWantsMotion();
}

bool desktopWantsMotion() {
  const QString platform = QGuiApplication::platformName();
  const bool hasScreen = platform != QStringLiteral("offscreen") && platform != QStringLiteral("minimal");
  return hasScreen && QApplication::style()->styleHint(QStyle::SH_Widget_Animation_Duration) > 0;
}

}  // namespace varnel
