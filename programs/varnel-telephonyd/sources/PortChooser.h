#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/sources/MarkedPorts.h"
#include "programs/varnel-telephonyd/sources/ModemManager.h"
#include "programs/varnel-telephonyd/sources/PortSearch.h"

namespace varnel {

/// Chooses the port that is served, and keeps ModemManager away from its modem while this object lives.
class PortChooser final {
 public:
  enum class ModemManagers { Stays, IsInhibited };

  struct Setup {
    MainQueue& queue;
    ModemManagers use = ModemManagers::Stays;  ///< what becomes of ModemManager's use of the modem
    /// Tells the server's user one sentence.
    std::function<void(const std::string& sentence)> tell;
    DeviceFolders folders{};
  };

  explicit PortChooser(Setup setup) : _setup(std::move(setup)) {}
  PortChooser(const PortChooser&) = delete;
  PortChooser& operator=(const PortChooser&) = delete;
  ~PortChooser() = default;

  /// Looks for a diagnostic port that is free: among the ports that ModemManager calls so, else among those
  /// that udev marks as a modem's. Calls the function with its path, or with nothing; the reasons are told by
  /// then.
  void search(std::function<void(const std::optional<std::string>& path)> ended);
  /// For a port that the user has named. Throws std::runtime_error with one sentence when ModemManager does
  /// not leave its modem alone.
  void inhibitModemOf(const std::string& path);

 private:
  std::vector<std::string> candidates() const;
  const ModemManager::Port* knownPort(const std::string& path) const;
  std::optional<std::string> prepare(const std::string& path);
  void take(const std::optional<std::string>& path);

  const Setup _setup;
  ModemManager _service;
  std::optional<std::vector<ModemManager::Port>> _known;  // the service's ports; absent without the service
  std::function<void(const std::optional<std::string>& path)> _ended;
  std::unique_ptr<PortSearch> _search;
};

}  // namespace varnel
