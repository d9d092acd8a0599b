#pragma once

#include <cstdint>
#include <string>

#include "programs/varnel-telephonyd/live/BusReading.h"
#include "programs/varnel-telephonyd/live/ModemBus.h"

namespace varnel {

/// How it stands with the modem of a live source.
struct ModemStatus {
  enum class Use : std::uint8_t {
    None,     ///< there is no modem, or nothing can be asked of it
    Waiting,  ///< it can be asked, and has no network
    Full,
  };

  Use use = Use::None;
  /// One sentence: what is wrong and what to do, or what is shown.
  std::string sentence{};

  bool operator==(const ModemStatus&) const = default;
};

/// Of a bus or a service that cannot be asked.
ModemStatus statusOf(ModemBus::Service service);
/// Of a service without the modem that is wanted, or without any when the text is empty.
ModemStatus statusWithoutModem(const std::string& wanted);
/// Of a modem that was there.
ModemStatus statusOfLost(const std::string& name);
/// Of a modem, from its interfaces.
ModemStatus statusOf(const std::string& path, const busReading::Interfaces& modem);

/// The maker's name and the model, or the path when neither is known.
std::string nameOfModem(const std::string& path, const busReading::Interfaces& modem);

}  // namespace varnel
