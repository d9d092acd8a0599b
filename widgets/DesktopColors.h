#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <string>

namespace varnel {

/// Follows the desktop's light or dark scheme where the toolkit does not. It asks the desktop's settings
/// portal (org.freedesktop.portal.Settings, "color-scheme") and listens to its changes. Without a portal the
/// toolkit's colors stay.
class DesktopColors final : public QObject {
  Q_OBJECT

 public:
  /// The portal's answer, with the portal's numbers.
  enum class Scheme : unsigned { NoPreference = 0, Dark = 1, Light = 2 };

  /// Asks on the bus with this address, the user's session bus. It does not wait: a bus that does not answer
  /// leaves the colors as they are.
  explicit DesktopColors(const std::string& busAddress);
  ~DesktopColors() override;

  /// Gives the application the colors of this scheme.
  static void apply(Scheme scheme);

 private:
  void introduceItself();
  void listen();
  void ask();
  Q_SLOT void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);

  QDBusConnection _bus;
};

}  // namespace varnel
