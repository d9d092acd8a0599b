#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/sources/DeviceReads.h"
#include "programs/varnel-telephonyd/sources/PortDevice.h"
#include "programs/varnel-telephonyd/sources/PortSession.h"

namespace varnel {

/// Finds out which of several devices is a diagnostic port that is free. It asks one after the other, as a
/// session does, until one is.
class PortSearch final {
 public:
  struct Setup {
    MainQueue& queue;
    std::vector<std::string> candidates;  ///< paths, the best one first
    std::function<std::unique_ptr<PortDevice>(const std::string& path)> makeDevice;
    /// Called before a candidate is opened. Returns one sentence that says why it cannot be used; nothing
    /// when it can.
    std::function<std::optional<std::string>(const std::string& path)> prepare;
    /// Called once, with the port, which is closed again; nothing when no candidate is one.
    std::function<void(const std::optional<std::string>& path)> ended;
    /// Tells why a candidate is not taken.
    std::function<void(const std::string& sentence)> tell;
  };

  explicit PortSearch(Setup setup) : _setup(std::move(setup)) {}
  PortSearch(const PortSearch&) = delete;
  PortSearch& operator=(const PortSearch&) = delete;
  ~PortSearch() = default;

  /// Opens the first candidate.
  void begin() { askNext(); }

 private:
  void askNext();
  std::optional<std::string> open(const std::string& path);
  void goOn(std::optional<std::string> trouble);

  const Setup _setup;
  std::size_t _next = 0;
  std::string _path;
  std::unique_ptr<PortDevice> _device;
  LeftOut _leftOut;
  DeviceReads _reads{_leftOut};
  std::unique_ptr<PortSession> _session;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
