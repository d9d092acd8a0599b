#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <chrono>
#include <optional>
#include <string>
#include <vector>

namespace varnel {

/// ModemManager, the service that connects modems to networks, on the system bus. Calls wait for its answer:
/// all calls of an object together 15 s at most, for the program cannot be ended meanwhile.
class ModemManager final {
 public:
  struct Port {
    std::string path;   ///< of its device
    std::string modem;  ///< the service's name of the modem's device
    bool isDiagnostic = false;
  };

  /// Connects to the system bus; a bus that is not there is like one without the service.
  explicit ModemManager(std::chrono::milliseconds patience = std::chrono::seconds(15));
  ModemManager(const ModemManager&) = delete;
  ModemManager& operator=(const ModemManager&) = delete;
  /// Modems that are inhibited are the service's again.
  ~ModemManager();

  /// The ports of all modems; nothing when the service does not run.
  std::optional<std::vector<Port>> ports();
  /// Asks the service to leave the modem alone, which cuts its data connection. The service does so until
  /// `release`, or until this program ends in any way. Returns one sentence that says why it does not;
  /// nothing on success.
  std::optional<std::string> inhibit(const std::string& modem);
  /// The modem that is inhibited is the service's again.
  void release();

 private:
  QDBusMessage answerTo(const QDBusMessage& call);

  QDBusConnection _bus;
  std::chrono::milliseconds _patience;  // how long calls may still wait
  std::string _inhibited;               // empty when no modem is
};

}  // namespace varnel
