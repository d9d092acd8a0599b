#include "widgets/Motion.h"

#include <QApplication>
#include <QStyle>

namespace varnel {

namespace {

// The application object remembers what the desktop has said.
constexpr const char* animationsAreOff = "varnelAnimationsAreOff";
constexpr const char* motionIsReduced = "varnelMotionIsReduced";

constexpr unsigned reduced = 1;  // the portal's number

void remember(const char* what, bool isSo) {
  if (qApp) qApp->setProperty(what, isSo);
}

}  // namespace

bool isShownHappening(const QWidget& widget, Animation animation) {
  return animation == Animation::Animated && widget.isVisible() && desktopWantsMotion();
}

bool desktopWantsMotion() {
  const QString platform = QGuiApplication::platformName();
  const bool hasScreen = platform != QStringLiteral("offscreen") && platform != QStringLiteral("minimal");
  return hasScreen && !settingsForbidMotion() &&
         QApplication::style()->styleHint(QStyle::SH_Widget_Animation_Duration) > 0;
}

bool settingsForbidMotion() {
  return qApp->property(animationsAreOff).toBool() || qApp->property(motionIsReduced).toBool();
}

std::vector<DesktopSettings::Setting> motionSettings() {
  return {{QStringLiteral("org.gnome.desktop.interface"), QStringLiteral("enable-animations"),
           [](const QVariant& value) { remember(animationsAreOff, !value.toBool()); }},
          {QStringLiteral("org.freedesktop.appearance"), QStringLiteral("reduced-motion"),
           [](const QVariant& value) { remember(motionIsReduced, value.toUInt() == reduced); }}};
}

}  // namespace varnel
