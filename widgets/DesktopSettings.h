#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <QVariant>
#include <functional>
#include <string>
#include <vector>

namespace varnel {

/// Follows settings of the desktop that the toolkit does not follow everywhere. It asks the desktop's
/// settings portal (org.freedesktop.portal.Settings) and listens to its changes. Without a portal nobody is
/// told.
class DesktopSettings final : public QObject {
  Q_OBJECT

 public:
  struct Setting {
    QString group, key;
    /// Called with the first value and with each new one.
    std::function<void(const QVariant& value)> follow;
  };

  /// Asks on the bus with this address, the user's session bus. It does not wait.
  DesktopSettings(const std::string& busAddress, std::vector<Setting> settings);
  ~DesktopSettings() override;

 private:
  void introduceItself();
  void listen();
  void ask(const Setting& setting);
  Q_SLOT void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);

  QDBusConnection _bus;
  const std::vector<Setting> _settings;
};

}  // namespace varnel
