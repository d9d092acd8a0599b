#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <string>

namespace varnel {

/// Follows the desktop from light to dark where the toolkit does not by itself: asks the desktop's settings
/// portal (org.freedesktop.portal.Settings, "color-scheme") and listens to its changes. Without a portal the
/// colours stay the toolkit's own.
class DesktopColours final : public QObject {
  Q_OBJECT

 public:
  /// What the portal says, in its numbers.
  enum class Scheme : unsigned { NoPreference = 0, Dark = 1, Light = 2 };

  /// Asks on the bus of that address, the user's session bus. It waits for nobody: a bus that does not answer
  /// leaves the colours as they are.
  explicit DesktopColours(const std::string& busAddress);
  ~DesktopColours() override;

  /// Colours the application for that scheme.
  static void apply(Scheme scheme);

 private:
  void introduceItself();
  void listen();
  void ask();
  Q_SLOT void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);

  QDBusConnection _bus;
};

}  // namespace varnel
