#pragma once

#include <string_view>

namespace varnel {

/// Sends a state, such as "READY=1", to the service manager that has started this program: a datagram to the
/// socket that NOTIFY_SOCKET in the environment names. Does nothing without such a socket. When it cannot be
/// sent, a log line says why.
void tellServiceManager(std::string_view state);

}  // namespace varnel
