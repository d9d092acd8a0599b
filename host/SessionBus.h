#pragma once

#include <QVariantList>
#include <optional>
#include <string>

namespace varnel {

/// The address of the user's D-Bus session bus: $DBUS_SESSION_BUS_ADDRESS, else the socket "bus" in
/// $XDG_RUNTIME_DIR; nothing when there is none.
std::optional<std::string> sessionBusAddress();

/// A D-Bus signal.
struct BusSignal {
  std::string objectPath;
  std::string interface;
  std::string name;
  QVariantList arguments;
};

/// Sends a signal to everybody on the bus with this address. Returns nothing when the bus has taken the
/// signal, else what went wrong. A bus that does not answer costs half a second.
std::optional<std::string> sendBusSignal(const std::string& address, const BusSignal& signal);

}  // namespace varnel
