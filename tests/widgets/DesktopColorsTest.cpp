#include "widgets/DesktopColors.h"

#include <gtest/gtest.h>

#include <QApplication>
#include <QPalette>
#include <QTest>

#include "tests/support/PrivateBus.h"
#include "widgets/Colors.h"
#include "widgets/Motion.h"

namespace varnel {

/// A desktop's settings portal: dark, and with animations until they are switched off.
class FakePortal final : public QObject {
  Q_OBJECT
  Q_CLASSINFO("D-Bus Interface", "org.freedesktop.portal.Settings")

 public:
  explicit FakePortal(QDBusConnection bus) {
    bus.registerObject("/org/freedesktop/portal/desktop", this,
                       QDBusConnection::ExportAllSlots | QDBusConnection::ExportAllSignals);
    bus.registerService("org.freedesktop.portal.Desktop");
  }
  void change(unsigned scheme) {
    Q_EMIT SettingChanged("org.freedesktop.appearance", "color-scheme", QDBusVariant(scheme));
  }
  void reduceMotion(unsigned isReduced) {
    Q_EMIT SettingChanged("org.freedesktop.appearance", "reduced-motion", QDBusVariant(isReduced));
  }
  void animate(bool isAnimated) {
    Q_EMIT SettingChanged("org.gnome.desktop.interface", "enable-animations", QDBusVariant(isAnimated));
  }

  Q_SLOT QDBusVariant Read(const QString& group, const QString& key) {
    EXPECT_EQ(group,
              key == "enable-animations" ? "org.gnome.desktop.interface" : "org.freedesktop.appearance");
    if (key == "enable-animations") return QDBusVariant(QVariant::fromValue(QDBusVariant(false)));
    return QDBusVariant(QVariant::fromValue(QDBusVariant(key == "color-scheme" ? 1U : 0U)));
  }
  Q_SIGNAL void SettingChanged(const QString& group, const QString& key, const QDBusVariant& value);
};

namespace {

// The longest time that something may take on a busy machine.
constexpr int patience_ms = 60'000;

bool isDark() { return QApplication::palette().color(QPalette::Base).lightness() < 60; }

class DesktopColorsTest : public testing::Test {
 protected:
  ~DesktopColorsTest() override { QApplication::setPalette(QPalette()); }
};

TEST_F(DesktopColorsTest, DarkAndBackAgain) {
  const QColor light = QApplication::palette().color(QPalette::Base);
  ASSERT_GT(light.lightness(), 200);
  DesktopColors::apply(DesktopColors::Scheme::Dark);
  const QPalette dark = QApplication::palette();
  EXPECT_TRUE(isDark());
  EXPECT_GT(contrast(dark.color(QPalette::Base), dark.color(QPalette::Text)), 7);
  EXPECT_GT(contrast(dark.color(QPalette::Window), dark.color(QPalette::WindowText)), 7);
  DesktopColors::apply(DesktopColors::Scheme::NoPreference);
  EXPECT_EQ(QApplication::palette().color(QPalette::Base), light);
  DesktopColors::apply(DesktopColors::Scheme::Light);
  EXPECT_EQ(QApplication::palette().color(QPalette::Base), light);
}

TEST_F(DesktopColorsTest, FollowsTheDesktopsPortal) {
  PrivateBus bus;
  ASSERT_TRUE(bus.start()) << "dbus-daemon is needed";
  // The session bus of the program. Nothing else here uses it.
  ::setenv("DBUS_SESSION_BUS_ADDRESS", bus.address().c_str(), 1);
  const QDBusConnection connection = QDBusConnection::sessionBus();
  ASSERT_TRUE(connection.isConnected());
  {
    const DesktopSettings settings(bus.address(), {DesktopColors::setting()});
    QTest::qWait(100);
    EXPECT_FALSE(isDark()) << "there is no portal";
  }
  FakePortal portal(connection);
  std::vector<DesktopSettings::Setting> all = motionSettings();
  all.push_back(DesktopColors::setting());
  const DesktopSettings settings(bus.address(), all);
  EXPECT_TRUE(QTest::qWaitFor(isDark, patience_ms)) << "what the portal says at first";
  portal.change(2);
  EXPECT_TRUE(QTest::qWaitFor([] { return !isDark(); }, patience_ms));
  portal.change(1);
  EXPECT_TRUE(QTest::qWaitFor(isDark, patience_ms));

  EXPECT_TRUE(QTest::qWaitFor(settingsForbidMotion, patience_ms)) << "what the portal says at first";
  portal.animate(true);
  EXPECT_TRUE(QTest::qWaitFor([] { return !settingsForbidMotion(); }, patience_ms));
  portal.reduceMotion(1);
  EXPECT_TRUE(QTest::qWaitFor(settingsForbidMotion, patience_ms));
  portal.animate(false);
  portal.reduceMotion(0);
  QTest::qWait(100);
  EXPECT_TRUE(settingsForbidMotion()) << "one setting is enough";
  portal.animate(true);
  EXPECT_TRUE(QTest::qWaitFor([] { return !settingsForbidMotion(); }, patience_ms));
}

}  // namespace
}  // namespace varnel

#include "DesktopColorsTest.moc"
