#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "host/ControlProtocol.h"
#include "programs/varnel-telephonyd/CaptureSurvey.h"
#include "programs/varnel-telephonyd/TelephonyServer.h"

namespace varnel {

/// Where a server has its messages from.
enum class ServedSource { Port, ModemManager, Simulation, Capture, StandardInput };

/// Does what somebody asks of the running server, or says why not.
class ServerControls final {
 public:
  struct Setup {
    TelephonyServer& server;
    ServedSource source;
    std::string name;                      ///< of the device or the capture
    double speed = 1;                      ///< at which streams begin
    std::optional<std::string> recording;  ///< the file of the recording
    /// How many viewers have a channel or are connected to the telephony service.
    std::function<std::size_t()> clients;
    /// How it stands with the modem, one sentence; empty unless the source is ModemManager.
    std::function<std::string()> modem{};
    /// The frames of the port that hold no record; empty unless the source is a port.
    std::function<LeftOut()> leftOutOfPort;
    /// What is known of the capture; empty unless the source is one.
    std::function<std::optional<CaptureSurvey::Result>()> survey;
    /// Lets new channels have messages of this technology.
    std::function<void(const std::string& technology)> useTechnology;
    /// Ends the program soon.
    std::function<void()> stop;
  };

  explicit ServerControls(Setup setup) : _setup(std::move(setup)), _speed(_setup.speed) {}

  ControlReply reply(const ControlRequest& request);

 private:
  std::optional<std::string> refusal(const ControlRequest& request) const;
  std::optional<std::string> refusalOfPlaying(const ControlRequest& request) const;
  std::optional<std::string> refusalOfTechnology(const std::string& technology) const;
  void carryOut(const ControlRequest& request);
  ServerStatus status() const;

  const Setup _setup;
  double _speed;
};

}  // namespace varnel
